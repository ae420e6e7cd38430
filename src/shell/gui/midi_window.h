#pragma once

namespace ondrel {

class Program;

// "Midi Ports...": the internal synthesiser and its SoundFont, the MIDI output port the
// tracks with a channel play on, and the input port notes are entered from.
void draw_midi_window(Program& p);

}  // namespace ondrel
