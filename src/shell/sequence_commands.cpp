// The position commands and the song-wide removals.
#include <algorithm>

#include "edit/song_edits.h"
#include "shell/command_handlers.h"
#include "shell/program.h"

namespace ondrel {

namespace {

int position(const Program& p) {
    return std::clamp<int>(p.engine.player.tr.nopat, 0, kPositions - 1);
}

void go_to_position(Program& p, int to) {
    const int last = std::max(0, int(p.engine.bank.current().nbpos) - 1);
    p.engine.player.tr.nopat = static_cast<int16_t>(std::clamp(to, 0, last));
    p.post(fourcc("doup"));
}

}  // namespace

void cmd_next_position(Program& p, const ShellMessage&) {
    go_to_position(p, position(p) + 1);
}

void cmd_previous_position(Program& p, const ShellMessage&) {
    go_to_position(p, position(p) - 1);
}

void cmd_delete_position(Program& p, const ShellMessage&) {
    const int at = position(p);
    if (!p.edit("Pos Delete", [&](SongTransaction& t) { delete_position(t, at); }))
        p.say("The sequence keeps its last position");
    go_to_position(p, at);
}

void cmd_insert_position(Program& p, const ShellMessage&) {
    const int at = position(p);
    const int pattern = p.engine.bank.current().sequence[at];
    if (!p.edit("Pos Insert", [&](SongTransaction& t) { insert_position(t, at, pattern); }))
        p.say("The sequence is full (256 positions)");
}

void cmd_new_pattern(Program& p, const ShellMessage&) {
    const int at = position(p);
    int made = -1;
    p.edit("New Pattern", [&](SongTransaction& t) { made = new_pattern_at(t, at); });
    p.say(made < 0 ? "All 128 patterns are in use" : "New pattern " + std::to_string(made));
}

void cmd_next_position_new_pattern(Program& p, const ShellMessage&) {
    const int at = position(p);
    int made = -1;
    p.edit("Next position & New Pattern",
           [&](SongTransaction& t) { made = new_position_with_new_pattern(t, at); });
    if (made < 0) {
        p.say("No room for a new position or pattern");
        return;
    }
    go_to_position(p, at + 1);
    p.say("New pattern " + std::to_string(made));
}

void cmd_remove_pattern(Program& p, const ShellMessage&) {
    const int pattern = p.engine.bank.current().sequence[position(p)];
    p.engine.player.stoppi();
    if (p.edit("Remove Pattern", [&](SongTransaction& t) { remove_pattern(t, pattern); }))
        p.say("Pattern " + std::to_string(pattern) + " removed");
    go_to_position(p, position(p));
}

void cmd_remove_from_song(Program& p, const ShellMessage& m) {
    p.engine.player.stoppi();
    bool done = false;
    if (m.code == fourcc("Rsnd"))
        done = p.edit("Remove Sounds", [](SongTransaction& t) { remove_sounds(t); });
    if (m.code == fourcc("Rseq"))
        done = p.edit("Remove Sequence", [](SongTransaction& t) { remove_sequence(t); });
    if (m.code == fourcc("Rall")) done = p.edit("Remove All", [](SongTransaction& t) { remove_all(t); });
    if (!done) p.say("Nothing to remove");
    go_to_position(p, 0);
}

}  // namespace ondrel
