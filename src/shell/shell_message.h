#pragma once
#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "playback/messages.h"

namespace ondrel {

// A command for the main window: a four-character code with named fields. Menus, keys,
// buttons, drops, MIDI input, other threads, tests and scripts all post these.
struct ShellMessage {
    uint32_t code = 0;
    std::vector<std::pair<std::string, int64_t>> fields;
    std::vector<std::string> refs;  // files, for the messages that open some

    ShellMessage() = default;
    explicit ShellMessage(uint32_t c) : code(c) {}
    ShellMessage& with(std::string name, int64_t value) {
        fields.emplace_back(std::move(name), value);
        return *this;
    }
    bool has(const std::string& name) const {
        for (const auto& f : fields)
            if (f.first == name) return true;
        return false;
    }
    int64_t get(const std::string& name, int64_t fallback = 0) const {
        for (const auto& f : fields)
            if (f.first == name) return f.second;
        return fallback;
    }
};

// The code as its four characters, for messages and logs.
std::string code_text(uint32_t code);

}  // namespace ondrel
