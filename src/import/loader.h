#pragma once
#include <cstdint>
#include <string>
#include <vector>

#include "import/module_reader.h"
#include "song/effect_slots.h"
#include "song/song_bank.h"

namespace ondrel {

inline constexpr size_t kMaxModuleFileBytes = size_t{256} << 20;

struct LoadResult {
    bool ok = false;
    int song = -1;  // the song that received the file
    bool truncated = false;
    std::string error;  // one line: why nothing was loaded
    std::vector<std::string> notes;
};

// Reads a whole file; false with why set when it cannot be read or is too large.
bool read_file(const std::string& path, std::vector<uint8_t>& bytes, std::string& why,
               size_t max_bytes = kMaxModuleFileBytes);

// The name of the packer that made bytes, or null when they are not packed.
const char* packer_of(const std::vector<uint8_t>& bytes);

// Reads a module file into the current song, or into a new song when fmulload is on.
// Nothing in the bank changes unless the file was read.
LoadResult load(const std::string& path, SongBank& bank, EffectSlots& slots);

}  // namespace ondrel
