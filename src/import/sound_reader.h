#pragma once
#include <cstdint>
#include <string>

#include "import/byte_reader.h"
#include "import/loader.h"
#include "song/sample.h"
#include "song/song_bank.h"

namespace ondrel {

enum class SoundKind { None, Avr, Aiff, Wav, FixedHeader };
enum FileType { kSoundFile = 0, kModuleFile = 1, kOtherFile = 2 };

// The extension of a path: from its last '.', or empty when it has none.
std::string extension_of(const std::string& path);
// What a dropped file is, by its extension and its content's MIME type (later tests win).
int returntype(const std::string& path, const std::string& mime);
// Which sound reader takes the file; None when it is no sound.
SoundKind sound_kind(const std::string& path, const std::string& mime);

// Reads a sound file into a new record, named after leaf when the file gives no name.
// False with why set when the file holds no sound the reader can take.
bool read_sound(ByteReader& file, SoundKind kind, const std::string& path, const std::string& leaf,
                SampleRef& out, std::string& why);

// Reads a sound file into a new record; false with why set (one line, naming the file).
bool read_sound_file(const std::string& path, const std::string& mime, SampleRef& out, std::string& why);

// Replaces sound slot (0-based) of the current song with the file, the render callback
// keeping off that slot meanwhile. The slot is untouched when the file cannot be read.
LoadResult loadsnd(const std::string& path, const std::string& mime, SongBank& bank, int slot);

// Big-endian values at a byte pointer, and a key searched in text (each newline after the
// match made NUL); null when the key is not found before a NUL or length.
uint32_t read32(const char* p);
uint16_t read16(const char* p);
char* findstr(char* text, const char* key, long length);

}  // namespace ondrel
