#include "shell/file_browser.h"

#include <algorithm>
#include <filesystem>
#include <utility>

#include "playback/messages.h"

namespace ondrel {

namespace fs = std::filesystem;

namespace {
// How much looking for audio below subdirectories one listing may do.
struct AudioLookBudget {
    size_t entries = 20000;
    size_t sniffs = 2000;
};

bool stopped(const std::atomic<bool>* stop) {
    return stop && stop->load(std::memory_order_relaxed);
}

// Whether dir holds a module or sound, directly or (all_levels) anywhere below it. Names
// decide first over the whole tree; content is sniffed only for the files left unsure.
bool holds_audio(const fs::path& dir, bool all_levels, AudioLookBudget& budget,
                 const std::atomic<bool>* stop) {
    std::vector<fs::path> pending{dir};
    std::vector<std::string> unsure;
    while (!pending.empty()) {
        const fs::path current = std::move(pending.back());
        pending.pop_back();
        std::error_code ec;
        fs::directory_iterator it(current, fs::directory_options::skip_permission_denied, ec);
        for (; !ec && it != fs::directory_iterator(); it.increment(ec)) {
            if (budget.entries == 0 || stopped(stop)) return true;
            --budget.entries;
            const fs::directory_entry& entry = *it;
            std::error_code kind_ec;
            if (entry.is_directory(kind_ec)) {
                if (all_levels && !entry.is_symlink(kind_ec) &&
                    !is_hidden_name(entry.path().filename().string()))
                    pending.push_back(entry.path());
                continue;
            }
            if (!entry.is_regular_file(kind_ec)) continue;
            std::string path = entry.path().string();
            if (is_audio(kind_by_extension(path))) return true;
            unsure.push_back(std::move(path));
        }
    }
    for (const std::string& path : unsure) {
        if (budget.sniffs == 0 || stopped(stop)) return true;
        --budget.sniffs;
        if (is_audio(kind_of_file(path))) return true;
    }
    return false;
}

// Absolute, without "." or ".." steps, without a trailing separator.
fs::path clean_directory(const std::string& dir) {
    std::error_code ec;
    fs::path path = dir.empty() ? fs::path() : fs::absolute(dir, ec).lexically_normal();
    if (!path.has_filename() && path.has_parent_path() && path != path.root_path()) path = path.parent_path();
    return path;
}

bool is_readable_directory(const fs::path& dir) {
    std::error_code ec;
    fs::directory_iterator it(dir, ec);
    return !ec;
}
}  // namespace

bool list_directory(const std::string& where, const BrowserView& view, std::vector<BrowserEntry>& out,
                    const std::atomic<bool>* stop) {
    out.clear();
    const fs::path dir = clean_directory(where);
    if (dir.empty()) return false;
    std::error_code ec;
    fs::directory_iterator it(dir, ec);
    if (ec) return false;
    AudioLookBudget budget;
    for (; !ec && it != fs::directory_iterator(); it.increment(ec)) {
        if (stopped(stop)) return false;
        const fs::directory_entry& entry = *it;
        std::string name = entry.path().filename().string();
        if (is_hidden_name(name) && !view.all_files) continue;
        std::string path = entry.path().string();
        std::error_code kind_ec;
        if (entry.is_directory(kind_ec)) {
            const bool shown =
                view.directories == DirectoryFilter::All ||
                holds_audio(entry.path(), view.directories == DirectoryFilter::AudioAllLevels, budget, stop);
            if (shown) out.push_back({std::move(name), std::move(path), EntryKind::Directory});
            continue;
        }
        // Anything that is no regular file (sockets, devices, dangling links) is "other":
        // never opened to look at its content.
        const EntryKind kind = entry.is_regular_file(kind_ec) ? kind_of_file(path) : EntryKind::Other;
        if (is_audio(kind) || view.all_files) out.push_back({std::move(name), std::move(path), kind});
    }
    if (dir != dir.root_path()) out.push_back({"..", dir.parent_path().string(), EntryKind::Directory});
    std::sort(out.begin(), out.end(), browser_order);
    return true;
}

FileBrowser::FileBrowser(const std::string& directory) : directory_(clean_directory(directory).string()) {
    requested_ = directory_;
    refresh();
}

void FileBrowser::start_listing(const std::string& dir) {
    lister_.stop();  // a listing under way is dropped: it ends after the file it is reading
    requested_ = dir;
    loading_.store(true, std::memory_order_release);
    lister_.start("list_dir", [this, dir, view = view_](const std::atomic<bool>& stop) {
        std::vector<BrowserEntry> listed;
        const bool ok = list_directory(dir, view, listed, &stop);
        if (ok) {
            std::lock_guard lock(mutex_);
            finished_ = true;
            finished_directory_ = dir;
            finished_entries_ = std::move(listed);
        }
        // A directory that went away meanwhile leaves the last listing in place.
        loading_.store(false, std::memory_order_release);
    });
}

bool FileBrowser::update() {
    std::lock_guard lock(mutex_);
    if (!finished_) return false;
    finished_ = false;
    directory_ = std::move(finished_directory_);
    entries_ = std::move(finished_entries_);
    return true;
}

bool FileBrowser::open_directory(const std::string& dir) {
    const fs::path clean = clean_directory(dir);
    if (clean.empty() || !is_readable_directory(clean)) return false;
    start_listing(clean.string());
    return true;
}

void FileBrowser::refresh() {
    fs::path dir = clean_directory(requested_);
    while (!is_readable_directory(dir) && dir.has_parent_path() && dir.parent_path() != dir)
        dir = dir.parent_path();
    if (!dir.empty()) start_listing(dir.string());
}

bool FileBrowser::handle(uint32_t code) {
    switch (code) {
        case fourcc("seea"): view_.all_files = !view_.all_files; break;
        case fourcc("seed"): view_.directories = DirectoryFilter::All; break;
        case fourcc("see1"): view_.directories = DirectoryFilter::AudioLevel1; break;
        case fourcc("seeA"): view_.directories = DirectoryFilter::AudioAllLevels; break;
        case fourcc("find"): search_.start(directory_); return true;
        case fourcc("NDMN"): break;
        default: return false;
    }
    refresh();
    return true;
}

bool FileBrowser::checked(uint32_t code) const {
    switch (code) {
        case fourcc("seea"): return view_.all_files;
        case fourcc("seed"): return view_.directories == DirectoryFilter::All;
        case fourcc("see1"): return view_.directories == DirectoryFilter::AudioLevel1;
        case fourcc("seeA"): return view_.directories == DirectoryFilter::AudioAllLevels;
        default: return false;
    }
}

}  // namespace ondrel
