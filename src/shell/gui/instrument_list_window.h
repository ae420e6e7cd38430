#pragma once

namespace ondrel {

class Program;

// The "Instrument List" window: the song's 128 slots with name and length; choose the
// current instrument, rename it, see the ones the music does not use, find the current
// one's uses.
void draw_instrument_list_window(Program& p);

}  // namespace ondrel
