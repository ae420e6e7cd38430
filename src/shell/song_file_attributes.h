#pragma once
#include <string>

#include "shell/editor_position.h"
#include "song/tmod.h"

namespace ondrel {

// The editor position stored on a module file as five 4-byte little-endian attributes
// ("user.on_nopat", "user.on_v", "user.on_x", "user.on_y", "user.oftrack"), each holding a
// sign-extended 16-bit value. Where the file system keeps no attributes nothing happens.

// Writes the five attributes in that order on the file at path.
void writeinfo_in_file(const std::string& path, const EditorPosition& position);
// Takes each attribute that reads back as exactly 4 bytes; the others keep their values.
void readinfo_in_file(const std::string& path, EditorPosition& position);

// The same on the file named by the song's path field.
inline void writeinfo_in_file(const TMOD& song, const EditorPosition& position) {
    writeinfo_in_file(std::string(song.path), position);
}
inline void readinfo_in_file(const TMOD& song, EditorPosition& position) {
    readinfo_in_file(std::string(song.path), position);
}

}  // namespace ondrel
