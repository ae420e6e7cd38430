#pragma once

namespace ondrel {

// Which secondary windows are open; the window draws them, commands open them.
struct WindowFlags {
    bool about = false;          // "About Ondrel Tracker..."
    bool documentation = false;  // "Documentation"
    bool instrument_list = false;
    bool arrangement = false;
    bool analyser = false;  // "FFT Window"
    bool full_screen = false;
    bool arrangement_follow = false;  // play started or stopped, or the cursor jumped
};

}  // namespace ondrel
