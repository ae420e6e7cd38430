#pragma once

namespace ondrel {

class Program;

// The "Find and Replace" window (masks by note, instrument, volume, command, parameter,
// each "any" or a value, over the block, track, pattern or song) and the "Transpose"
// window (a semitone or an octave up or down, over the block, track, pattern or song,
// all instruments or the current one).
void draw_search_window(Program& p);
void draw_transpose_window(Program& p);

}  // namespace ondrel
