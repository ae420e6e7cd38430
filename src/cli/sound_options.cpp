#include "cli/sound_options.h"

#include <cstdlib>
#include <iostream>
#include <sstream>

namespace ondrel {

namespace {

bool to_int(const std::string& s, int lo, int hi, int& out) {
    char* end = nullptr;
    const long v = std::strtol(s.c_str(), &end, 10);
    if (s.empty() || *end || v < lo || v > hi) return false;
    out = static_cast<int>(v);
    return true;
}

}  // namespace

const char* sound_options_help() {
    return "  --pan MODE           song (the song's current mode), file, amiga, lr, panoramic\n"
           "  --quality Q          normal (default) or interpolation\n"
           "  --no-tempo           one sequencer step per buffer instead of tick-accurate timing\n"
           "  --pitch N            global pitch, 64 to 192 (128 = normal)\n"
           "  --master N           master volume, 0 to 256 (64 = unity; default: the song's)\n"
           "  --mute LIST          tracks to mute, e.g. 1,3,4\n"
           "  --max-seconds S      stop after S seconds\n"
           "  --buffer FRAMES      frames per buffer, 64 to 4096 (default 1024)\n"
           "  --midi-synth [SF2]   tracks with a MIDI channel play on the internal General MIDI\n"
           "                       synthesiser (with the SoundFont SF2, else the system's)\n";
}

bool parse_sound_option(const std::vector<std::string>& args, size_t& i, SoundOptions& o,
                        std::string& error) {
    const std::string& a = args[i];
    auto value = [&](std::string& out) {
        if (i + 1 >= args.size()) {
            error = a + " needs a value";
            return false;
        }
        out = args[++i];
        return true;
    };
    std::string v;
    if (a == "--midi-synth") {
        o.midi_synth = true;
        const auto sf = [](const std::string& s) {
            return s.size() > 4 && (s.ends_with(".sf2") || s.ends_with(".SF2") || s.ends_with(".sf3"));
        };
        if (i + 1 < args.size() && sf(args[i + 1])) o.soundfont = args[++i];
        return true;
    }
    if (a == "--no-tempo") {
        o.tick_accurate = false;
        return true;
    }
    if (a == "--pan") {
        if (!value(v)) return true;
        if (v != "song" && v != "file" && v != "amiga" && v != "lr" && v != "panoramic")
            error = "--pan takes song, file, amiga, lr or panoramic";
        o.pan = v;
        return true;
    }
    if (a == "--quality") {
        if (!value(v)) return true;
        if (v != "normal" && v != "interpolation") error = "--quality takes normal or interpolation";
        o.interpolate = v == "interpolation";
        return true;
    }
    if (a == "--pitch") {
        if (value(v) && !to_int(v, 64, 192, o.pitch)) error = "--pitch takes 64 to 192";
        return true;
    }
    if (a == "--master") {
        if (value(v) && !to_int(v, 0, 256, o.master)) error = "--master takes 0 to 256";
        return true;
    }
    if (a == "--buffer") {
        if (value(v) && !to_int(v, 64, 4096, o.buffer_frames)) error = "--buffer takes 64 to 4096 frames";
        return true;
    }
    if (a == "--max-seconds") {
        if (!value(v)) return true;
        char* end = nullptr;
        o.max_seconds = std::strtod(v.c_str(), &end);
        if (v.empty() || *end || !(o.max_seconds > 0)) error = "--max-seconds takes a positive number";
        return true;
    }
    if (a == "--mute") {
        if (!value(v)) return true;
        std::stringstream list(v);
        std::string item;
        while (std::getline(list, item, ',')) {
            int track = 0;
            if (!to_int(item, 1, kTracks, track)) {
                error = "--mute takes track numbers from 1 to 64, separated by commas";
                return true;
            }
            o.muted.push_back(track);
        }
        return true;
    }
    return false;
}

void apply_sound_options(const SoundOptions& o, Engine& engine) {
    TMOD& m = engine.bank.current();
    if (o.pan == "file") m.mode = m.format >= 1 && m.format <= 3 ? m.format : 2;
    if (o.pan == "amiga") m.mode = 1;
    if (o.pan == "panoramic") m.mode = 2;
    if (o.pan == "lr") m.mode = 3;
    if (o.master >= 0) m.globalvol = static_cast<int16_t>(o.master);
    engine.mixer.qual = o.interpolate ? 1 : 0;
    engine.mixer.ftemp = o.tick_accurate ? 1 : 0;
    engine.mixer.valpitch = static_cast<int16_t>(o.pitch);
    for (auto& m_ : engine.mixer.mute) m_ = 0;
    for (int t : o.muted) engine.mixer.mute[t - 1] = 1;
}

bool start_midi_synth(const SoundOptions& o, MidiSetup& midi) {
    if (!o.midi_synth) return true;
    midi.soundfont = o.soundfont;
    std::string why;
    if (midi.open_synth(why, false)) return true;
    std::cerr << "ondrel: cannot start the MIDI synthesiser: " << why << "\n";
    return false;
}

}  // namespace ondrel
