#pragma once
#include "shell/keys.h"

namespace ondrel {

class Program;

// Keys that are no command's shortcut: the cursor, and note and digit entry.
void editor_key_down(Program& p, const KeyChord& chord, bool repeat);
void editor_key_up(Program& p, const KeyChord& chord);
// A note played on a MIDI keyboard: entered in the cursor's track in edit mode, and heard,
// as a note key of the computer keyboard is.
void enter_note_at_cursor(Program& p, int note);

}  // namespace ondrel
