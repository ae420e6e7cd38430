#pragma once
#include <string>
#include <vector>

namespace ondrel {

// The settings files beside the path file hold "<Key>value" lines, one setting each.

// The value of a line that starts with key, or false.
inline bool value_of(const std::string& line, const char* key, std::string& value) {
    const std::string k = key;
    if (line.compare(0, k.size(), k) != 0) return false;
    value = line.substr(k.size());
    return true;
}

// Writes text as the settings file path in the settings directory thepath (creating it).
// False with why set when it could not be written.
bool write_settings_file(const std::string& thepath, const std::string& path, const std::string& text,
                         std::string& why);

}  // namespace ondrel
