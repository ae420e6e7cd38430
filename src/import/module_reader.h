#pragma once
#include <array>
#include <cstdint>
#include <string>
#include <vector>

#include "import/byte_reader.h"
#include "song/effect_slots.h"
#include "song/song_bank.h"

namespace ondrel {

// What a module file says about the global effect slots, applied when the song is
// installed.
struct EffectsRead {
    bool has_added_types = false;  // slots 20..99 replaced by the file
    std::array<int16_t, kEffectSlots> added_types{};
    uint32_t echo_units_set = 0;  // bit u: echo unit u's line follows the new length
};

// A module being read: the song as it will be installed, and what the reader saw.
struct ModuleRead {
    SongData song;
    EffectsRead effects;
    bool truncated = false;          // the file ended early; what was read is kept
    std::string error;               // why the file was refused, when a reader returns false
    std::vector<std::string> notes;  // things worth telling the user
};

// A reader fills song (whose record holds the current song's values on entry) and
// returns false, with error set, when the file is not of its kind.
using ModuleReaderFn = bool (*)(ByteReader& file, ModuleRead& out);

struct ModuleReaderEntry {
    const char* extension;  // ".otm"; empty for the fallback reader
    const char* description;
    ModuleReaderFn read;  // null: known but not readable yet
};

// Readers, one line each; the fallback (any other ending) comes first.
const std::vector<ModuleReaderEntry>& module_readers();
// The reader for a file name: compared without case, later entries win.
const ModuleReaderEntry& reader_for(const std::string& path);

bool read_otm(ByteReader& file, ModuleRead& out);
bool read_mod(ByteReader& file, ModuleRead& out);
bool read_s3m(ByteReader& file, ModuleRead& out);
bool read_mtm(ByteReader& file, ModuleRead& out);

}  // namespace ondrel
