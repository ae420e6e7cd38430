#pragma once
#include <string>

#include "shell/file_kind.h"

namespace ondrel {

// One line of the file browser or of the audio-file search's results.
struct BrowserEntry {
    std::string name;  // the leaf, "..", or for search results the path below the search root
    std::string path;  // full path
    EntryKind kind = EntryKind::Other;
};

// The browser's order: "..", directories, modules, sounds, other files; by name within each
// group, ignoring case and reading digit runs as numbers ("take2" before "take10").
bool browser_order(const BrowserEntry& a, const BrowserEntry& b);

}  // namespace ondrel
