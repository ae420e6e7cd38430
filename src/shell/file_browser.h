#pragma once
#include <atomic>
#include <cstdint>
#include <mutex>
#include <string>
#include <vector>

#include "shell/audio_search.h"
#include "shell/background_thread.h"
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
// entries only with all_files. False when dir cannot be read, or stop was set on the way.
//
// Telling files apart reads their content (a thousand files take about a second), and
// looking for audio below a subdirectory stops at the first module or sound found; that
// look is bounded per listing (entries visited, files sniffed), and a subdirectory that
// could not be searched to the end is shown.
bool list_directory(const std::string& dir, const BrowserView& view, std::vector<BrowserEntry>& out,
                    const std::atomic<bool>* stop = nullptr);

// The file browser pane's state: the directory shown, its listing, the view, and the
// audio-file search. Listings are read on a worker thread ("list_dir"): the window calls
// update() once a frame, which takes a finished listing in; until then entries() and
// directory() stay as they were, and loading() is true. All calls are for the window
// thread and return at once.
class FileBrowser {
public:
    // Starts reading directory, or its nearest readable ancestor.
    explicit FileBrowser(const std::string& directory);

    const std::string& directory() const { return directory_; }
    const std::vector<BrowserEntry>& entries() const { return entries_; }
    const BrowserView& view() const { return view_; }
    bool loading() const { return loading_.load(std::memory_order_acquire); }
    AudioSearch& search() { return search_; }

    // Takes in a listing that has finished; true when entries() changed.
    bool update();

    // Starts reading dir; false, with nothing changed, when it cannot be read.
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
    void start_listing(const std::string& dir);

    std::string directory_;
    std::string requested_;  // the directory being read, or the one shown
    std::vector<BrowserEntry> entries_;
    BrowserView view_;
    AudioSearch search_;

    std::atomic<bool> loading_{false};
    std::mutex mutex_;  // guards the finished listing below
    bool finished_ = false;
    std::string finished_directory_;
    std::vector<BrowserEntry> finished_entries_;
    BackgroundThread lister_;  // last: stopped before the members it uses go
};

}  // namespace ondrel
