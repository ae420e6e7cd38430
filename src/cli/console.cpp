#include "cli/console.h"

#include <algorithm>
#include <csignal>
#include <cstdio>

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

void show_song_progress(const Player& player, const TMOD& song, double seconds, const char* done) {
    const int positions = std::max<int>(song.nbpos, 1);
    const int at = std::min<int>(player.tr.nopat, positions);
    const int width = 30;
    const int filled = at * width / positions;
    std::fprintf(stderr, "\r[%.*s%.*s] position %3d/%-3d %3d:%02d %s", filled,
                 "##############################", width - filled, "..............................", at,
                 positions, static_cast<int>(seconds) / 60, static_cast<int>(seconds) % 60, done);
    std::fflush(stderr);
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
