#pragma once
#include <string>
#include <vector>

namespace ondrel {

// The desktop program: opens the window and the sound device, opens files as the file
// panel would, runs until the user quits or a signal ends it. Returns the exit status:
// 0, or 2 when there is no display to open the window on.
int run_desktop(const std::vector<std::string>& files);

}  // namespace ondrel
