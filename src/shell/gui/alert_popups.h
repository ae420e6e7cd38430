#pragma once

namespace ondrel {

class Program;

// The front alert of the program's queue as a modal popup with its text and buttons.
void draw_alerts(Program& p);

}  // namespace ondrel
