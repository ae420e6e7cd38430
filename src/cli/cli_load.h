#pragma once
#include <string>

#include "engine/engine.h"

namespace ondrel {

enum class FileClass { Song, Sound, Other };

// What a file is, as the program sorts dropped files: by extension and content type.
FileClass classify(const std::string& path);

// Loads a module into the engine's current song; on failure prints one line and returns
// false. A file that ends early loads with a warning. Sounds and other files are refused.
bool load_for_cli(Engine& engine, const std::string& path);

// Saves the engine's current song as a .otm file at path; the exit status (one line on
// stderr when it fails).
int save_song_for_cli(Engine& engine, const std::string& path);

// True when the stream is a terminal (progress and status lines go there only).
bool is_terminal(int fd);

}  // namespace ondrel
