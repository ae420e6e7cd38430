// Opening and saving: the file panel's commands, dropped files, files named at start-up.
#include <cstdio>
#include <filesystem>
#include <memory>

#include "export/midi_file.h"
#include "export/otm_writer.h"
#include "export/sound_wav_writer.h"
#include "import/loader.h"
#include "import/sound_reader.h"
#include "platform/mime_type.h"
#include "render/midi_export.h"
#include "shell/command_handlers.h"
#include "shell/program.h"

namespace ondrel {

namespace {

namespace fs = std::filesystem;

bool same_nocase(const std::string& a, const char* b) {
    if (a.size() != std::char_traits<char>::length(b)) return false;
    for (size_t i = 0; i < a.size(); ++i)
        if (std::tolower(static_cast<unsigned char>(a[i])) != std::tolower(static_cast<unsigned char>(b[i])))
            return false;
    return true;
}

// A song saved over its own file only when that file is native: a song read from another
// format goes through "Save as...", so a foreign file is never overwritten with our data.
bool saves_in_place(const TMOD& song) {
    return song.path[0] && same_nocase(extension_of(song.path), ".otm");
}

// The name a save panel proposes for a file made from the song.
std::string proposed_name(const TMOD& song, const char* extension) {
    if (song.path[0]) return fs::path(song.path).stem().string() + extension;
    if (song.name[0]) return std::string(song.name) + extension;
    return std::string("Untitled") + extension;
}

std::string directory_of(const std::string& path) {
    const fs::path parent = fs::path(path).parent_path();
    return parent.empty() ? fs::current_path().string() : parent.string();
}

// A name typed without an extension gets the file kind's.
std::string with_extension(const std::string& path, const char* extension) {
    return extension_of(fs::path(path).filename().string()).empty() ? path + extension : path;
}

void tell_failure(Program& p, const std::string& why) {
    p.say(why);
    p.alerts.show({"title", why, {"oops !!"}});
}

void open_module(Program& p, const std::string& path, const std::function<void()>& next) {
    auto go = [&p, path, next] {
        SongBank& bank = p.engine.bank;
        const int songs_before = bank.nbimod;
        p.engine.player.stoppi();
        const size_t alerts_before = p.alerts.size();
        const LoadResult r = load(path, bank, p.engine.slots);
        if (!r.ok) {
            // The reader's own alert, when it raised one, says it; otherwise say why here.
            if (p.alerts.size() == alerts_before)
                tell_failure(p, r.error);
            else
                p.say(r.error);
        } else {
            if (bank.nbimod > songs_before)
                p.song_added();
            else
                p.song_replaced(r.song);
            p.engine.player.tr.nopat = 0;
            p.engine.player.tr.nopos = 0;
            p.engine.player.cursor.poscurv = 0;
            p.editor.view_top = 0;
            restore_editor_position(p);
            p.say(r.truncated ? path + " ends early; what was read is kept" : "Loaded " + path);
        }
        if (next) next();
    };
    if (p.engine.bank.fmulload)
        go();
    else
        p.unless_changes_lost(go);
}

void open_sound(Program& p, const std::string& path) {
    SampleRef sound;
    std::string why;
    if (!read_sound_file(path, mime_type_of(path), sound, why)) {
        tell_failure(p, why);
        return;
    }
    const int slot = p.engine.player.cursor.cursnd;
    p.edit("Load sound", [&](SongTransaction& t) { t.set_sample(slot, std::move(sound)); });
    p.say("Sound " + path + " in instrument " + std::to_string(slot + 1));
}

// Opens paths[i..] one after the other; a question about unsaved changes may come between.
void open_paths(Program& p, std::shared_ptr<std::vector<std::string>> paths, size_t i) {
    for (; i < paths->size(); ++i) {
        const std::string& path = (*paths)[i];
        std::error_code ec;
        if (!fs::exists(path, ec)) {
            tell_failure(p, "cannot open " + path + ": no such file");
            continue;
        }
        switch (returntype(path, mime_type_of(path))) {
            case kModuleFile: open_module(p, path, [&p, paths, i] { open_paths(p, paths, i + 1); }); return;
            case kSoundFile: open_sound(p, path); break;
            default: p.alerts.show({"title", "I don't use this file", {"oops !!"}}); break;
        }
    }
}

bool save_current_song(Program& p, const std::string& path) {
    std::string why;
    if (!save_otm(path, p.engine.bank, p.engine.bank.noimod, p.engine.slots, why)) {
        tell_failure(p, why);
        return false;
    }
    store_editor_position(p);
    p.history().mark_saved();
    p.say("Saved " + path);
    return true;
}

// A save panel for a file made from the current song, beside the song's file.
void ask_where_to_save_song_as(Program& p, uint32_t reply_code, const char* title, const char* extension) {
    const TMOD& song = p.engine.bank.current();
    p.file_panel.mode = FilePanelRequest::Mode::Save;
    p.file_panel.reply_code = reply_code;
    p.file_panel.title = title;
    p.file_panel.directory = song.path[0] ? directory_of(song.path) : p.browser_directory();
    p.file_panel.suggested_name = proposed_name(song, extension);
}

void ask_where_to_save(Program& p, const std::function<void()>& next) {
    ask_where_to_save_song_as(p, fourcc("SAvt"), "Save as...", ".otm");
    p.file_panel.after = next;
}

}  // namespace

void cmd_new_song(Program& p, const ShellMessage&) {
    p.unless_changes_lost([&p] {
        p.engine.player.stoppi();
        SongData fresh;
        fresh.patterns[0] = make_pattern(fresh.mod->nbtrack, fresh.mod->rows[0]);
        p.engine.bank.install(p.engine.bank.noimod, std::move(fresh));
        p.song_replaced(p.engine.bank.noimod);
        p.engine.player.tr.nopat = 0;
        p.engine.player.cursor.poscurv = 0;
        p.say("New Song");
    });
}

void cmd_open_song(Program& p, const ShellMessage&) {
    p.file_panel.mode = FilePanelRequest::Mode::Open;
    p.file_panel.reply_code = fourcc("refs");
    p.file_panel.title = "Open Song";
    p.file_panel.directory = p.browser_directory();
}

void cmd_open_files(Program& p, const ShellMessage& m) {
    open_paths(p, std::make_shared<std::vector<std::string>>(m.refs), 0);
    p.run_after_file();
}

void save_song_then(Program& p, const std::function<void()>& next) {
    const TMOD& song = p.engine.bank.current();
    if (!saves_in_place(song)) {
        ask_where_to_save(p, next);
        return;
    }
    if (save_current_song(p, song.path) && next) next();
}

void cmd_save_song(Program& p, const ShellMessage&) {
    save_song_then(p, nullptr);
}

void cmd_save_song_as(Program& p, const ShellMessage&) {
    ask_where_to_save(p, nullptr);
}

void cmd_save_song_to(Program& p, const ShellMessage& m) {
    if (m.refs.empty()) return;
    if (save_current_song(p, with_extension(m.refs.front(), ".otm"))) p.run_after_file();
}

void cmd_save_sound(Program& p, const ShellMessage&) {
    const p_s* sound = p.engine.bank.song_sample(p.engine.player.cursor.cursnd);
    p.file_panel.mode = FilePanelRequest::Mode::Save;
    p.file_panel.reply_code = fourcc("SSvt");
    p.file_panel.title = "Save Sound";
    p.file_panel.directory = p.browser_directory();
    p.file_panel.suggested_name = std::string(sound && sound->name[0] ? sound->name : "sound") + ".wav";
}

void cmd_save_sound_to(Program& p, const ShellMessage& m) {
    const p_s* sound = p.engine.bank.song_sample(p.engine.player.cursor.cursnd);
    if (m.refs.empty() || !sound || !sound->data) {
        p.say("No sound in this instrument to save");
        return;
    }
    std::string why;
    if (!save_sound_wav(m.refs.front(), *sound, why)) {
        tell_failure(p, why);
        return;
    }
    p.say("Saved " + m.refs.front());
    p.run_after_file();
}

void cmd_save_midi(Program& p, const ShellMessage&) {
    ask_where_to_save_song_as(p, fourcc("SMvt"), "Save as Midifile", ".mid");
}

void cmd_save_midi_to(Program& p, const ShellMessage& m) {
    if (m.refs.empty()) return;
    const std::string path = with_extension(m.refs.front(), ".mid");
    const MidiExport exported = song_to_midi(p.engine, {});
    std::string why;
    if (!save_midi_file(path, exported.file, why)) {
        tell_failure(p, why);
        return;
    }
    const int seconds = static_cast<int>(exported.seconds);
    char length[16];
    std::snprintf(length, sizeof length, "%d:%02d", seconds / 60, seconds % 60);
    p.say("Saved " + path + " (" + length +
          " of song, tracks with notes: " + std::to_string(exported.file.tracks.size()) + ")");
    p.run_after_file();
}

void cmd_quit(Program& p, const ShellMessage&) {
    p.request_quit();
}

}  // namespace ondrel
