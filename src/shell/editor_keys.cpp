#include "shell/editor_keys.h"

#include "shell/editor_cursor.h"
#include "shell/program.h"

namespace ondrel {

namespace {
constexpr int kPageRows = 16;
}

void editor_key_down(Program& p, const KeyChord& chord, bool) {
    const bool shift = chord.mods & kModShift;
    switch (chord.key) {
        case kKeyUp: move_cursor_rows(p, -1, true); return;
        case kKeyDown: move_cursor_rows(p, 1, true); return;
        case kKeyPageUp: move_cursor_rows(p, -kPageRows, false); return;
        case kKeyPageDown: move_cursor_rows(p, kPageRows, false); return;
        case kKeyHome: move_cursor_rows(p, -kMaxRows, false); return;
        case kKeyEnd: move_cursor_rows(p, kMaxRows, false); return;
        case kKeyLeft: move_cursor_fields(p, -1); return;
        case kKeyRight: move_cursor_fields(p, 1); return;
        case kKeyTab: move_cursor_tracks(p, shift ? -1 : 1); return;
        default: return;
    }
}

void editor_key_up(Program&, const KeyChord&) {}

}  // namespace ondrel
