#pragma once
#include <string>
#include <vector>

#include "engine/engine.h"
#include "shell/midi_setup.h"

namespace ondrel {

// The choices that shape the sound, shared by play and render, with the program's
// defaults.
struct SoundOptions {
    std::string pan = "song";  // song | file | amiga | lr | panoramic
    bool interpolate = false;
    bool tick_accurate = true;
    int pitch = 128;
    int master = -1;         // -1: the song's own
    std::vector<int> muted;  // 1-based tracks
    double max_seconds = 0;
    int buffer_frames = 1024;
    bool midi_synth = false;  // tracks with a MIDI channel sound through the internal synthesiser
    std::string soundfont;    // its SoundFont; empty: the system's General MIDI one
};

// Takes the option at args[i] (and its value) if it is one of ours; false otherwise.
// Sets error on a bad value.
bool parse_sound_option(const std::vector<std::string>& args, size_t& i, SoundOptions& o, std::string& error);
// The lines of --help that describe them.
const char* sound_options_help();
// Applies them to a loaded song and the mixer.
void apply_sound_options(const SoundOptions& o, Engine& engine);
// Opens the internal synthesiser when the options ask for it (for as long as midi lives);
// false, said on stderr, when it cannot be had.
bool start_midi_synth(const SoundOptions& o, MidiSetup& midi);

}  // namespace ondrel
