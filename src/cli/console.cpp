#include "cli/console.h"

#include <algorithm>
#include <csignal>

namespace ondrel {

namespace {
volatile std::sig_atomic_t interrupted = 0;
void on_interrupt(int) {
    interrupted = 1;
}
}  // namespace

std::string level_meter(double level, int width) {
    const int n = std::clamp(static_cast<int>(level * width + 0.5), 0, width);
    return std::string(static_cast<size_t>(n), '#') + std::string(static_cast<size_t>(width - n), '-');
}

StopRequests::StopRequests() {
    interrupted = 0;
    std::signal(SIGINT, on_interrupt);
    std::signal(SIGTERM, on_interrupt);
}

StopRequests::~StopRequests() {
    std::signal(SIGINT, SIG_DFL);
    std::signal(SIGTERM, SIG_DFL);
}

bool StopRequests::asked() const {
    return interrupted != 0;
}

}  // namespace ondrel
