#pragma once
#include "shell/editor_state.h"

namespace ondrel {

class Program;

// The edit cursor in the current pattern: row, track and the field within the track.
struct CursorPlace {
    int row = 0;
    int track = 0;
    int field = kFieldNote;
};

CursorPlace cursor_place(const Program& p);
// Moves the cursor there, kept inside the pattern and the song's tracks.
void set_cursor_place(Program& p, CursorPlace place);
// Rows of the pattern at the current position, and tracks of the song.
int current_rows(const Program& p);
int current_tracks(const Program& p);
// Moves by rows (wrapping inside the pattern when wrap is set), fields or tracks.
void move_cursor_rows(Program& p, int rows, bool wrap);
void move_cursor_fields(Program& p, int fields);
void move_cursor_tracks(Program& p, int tracks);

}  // namespace ondrel
