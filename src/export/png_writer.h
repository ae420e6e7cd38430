#pragma once
#include <cstdint>
#include <string>
#include <vector>

namespace ondrel {

// Writes an 8-bit RGB PNG of width x height pixels given as 0x00RRGGBB, row by row from the
// top. The file replaces path only once it is complete; false with why set.
bool write_png(const std::string& path, int width, int height, const std::vector<uint32_t>& pixels,
               std::string& why);

}  // namespace ondrel
