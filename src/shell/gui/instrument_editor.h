#pragma once

namespace ondrel {

class Program;

// The current instrument: choose it, and set every field of its sound that a user sets
// (name, volume, finetune, reference note, rate, loop); bits, channels and length shown.
void draw_instrument_editor(Program& p);

}  // namespace ondrel
