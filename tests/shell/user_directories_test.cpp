#include "shell/user_directories.h"

#include <gtest/gtest.h>

#include <cstdlib>

namespace ondrel {
namespace {

struct EnvCase {
    const char* xdg_config;  // null: unset
    const char* xdg_state;
    const char* config;
    const char* state;
};

TEST(UserDirectories, FollowTheXdgVariablesElseTheHome) {
    const EnvCase cases[] = {
        {"/xdg/config", "/xdg/state", "/xdg/config/ondrel", "/xdg/state/ondrel"},
        {nullptr, nullptr, "/home/tester/.config/ondrel", "/home/tester/.local/state/ondrel"},
        {"", "", "/home/tester/.config/ondrel", "/home/tester/.local/state/ondrel"},
        {"relative/dir", "x", "/home/tester/.config/ondrel", "/home/tester/.local/state/ondrel"},
    };
    setenv("HOME", "/home/tester", 1);
    for (const EnvCase& c : cases) {
        SCOPED_TRACE(c.config);
        c.xdg_config ? setenv("XDG_CONFIG_HOME", c.xdg_config, 1) : unsetenv("XDG_CONFIG_HOME");
        c.xdg_state ? setenv("XDG_STATE_HOME", c.xdg_state, 1) : unsetenv("XDG_STATE_HOME");
        EXPECT_EQ(config_directory(), c.config);
        EXPECT_EQ(state_directory(), c.state);
    }
}

}  // namespace
}  // namespace ondrel
