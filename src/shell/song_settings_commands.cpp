// The song's own settings and each track's: name, tempo, speed, rows, tracks, master
// volume; a track's voices, pan, volume and MIDI channel; an instrument's name.
#include <algorithm>
#include <cstring>

#include "edit/song_edits.h"
#include "shell/command_handlers.h"
#include "shell/program.h"

namespace ondrel {

namespace {

int position(const Program& p) {
    return std::clamp<int>(p.engine.player.tr.nopat, 0, kPositions - 1);
}

int64_t field(const ShellMessage& m, const char* name, int64_t low, int64_t high) {
    return std::clamp<int64_t>(m.get(name, low), low, high);
}

// Track settings: which record word a message sets, and its range.
struct TrackWord {
    uint32_t code;
    const char* label;
    int low, high;
    void (*set)(TMOD&, int track, int value);
};

const TrackWord kTrackWords[] = {
    {fourcc("TKvc"), "Track voices", 1, 127,
     [](TMOD& m, int t, int v) { m.nbvoice[t] = static_cast<int16_t>(v > 5 ? 127 : v); }},
    {fourcc("TKpn"), "Track pan", 0, 127,
     [](TMOD& m, int t, int v) { m.trackvol[t] = static_cast<uint16_t>(v); }},
    {fourcc("TKvl"), "Track volume", 0, 255,
     [](TMOD& m, int t, int v) { m.trackpan[t] = m.trackpan2[t] = static_cast<uint16_t>(v); }},
    {fourcc("TKmc"), "Set Midi chanel", 0, 16,
     [](TMOD& m, int t, int v) { m.trackword1[t] = static_cast<uint16_t>(v); }},
};

}  // namespace

void cmd_track_setting(Program& p, const ShellMessage& m) {
    const int track = static_cast<int>(m.get("track", p.engine.player.cursor.track));
    if (track < 0 || track >= kTracks) return;
    for (const TrackWord& w : kTrackWords) {
        if (w.code != m.code) continue;
        const int value = static_cast<int>(field(m, "value", w.low, w.high));
        p.edit(w.label, [&](SongTransaction& t) { w.set(t.record(), track, value); });
    }
}

void cmd_song_setting(Program& p, const ShellMessage& m) {
    const uint32_t code = m.code;
    if (code == fourcc("SGnm")) {
        const std::string name = m.refs.empty() ? std::string() : m.refs.front();
        p.edit("Song name", [&](SongTransaction& t) { set_text(t.record().name, name.c_str()); });
    } else if (code == fourcc("SGtp")) {
        const int64_t bpm = field(m, "value", 32, 255);
        p.edit("Tempo",
               [&](SongTransaction& t) { t.record().tempo = static_cast<uint32_t>(60000000 / bpm); });
    } else if (code == fourcc("SGsp")) {
        const int64_t speed = field(m, "value", 1, 31);
        p.edit("Speed", [&](SongTransaction& t) { t.record().speed = static_cast<int16_t>(speed); });
    } else if (code == fourcc("SGvl")) {
        const int64_t volume = field(m, "value", 0, 256);
        p.edit("Master volume",
               [&](SongTransaction& t) { t.record().globalvol = static_cast<int16_t>(volume); });
    } else if (code == fourcc("SGrw")) {
        const int pattern = p.engine.bank.current().sequence[position(p)];
        const int rows = static_cast<int>(field(m, "value", 1, 256));
        p.edit("Pattern rows", [&](SongTransaction& t) { set_pattern_rows(t, pattern, rows); });
    } else if (code == fourcc("SGtr")) {
        const int tracks = static_cast<int>(field(m, "value", 1, kTracks));
        p.edit("Tracks", [&](SongTransaction& t) { set_track_count(t, tracks); });
    }
}

void cmd_instrument(Program& p, const ShellMessage& m) {
    const int instrument = static_cast<int>(m.get("instrument", p.engine.player.cursor.cursnd + 1));
    if (instrument < 1 || instrument > kSamplesPerSong) return;
    if (m.code == fourcc("ILsl")) {
        p.engine.player.cursor.cursnd = static_cast<int16_t>(instrument - 1);
        return;
    }
    if (m.code == fourcc("ILnm") && !m.refs.empty()) {
        const std::string name = m.refs.front();
        if (!p.engine.bank.song_sample(instrument - 1)) {
            p.say("Instrument " + std::to_string(instrument) + " has no sound to name");
            return;
        }
        p.edit("Instrument name", [&](SongTransaction& t) {
            if (p_s* s = t.sample(instrument - 1)) set_sample_name(*s, name.c_str(), 31);
        });
    }
}

void cmd_arrangement(Program& p, const ShellMessage& m) {
    const int at = static_cast<int>(m.get("position", position(p)));
    const uint32_t code = m.code;
    if (code == fourcc("ARsl")) {
        p.engine.player.tr.nopat =
            static_cast<int16_t>(std::clamp(at, 0, std::max(0, p.engine.bank.current().nbpos - 1)));
        return;
    }
    bool done = false;
    if (code == fourcc("ARdu")) {
        const int pattern = p.engine.bank.current().sequence[std::clamp(at, 0, kPositions - 1)];
        done = p.edit("Duplicate position", [&](SongTransaction& t) { insert_position(t, at + 1, pattern); });
    } else if (code == fourcc("ARmv")) {
        const int to = static_cast<int>(m.get("to", at));
        done = p.edit("Move position", [&](SongTransaction& t) { move_position(t, at, to); });
        if (done) p.engine.player.tr.nopat = static_cast<int16_t>(to);
    } else if (code == fourcc("ARpt")) {
        const int pattern = static_cast<int>(field(m, "pattern", 0, kPatternsPerSong - 1));
        done = p.edit("Position pattern", [&](SongTransaction& t) { set_position_pattern(t, at, pattern); });
    } else if (code == fourcc("ARrp")) {
        done = p.edit("Repeat position", [&](SongTransaction& t) { set_repeat_position(t, at); });
    }
    if (!done) p.say("The sequence did not change");
}

}  // namespace ondrel
