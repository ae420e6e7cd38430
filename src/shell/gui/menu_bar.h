#pragma once

namespace ondrel {

class Program;

// The main menu bar, built from the command table; returns its height.
float draw_menu_bar(Program& p);

}  // namespace ondrel
