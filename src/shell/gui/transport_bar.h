#pragma once

namespace ondrel {

class Program;
struct TMOD;

// The transport buttons, the play position, tempo and speed, the editor's octave, step and
// instrument, and the output meters; returns its height.
float draw_transport_bar(Program& p, const TMOD& song, float top);

}  // namespace ondrel
