#pragma once
#include "shell/editor_state.h"
#include "song/tnote.h"

namespace ondrel {

// A cell as the pattern view writes it: "C# 3 01 064 F06". Empty fields are dots; a
// note-off is "OFF"; instruments 100 to 127 keep two characters as "A0" to "C7".
struct CellText {
    char note[5];
    char instrument[3];
    char volume[4];
    char command[2];
    char parameter[3];
};
CellText cell_text(const TNOTE& cell);

// Where each field starts in the written cell, in characters, and how wide it is.
int field_column(int field);
int field_width(int field);
inline constexpr int kCellChars = 15;
// The field under character column x of a cell (the nearest one for the gaps).
int field_at_column(int x);

// The character of a command code as the view shows it: 0-9, then A-Z; '?' beyond.
char command_char(int command);

}  // namespace ondrel
