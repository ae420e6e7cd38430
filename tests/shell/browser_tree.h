#pragma once
// A directory tree of modules, sounds and other files for the browser and search tests.
#include <filesystem>
#include <sstream>
#include <string>
#include <vector>

#include "support/temp_dir.h"

namespace ondrel::test {

// Makes the files, named relative to the tree and separated by spaces; a trailing '/'
// makes an empty directory. Files called "disguised*" hold a WAV, one of the readers'
// cases, for a name that says nothing; the others hold text.
inline void make_tree(const TempDir& dir, const std::string& names) {
    const std::vector<uint8_t> wav = read_all("tests/import/cases/wav-16bit-96khz.wav");
    std::istringstream in(names);
    for (std::string f; in >> f;) {
        const std::filesystem::path path = dir.path() / f;
        if (f.back() == '/') {
            std::filesystem::create_directories(path);
            continue;
        }
        std::filesystem::create_directories(path.parent_path());
        const std::string text = "not audio\n";
        const bool disguised = path.filename().string().rfind("disguised", 0) == 0;
        dir.write(f, disguised ? wav : std::vector<uint8_t>(text.begin(), text.end()));
    }
}

}  // namespace ondrel::test
