#include "shell/user_directories.h"

#include <pwd.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>

namespace ondrel {

namespace {
// The freedesktop rules: the variable when it holds an absolute path, else the fallback
// under the home directory.
std::string xdg_directory(const char* variable, const char* fallback_under_home) {
    const char* value = std::getenv(variable);
    std::filesystem::path base;
    if (value && value[0] == '/')
        base = value;
    else
        base = std::filesystem::path(home_directory()) / fallback_under_home;
    return (base / "ondrel").string();
}
}  // namespace

std::string home_directory() {
    if (const char* home = std::getenv("HOME"); home && home[0]) return home;
    if (const passwd* entry = ::getpwuid(::getuid()); entry && entry->pw_dir) return entry->pw_dir;
    std::error_code ec;
    const auto here = std::filesystem::current_path(ec);
    return ec ? std::string("/") : here.string();
}

std::string config_directory() {
    return xdg_directory("XDG_CONFIG_HOME", ".config");
}

std::string state_directory() {
    return xdg_directory("XDG_STATE_HOME", ".local/state");
}

}  // namespace ondrel
