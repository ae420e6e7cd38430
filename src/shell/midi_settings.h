#pragma once
#include <string>

namespace ondrel {

class MidiSetup;

// The MIDI choices kept between runs in "midi.txt" beside the path file: the SoundFont, the
// output port and the input port, one "<Key>value" line each.
struct MidiSettings {
    std::string soundfont;  // empty: the system's General MIDI SoundFont
    std::string output;     // empty: none
    std::string input;      // empty: the first the system has
};

std::string midi_settings_file(const std::string& thepath);
// A missing file or an unknown line leaves the defaults.
MidiSettings read_midi_settings(const std::string& thepath);
// What midi has chosen now. False with why set when it could not be written.
bool write_midi_settings(const MidiSetup& midi, const std::string& thepath, std::string& why);

}  // namespace ondrel
