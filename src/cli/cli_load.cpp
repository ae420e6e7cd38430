#include "cli/cli_load.h"

#include <unistd.h>

#include <iostream>

#include "import/loader.h"

namespace ondrel {

bool load_for_cli(Engine& engine, const std::string& path) {
    const LoadResult r = load(path, engine.bank, engine.slots);
    if (!r.ok) {
        std::cerr << "ondrel: " << r.error << "\n";
        return false;
    }
    if (r.truncated) std::cerr << "ondrel: warning: " << path << " ends early; what was read is kept\n";
    for (const auto& note : r.notes) std::cerr << "ondrel: " << path << ": " << note << "\n";
    return true;
}

bool is_terminal(int fd) {
    return ::isatty(fd) == 1;
}

}  // namespace ondrel
