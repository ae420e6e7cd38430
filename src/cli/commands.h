#pragma once
#include <string>
#include <vector>

namespace ondrel {

// Exit codes that scripts can rely on.
inline constexpr int kExitOk = 0;
inline constexpr int kExitFailed = 1;  // the work could not be done (bad file, no device)
inline constexpr int kExitUsage = 2;   // the command line was wrong

using Args = std::vector<std::string>;

int cmd_info(const Args& args);
int cmd_convert(const Args& args);

}  // namespace ondrel
