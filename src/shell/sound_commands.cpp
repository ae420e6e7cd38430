// The instrument and sample editors' commands: the sound's fields, its tools, frames cut
// and pasted, its blocks, its envelopes, and hearing it.
#include <algorithm>

#include "edit/sound_blocks.h"
#include "edit/sound_fields.h"
#include "edit/sound_frames.h"
#include "shell/command_handlers.h"
#include "shell/program.h"

namespace ondrel {

namespace {

int slot_of(const Program& p) {
    return std::clamp<int>(p.engine.player.cursor.cursnd, 0, kSamplesPerSong - 1);
}

// The frames a command names, else the editor's selection (empty: the whole sound).
FrameRange range_of(const Program& p, const ShellMessage& m) {
    if (!m.has("first")) return p.editor.sound_selection;
    return {static_cast<uint32_t>(std::max<int64_t>(0, m.get("first"))),
            static_cast<uint32_t>(std::max<int64_t>(0, m.get("end")))};
}

bool no_sound(Program& p) {
    const p_s* s = p.engine.bank.song_sample(slot_of(p));
    if (s && s->data && s->length) return false;
    p.say("Instrument " + std::to_string(slot_of(p) + 1) + " has no sound");
    return true;
}

}  // namespace

void cmd_sound_field(Program& p, const ShellMessage& m) {
    const int slot = slot_of(p);
    const int64_t value = m.get("value");
    bool done = false;
    switch (m.code) {
        case fourcc("SNnm"):
            done = p.edit("Sound name", [&](SongTransaction& t) {
                set_sound_name(t, slot, m.refs.empty() ? std::string() : m.refs.front());
            });
            break;
        case fourcc("SNvl"):
            done = p.edit("Sound volume", [&](SongTransaction& t) { set_sound_volume(t, slot, int(value)); });
            break;
        case fourcc("SNft"):
            done = p.edit("Finetune", [&](SongTransaction& t) { set_sound_finetune(t, slot, int(value)); });
            break;
        case fourcc("SNrn"):
            done =
                p.edit("Reference note", [&](SongTransaction& t) { set_sound_refnote(t, slot, int(value)); });
            break;
        case fourcc("SNrt"):
            done = p.edit("Rate", [&](SongTransaction& t) {
                set_sound_rate(t, slot, uint32_t(std::max<int64_t>(1, value)));
            });
            break;
        case fourcc("SNlp"): {
            const auto start = uint32_t(std::max<int64_t>(0, m.get("start")));
            const auto end = uint32_t(std::max<int64_t>(0, m.get("end")));
            done = p.edit("Loop",
                          [&](SongTransaction& t) { set_sound_loop(t, slot, m.get("on") != 0, start, end); });
            if (!done) p.say("A loop runs inside the sound, from its start up to an end after it");
            return;
        }
        default: return;
    }
    if (!done && !p.engine.bank.song_sample(slot))
        p.say("Instrument " + std::to_string(slot + 1) + " has no sound");
}

void cmd_sound_tool(Program& p, const ShellMessage& m) {
    if (no_sound(p)) return;
    const auto tool =
        static_cast<SoundTool>(std::clamp<int64_t>(m.get("tool"), 0, int(SoundTool::InvertSign)));
    const FrameRange range = range_of(p, m);
    const int slot = slot_of(p);
    if (!p.edit(sound_tool_label(tool), [&](SongTransaction& t) { apply_sound_tool(t, slot, tool, range); }))
        p.say(std::string(sound_tool_label(tool)) + " changed nothing");
}

void cmd_sound_frames(Program& p, const ShellMessage& m) {
    const int slot = slot_of(p);
    const FrameRange range = range_of(p, m);
    if (m.code == fourcc("SNpa")) {
        if (p.editor.sound_clip.bytes.empty()) {
            p.say("The sound clipboard is empty");
            return;
        }
        const auto at = uint32_t(std::max<int64_t>(0, m.get("frame", range.first)));
        p.edit("Paste frames", [&](SongTransaction& t) { paste_frames(t, slot, at, p.editor.sound_clip); });
        return;
    }
    if (no_sound(p)) return;
    if (m.code == fourcc("SNcp") || m.code == fourcc("SNct")) {
        SongTransaction view(p.engine.bank, p.engine.slots, "");
        p.editor.sound_clip = copy_frames(view, slot, range);
    }
    if (m.code == fourcc("SNct"))
        p.edit("Cut frames", [&](SongTransaction& t) { cut_frames(t, slot, range); });
    if (m.code == fourcc("SNcr")) p.edit("Crop", [&](SongTransaction& t) { crop_to_frames(t, slot, range); });
    if (m.code == fourcc("SNsi"))
        p.edit("Silence", [&](SongTransaction& t) { silence_frames(t, slot, range); });
    if (m.code != fourcc("SNcp")) p.editor.sound_selection = {};
}

void cmd_sound_block(Program& p, const ShellMessage& m) {
    if (no_sound(p)) return;
    const int slot = slot_of(p);
    const int n = static_cast<int>(std::clamp<int64_t>(m.get("block", 1), 1, kSoundBlocks));
    bool done = false;
    if (m.code == fourcc("SNbk")) {
        const FrameRange range = range_of(p, m);
        done =
            p.edit("Set " + block_name(n), [&](SongTransaction& t) { set_sound_block(t, slot, n, range); });
    } else if (m.code == fourcc("SNbm") && m.has("end")) {
        // A dragged end mark: the block keeps its start and at least one frame, since an
        // empty range would mean the whole sound.
        const auto first = uint32_t(std::max<int64_t>(0, m.get("first")));
        const auto end = uint32_t(std::max<int64_t>(first + int64_t{1}, m.get("end")));
        done = p.edit("Resize " + block_name(n), [&](SongTransaction& t) {
            set_sound_block(t, slot, n, {first, end});
        });
    } else if (m.code == fourcc("SNbm")) {
        const auto first = uint32_t(std::max<int64_t>(0, m.get("first")));
        done =
            p.edit("Move " + block_name(n), [&](SongTransaction& t) { move_sound_block(t, slot, n, first); });
    } else if (m.code == fourcc("SNbc")) {
        done = p.edit("Clear " + block_name(n), [&](SongTransaction& t) { clear_sound_block(t, slot, n); });
    }
    if (!done) p.say(block_name(n) + " did not change");
}

void cmd_play_sound(Program& p, const ShellMessage& m) {
    StructureLock& lock = p.engine.bank.structure_lock();
    const p_s* sound = p.engine.bank.song_sample(slot_of(p));
    if (m.get("stop") || !sound || !sound->data) {
        p.engine.preview.stop(lock);
        return;
    }
    const FrameRange range = range_of(p, m);
    p.engine.preview.play(copy_sample(*sound), range.first, range.whole() ? 0 : range.end, lock);
}

void cmd_sound_selection(Program& p, const ShellMessage& m) {
    p.editor.sound_selection = range_of(p, m);
}

void cmd_envelope(Program& p, const ShellMessage& m) {
    if (m.code >= fourcc("co00") && m.code <= fourcc("co04")) {
        p.editor.envelope_kind = static_cast<int>(m.code - fourcc("co00"));
        return;
    }
    if (no_sound(p)) return;
    const int slot = slot_of(p);
    const int kind = static_cast<int>(std::clamp<int64_t>(m.get("kind", p.editor.envelope_kind), 0, 4));
    if (m.code == fourcc("ENpt")) {
        const int point = static_cast<int>(m.get("point")), x = static_cast<int>(m.get("x"));
        const int level = static_cast<int>(m.get("level"));
        p.edit("Envelope point",
               [&](SongTransaction& t) { set_envelope_point(t, slot, kind, point, x, level); });
    } else if (m.code == fourcc("ENon")) {
        const bool on = m.get("on") != 0;
        p.edit(on ? "Envelope on" : "Envelope off",
               [&](SongTransaction& t) { set_envelope_enabled(t, slot, kind, on); });
    }
}

}  // namespace ondrel
