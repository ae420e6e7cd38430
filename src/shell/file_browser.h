#pragma once
#include <cstdint>
#include <string>
#include <vector>

#include "shell/audio_search.h"
#include "shell/browser_entry.h"

namespace ondrel {

// Which subdirectories the listing shows: all ('seed' "See All Directory"), those with a
// module or sound directly inside ('see1'), or anywhere below ('seeA').
enum class DirectoryFilter { All, AudioLevel1, AudioAllLevels };

struct BrowserView {
    bool all_files = false;  // 'seea' "See All Files": every file, hidden ones too
    DirectoryFilter directories = DirectoryFilter::All;
};

// Lists dir for the browser, in browser order: ".." (below the root), the subdirectories
// the view lets through, modules, sounds, then (with all_files) the other files. Hidden
// entries only with all_files. False when dir cannot be read (out is then empty).
//
// Looking for audio below a subdirectory stops at the first module or sound found; its
// cost is bounded per listing (entries visited, files sniffed), and a subdirectory that
// could not be searched to the end is shown.
bool list_directory(const std::string& dir, const BrowserView& view, std::vector<BrowserEntry>& out);

// The file browser pane's state: the directory shown, its listing, the view, and the
// audio-file search. The window draws entries() and posts the browser menu's codes.
class FileBrowser {
public:
    // Shows directory, or its nearest readable ancestor.
    explicit FileBrowser(const std::string& directory);

    const std::string& directory() const { return directory_; }
    const std::vector<BrowserEntry>& entries() const { return entries_; }
    const BrowserView& view() const { return view_; }
    AudioSearch& search() { return search_; }

    // Shows dir; false, with nothing changed, when it cannot be read.
    bool open_directory(const std::string& dir);
    // Reads the directory again; when it has vanished, its nearest readable ancestor.
    void refresh();

    // The browser menu: 'seea' toggles all files; 'seed', 'see1', 'seeA' choose the
    // directory filter; 'find' searches the directory shown for audio files; 'NDMN'
    // refreshes. False for other codes.
    bool handle(uint32_t code);
    // Whether the menu item of code shows a check mark.
    bool checked(uint32_t code) const;

private:
    std::string directory_;
    std::vector<BrowserEntry> entries_;
    BrowserView view_;
    AudioSearch search_;
};

}  // namespace ondrel
