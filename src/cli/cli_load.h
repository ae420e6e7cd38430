#pragma once
#include <string>

#include "engine/engine.h"

namespace ondrel {

// Loads path into the engine's current song; on failure prints one line and returns
// false. A file that ends early loads with a warning.
bool load_for_cli(Engine& engine, const std::string& path);

// True when the stream is a terminal (progress and status lines go there only).
bool is_terminal(int fd);

}  // namespace ondrel
