#pragma once

namespace ondrel {

// Which secondary windows are open; the window draws them, commands open them.
struct WindowFlags {
    bool about = false;          // "About Ondrel Tracker..."
    bool documentation = false;  // "Documentation"
    bool instrument_list = false;
    bool arrangement = false;
    bool analyser = false;  // "FFT Window"
    bool search = false;    // find and replace
    bool transpose = false;
    bool midi_channel = false;  // "Set Midi chanel" for the cursor's track
    bool midi_ports = false;    // the synthesiser, the MIDI output and input
    bool full_screen = false;
    bool arrangement_follow = false;  // play started or stopped, or the cursor jumped
};

}  // namespace ondrel
