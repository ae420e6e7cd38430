#pragma once
#include "shell/command_table.h"

namespace ondrel {

class Program;

// The items of one menu of the command table (inside an open ImGui menu or popup).
void draw_menu_items(Program& p, Menu menu);

// The main menu bar, built from the command table; returns its height.
float draw_menu_bar(Program& p);

}  // namespace ondrel
