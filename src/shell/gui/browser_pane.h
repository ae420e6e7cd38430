#pragma once
#include <vector>

#include "shell/browser_entry.h"

namespace ondrel {

class Program;

// The file browser pane: the paths menu and the browser menu, the directory shown and its
// listing (modules and sounds first), and the results of "Find all audio files". A double
// click opens a directory or a module, or loads a sound into the current instrument; a
// click on a sound plays it.
class BrowserPane {
public:
    void draw(Program& p);

private:
    void draw_entries(Program& p, const std::vector<BrowserEntry>& entries, const char* id);
    void draw_search(Program& p);

    std::vector<BrowserEntry> found_;  // search results taken so far
    std::string selected_;
    bool search_started_ = false;  // a new search drops the results of the last one
};

}  // namespace ondrel
