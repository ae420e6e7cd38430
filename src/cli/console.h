#pragma once
#include <string>

#include "playback/player.h"

namespace ondrel {

// What the commands that run in real time share on the terminal.

// A level from 0 to 1 as a bar of width characters: "####--------".
std::string level_meter(double level, int width);

// The progress line of a command that plays a song faster than real time, on stderr:
// "[####......] position  12/40    1:23 rendered" (done names the work).
void show_song_progress(const Player& player, const TMOD& song, double seconds, const char* done);

// While it lives, Ctrl-C and a termination request ask the command to stop instead of
// killing it, so that what it writes is finished properly.
class StopRequests {
public:
    StopRequests();
    ~StopRequests();
    StopRequests(const StopRequests&) = delete;
    StopRequests& operator=(const StopRequests&) = delete;
    bool asked() const;
};

}  // namespace ondrel
