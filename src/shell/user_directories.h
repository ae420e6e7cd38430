#pragma once
#include <string>

namespace ondrel {

// Where the program keeps its files for the user. Neither is created here: writers create
// them when they first write.

// The settings directory (`thepath`): $XDG_CONFIG_HOME/ondrel, else ~/.config/ondrel.
std::string config_directory();
// The state directory (recovery copies): $XDG_STATE_HOME/ondrel, else ~/.local/state/ondrel.
std::string state_directory();
// The user's home directory ($HOME, else the password database, else the current directory).
std::string home_directory();

}  // namespace ondrel
