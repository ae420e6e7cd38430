#pragma once

namespace ondrel {

class Program;

// The line at the bottom: what the transport does, edit mode, the sound device, and the
// last thing the program said.
void draw_status_line(Program& p, float top, float height);

}  // namespace ondrel
