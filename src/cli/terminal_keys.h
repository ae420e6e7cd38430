#pragma once

namespace ondrel {

// Puts a terminal on standard input into single-key mode for as long as it lives, and
// reads keys without waiting. Does nothing when standard input is not a terminal.
class TerminalKeys {
public:
    TerminalKeys();
    ~TerminalKeys();
    TerminalKeys(const TerminalKeys&) = delete;
    TerminalKeys& operator=(const TerminalKeys&) = delete;

    // The next key pressed, or -1 when none is waiting.
    int poll();

private:
    bool active_ = false;
    unsigned char saved_[64] = {};  // the terminal's settings to put back
};

}  // namespace ondrel
