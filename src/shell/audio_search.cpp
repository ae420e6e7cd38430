#include "shell/audio_search.h"

#include <algorithm>
#include <filesystem>

namespace ondrel {

namespace fs = std::filesystem;

void AudioSearch::start(const std::string& root) {
    worker_.stop();
    root_ = root;
    directories_ = 0;
    files_ = 0;
    found_ = 0;
    {
        std::lock_guard lock(mutex_);
        ready_.clear();
        current_ = root;
    }
    running_.store(true, std::memory_order_release);
    worker_.start("find_audio", [this, root](const std::atomic<bool>& stop) { walk(root, stop); });
}

SearchProgress AudioSearch::progress() const {
    SearchProgress p;
    p.running = running();
    p.cancelled = worker_.stop_requested();
    p.directories = directories_.load(std::memory_order_relaxed);
    p.files = files_.load(std::memory_order_relaxed);
    p.found = found_.load(std::memory_order_relaxed);
    std::lock_guard lock(mutex_);
    p.current = current_;
    return p;
}

size_t AudioSearch::take_results(std::vector<BrowserEntry>& out) {
    std::vector<BrowserEntry> taken;
    {
        std::lock_guard lock(mutex_);
        taken.swap(ready_);
    }
    out.insert(out.end(), std::make_move_iterator(taken.begin()), std::make_move_iterator(taken.end()));
    return taken.size();
}

void AudioSearch::publish(std::vector<BrowserEntry>& batch) {
    if (batch.empty()) return;
    std::sort(batch.begin(), batch.end(), browser_order);
    found_.fetch_add(batch.size(), std::memory_order_relaxed);
    std::lock_guard lock(mutex_);
    ready_.insert(ready_.end(), std::make_move_iterator(batch.begin()), std::make_move_iterator(batch.end()));
    batch.clear();
}

void AudioSearch::walk(const std::string& root, const std::atomic<bool>& stop) {
    std::vector<fs::path> pending{fs::path(root)};
    std::vector<BrowserEntry> batch;
    const auto cancelled = [&] { return stop.load(std::memory_order_relaxed); };
    while (!pending.empty() && !cancelled()) {
        const fs::path dir = std::move(pending.back());
        pending.pop_back();
        {
            std::lock_guard lock(mutex_);
            current_ = dir.string();
        }
        std::error_code ec;
        fs::directory_iterator it(dir, fs::directory_options::skip_permission_denied, ec);
        std::vector<fs::path> subdirectories;
        for (; !ec && it != fs::directory_iterator() && !cancelled(); it.increment(ec)) {
            const fs::directory_entry& entry = *it;
            const std::string name = entry.path().filename().string();
            std::error_code kind_ec;
            if (entry.is_directory(kind_ec)) {
                if (!is_hidden_name(name) && !entry.is_symlink(kind_ec))
                    subdirectories.push_back(entry.path());
                continue;
            }
            if (!entry.is_regular_file(kind_ec)) continue;
            files_.fetch_add(1, std::memory_order_relaxed);
            const std::string path = entry.path().string();
            const EntryKind kind = kind_of_file(path);
            if (is_audio(kind)) batch.push_back({entry.path().lexically_relative(root).string(), path, kind});
        }
        directories_.fetch_add(1, std::memory_order_relaxed);
        publish(batch);
        // Depth first, the subdirectories in name order.
        std::sort(subdirectories.begin(), subdirectories.end(), [](const fs::path& a, const fs::path& b) {
            return browser_order({a.filename().string(), "", EntryKind::Directory},
                                 {b.filename().string(), "", EntryKind::Directory});
        });
        pending.insert(pending.end(), std::make_move_iterator(subdirectories.rbegin()),
                       std::make_move_iterator(subdirectories.rend()));
    }
    {
        std::lock_guard lock(mutex_);
        current_.clear();
    }
    running_.store(false, std::memory_order_release);
}

}  // namespace ondrel
