#include "cli/terminal_keys.h"

#include <poll.h>
#include <termios.h>
#include <unistd.h>

#include <cstring>

namespace ondrel {

static_assert(sizeof(termios) <= 64, "room for the saved settings");

TerminalKeys::TerminalKeys() {
    if (!::isatty(0)) return;
    termios t{};
    if (tcgetattr(0, &t) != 0) return;
    std::memcpy(saved_, &t, sizeof t);
    t.c_lflag &= static_cast<tcflag_t>(~(ICANON | ECHO));
    t.c_cc[VMIN] = 0;
    t.c_cc[VTIME] = 0;
    active_ = tcsetattr(0, TCSANOW, &t) == 0;
}

TerminalKeys::~TerminalKeys() {
    if (!active_) return;
    termios t{};
    std::memcpy(&t, saved_, sizeof t);
    tcsetattr(0, TCSANOW, &t);
}

int TerminalKeys::poll() {
    if (!active_) return -1;
    pollfd p{0, POLLIN, 0};
    if (::poll(&p, 1, 0) <= 0) return -1;
    unsigned char c = 0;
    return ::read(0, &c, 1) == 1 ? c : -1;
}

}  // namespace ondrel
