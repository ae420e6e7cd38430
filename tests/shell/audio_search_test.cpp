#include "shell/audio_search.h"

#include <gtest/gtest.h>

#include <chrono>
#include <set>
#include <thread>

#include "browser_tree.h"
#include "support/wait_until.h"

namespace ondrel {
namespace {

using test::TempDir;
using namespace std::chrono_literals;

// Polls as the window would, once a frame, until the search ends (or the wait gives up).
std::vector<BrowserEntry> collect(AudioSearch& search, std::vector<SearchProgress>* seen = nullptr) {
    std::vector<BrowserEntry> found;
    test::wait_until([&] {
        const bool was_running = search.running();
        search.take_results(found);
        if (seen) seen->push_back(search.progress());
        return !was_running;
    });
    search.take_results(found);
    return found;
}

TEST(AudioSearch, FindsTheAudioFilesOfATreeWithProgress) {
    TempDir dir;
    test::make_tree(dir,
                    "top.mod notes.txt a/one.s3m a/b/two.wav a/b/c/disguised a/b/c/d/x.txt e/THREE.AIFF "
                    "e/readme .cache/hidden.mod empty/");
    std::filesystem::create_directory_symlink(dir.file("a"), dir.file("e/loop"));  // not followed

    AudioSearch search;
    search.start(dir.path().string());
    std::vector<SearchProgress> seen;
    const std::vector<BrowserEntry> found = collect(search, &seen);
    ASSERT_FALSE(search.running()) << "search did not end";

    std::set<std::string> names;
    for (const BrowserEntry& e : found) {
        names.insert(e.name);
        EXPECT_EQ(e.path, dir.file(e.name));
    }
    EXPECT_EQ(names, (std::set<std::string>{"top.mod", "a/one.s3m", "a/b/two.wav", "a/b/c/disguised",
                                            "e/THREE.AIFF"}));
    EXPECT_EQ(found.size(), names.size());
    // Directories: root, a, a/b, a/b/c, a/b/c/d, e and empty.
    const SearchProgress last = search.progress();
    EXPECT_EQ(std::tie(last.directories, last.files, last.found, last.cancelled, last.current),
              std::make_tuple(7u, 8u, 5u, false, std::string()));
    for (size_t i = 1; i < seen.size(); ++i) EXPECT_LE(seen[i - 1].files, seen[i].files);

    // A second search starts clean; one of a vanished root ends at once with nothing.
    search.start(dir.file("a/b"));
    EXPECT_EQ(collect(search).size(), 2u);
    search.start(dir.file("gone"));
    EXPECT_TRUE(collect(search).empty());
    EXPECT_EQ(search.progress().files, 0u);
}

TEST(AudioSearch, CancelsSoonAndCanBeDestroyedWhileRunning) {
    TempDir dir;
    std::string files;
    const size_t count = 20 * 40;
    for (size_t i = 0; i < count; ++i)
        files += "d" + std::to_string(i / 40) + "/f" + std::to_string(i) + ".bin ";
    test::make_tree(dir, files);

    AudioSearch search;
    search.start(dir.path().string());
    std::this_thread::sleep_for(2ms);
    search.cancel();
    const auto asked = std::chrono::steady_clock::now();
    collect(search);
    EXPECT_FALSE(search.running());
    EXPECT_LT(std::chrono::steady_clock::now() - asked, 2s);
    EXPECT_TRUE(search.progress().cancelled);
    EXPECT_LT(search.progress().files, count);

    AudioSearch abandoned;  // its destructor stops and joins the worker
    abandoned.start(dir.path().string());
}

}  // namespace
}  // namespace ondrel
