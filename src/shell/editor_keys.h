#pragma once
#include "shell/keys.h"

namespace ondrel {

class Program;

// Keys that are no command's shortcut: the cursor, and note and digit entry.
void editor_key_down(Program& p, const KeyChord& chord, bool repeat);
void editor_key_up(Program& p, const KeyChord& chord);

}  // namespace ondrel
