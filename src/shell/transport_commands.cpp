// The transport: play the song or the pattern, stop, loop, mute, and the end of a song.
#include "shell/command_handlers.h"
#include "shell/program.h"

namespace ondrel {

void cmd_play_song(Program& p, const ShellMessage&) {
    p.engine.player.start(false);
}

void cmd_play_pattern(Program& p, const ShellMessage&) {
    p.engine.player.start(true);
}

void cmd_stop(Program& p, const ShellMessage&) {
    p.engine.player.stoppi();
}

void cmd_loop(Program& p, const ShellMessage&) {
    auto& floop = p.engine.player.tr.floop;
    floop = floop ? 0 : 1;
}

void cmd_song_ended(Program& p, const ShellMessage&) {
    p.engine.player.status = kStatusStopped;
}

void cmd_mute_track(Program& p, const ShellMessage& m) {
    const int64_t track = m.get("track", -1);
    if (track < 0 || track >= kTracks) return;
    auto& mute = p.engine.mixer.mute[static_cast<size_t>(track)];
    mute = mute ? 0 : 1;
}

}  // namespace ondrel
