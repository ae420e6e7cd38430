#pragma once
#include <cstdint>
#include <string>
#include <vector>

namespace ondrel {

// Writes bytes to a temporary file beside path and renames it over path, so a failed
// save never destroys the file the user had. False with why set on failure.
bool write_file_atomically(const std::string& path, const std::vector<uint8_t>& bytes,
                           std::string& why);

}  // namespace ondrel
