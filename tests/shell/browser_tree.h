#pragma once
// A directory tree of modules, sounds and other files for the browser and search tests.
#include <filesystem>
#include <sstream>
#include <string>
#include <vector>

#include "support/chunk_builder.h"
#include "support/temp_dir.h"

namespace ondrel::test {

// A WAV header that libmagic knows, for files whose name says nothing.
inline std::vector<uint8_t> wav_bytes() {
    Bytes b;
    b.text("RIFF", 4).le32(36 + 4).text("WAVE", 4).text("fmt ", 4).le32(16);
    b.le16(1).le16(1).le32(44100).le32(88200).le16(2).le16(16);
    b.text("data", 4).le32(4).zeros(4);
    return b.v;
}

// Makes the files, named relative to the tree and separated by spaces; a trailing '/'
// makes an empty directory. Files called "disguised*" hold a WAV; the others hold text.
inline void make_tree(const TempDir& dir, const std::string& names) {
    std::istringstream in(names);
    for (std::string f; in >> f;) {
        const std::filesystem::path path = dir.path() / f;
        if (f.back() == '/') {
            std::filesystem::create_directories(path);
            continue;
        }
        std::filesystem::create_directories(path.parent_path());
        const bool wav = path.filename().string().rfind("disguised", 0) == 0;
        const std::string text = "not audio\n";
        dir.write(f, wav ? wav_bytes() : std::vector<uint8_t>(text.begin(), text.end()));
    }
}

}  // namespace ondrel::test
