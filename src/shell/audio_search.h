#pragma once
#include <atomic>
#include <cstdint>
#include <mutex>
#include <string>
#include <vector>

#include "shell/background_thread.h"
#include "shell/browser_entry.h"

namespace ondrel {

struct SearchProgress {
    uint64_t directories = 0;  // directories read so far
    uint64_t files = 0;        // files looked at so far
    uint64_t found = 0;        // modules and sounds among them
    bool running = false;
    bool cancelled = false;
    std::string current;  // the directory being read
};

// "Find all audio files": walks a directory tree on its own thread ("find_audio", at a
// lower priority) and hands the modules and sounds it finds to the window thread in
// batches. Every call below is for the window thread and returns at once: the worker
// holds the lock only to append a batch or to name its directory. Hidden directories and
// symbolic links to directories are not walked; unreadable ones are passed over.
class AudioSearch {
public:
    // Starts a search of root, ending the one under way; earlier results are dropped.
    void start(const std::string& root);
    // Asks the search to stop; it ends after the file it is reading.
    void cancel() { worker_.request_stop(); }
    bool running() const { return running_.load(std::memory_order_acquire); }
    SearchProgress progress() const;
    // Appends what was found since the last call to out; the number appended. Each
    // directory's finds come in browser order; names are paths below the root.
    size_t take_results(std::vector<BrowserEntry>& out);
    const std::string& root() const { return root_; }

private:
    void walk(const std::string& root, const std::atomic<bool>& stop);
    void publish(std::vector<BrowserEntry>& batch);

    std::string root_;
    std::atomic<bool> running_{false};
    std::atomic<uint64_t> directories_{0};
    std::atomic<uint64_t> files_{0};
    std::atomic<uint64_t> found_{0};
    mutable std::mutex mutex_;  // guards the two below
    std::vector<BrowserEntry> ready_;
    std::string current_;
    BackgroundThread worker_;  // last: stopped before the members it uses go
};

}  // namespace ondrel
