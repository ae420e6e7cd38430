#pragma once

namespace ondrel {

class Program;
struct TMOD;

// The "Arrangement" window: the sequence as a list of positions and their patterns.
// Choose, insert, delete, duplicate, drag to reorder, change a position's pattern, set the
// repeat position; it follows the song while it plays and when the cursor jumps.
void draw_arrangement_window(Program& p, const TMOD& song);

}  // namespace ondrel
