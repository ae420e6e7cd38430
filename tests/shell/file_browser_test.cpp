#include "shell/file_browser.h"

#include <gtest/gtest.h>

#include "browser_tree.h"
#include "playback/messages.h"
#include "support/wait_until.h"

namespace ondrel {
namespace {

using test::TempDir;

const char* const kTree =
    "b.mod A.otm song10.s3m song2.s3m x.xm old.mtm beep.wav snd.AIFF z.avr disguised notes.txt .hidden.mod "
    "Empty/ Level1/a.mod Deep/sub/s.wav Docs/readme.txt Docs/disguised.dat .hiddendir/a.mod Take10/ take2/";

// Waits, as the window's frames would, for the listing under way.
void settle(FileBrowser& browser) {
    test::wait_until([&] { return !browser.loading(); });
    browser.update();
}

std::string listing(const std::vector<BrowserEntry>& entries) {
    static const char* const kinds[] = {"D", "M", "S", "O"};
    std::string out;
    for (const BrowserEntry& e : entries)
        out += std::string(kinds[static_cast<int>(e.kind)]) + ":" + e.name + " ";
    return out;
}

struct ViewCase {
    std::vector<uint32_t> codes;  // browser menu codes posted in turn
    std::string expected;
};

TEST(FileBrowser, ListsDirectoriesThenKnownTypesInEachView) {
    TempDir dir;
    test::make_tree(dir, kTree);
    // Modules and sounds as opening them would sort them: "disguised" is a WAV by content.
    const std::string known =
        "M:A.otm M:b.mod M:old.mtm M:song2.s3m M:song10.s3m M:x.xm "
        "S:beep.wav S:disguised S:snd.AIFF S:z.avr ";
    const std::string all_dirs = "D:.. D:Deep D:Docs D:Empty D:Level1 D:take2 D:Take10 ";
    const ViewCase cases[] = {
        {{}, all_dirs + known},
        {{fourcc("seea")},
         "D:.. D:.hiddendir D:Deep D:Docs D:Empty D:Level1 D:take2 D:Take10 M:.hidden.mod " + known +
             "O:notes.txt "},
        {{fourcc("see1")}, "D:.. D:Docs D:Level1 " + known},
        {{fourcc("seeA")}, "D:.. D:Deep D:Docs D:Level1 " + known},
        {{fourcc("seeA"), fourcc("seea")},
         "D:.. D:.hiddendir D:Deep D:Docs D:Level1 M:.hidden.mod " + known + "O:notes.txt "},
        {{fourcc("seea"), fourcc("seea"), fourcc("see1"), fourcc("seed"), fourcc("NDMN")}, all_dirs + known},
    };
    for (const ViewCase& c : cases) {
        SCOPED_TRACE(c.expected);
        FileBrowser browser(dir.path().string());
        for (uint32_t code : c.codes) EXPECT_TRUE(browser.handle(code));  // each drops the last listing
        settle(browser);
        EXPECT_EQ(listing(browser.entries()), c.expected);
        const int checked = browser.checked(fourcc("seed")) + browser.checked(fourcc("see1")) +
                            browser.checked(fourcc("seeA"));
        EXPECT_EQ(checked, 1);
    }
}

TEST(FileBrowser, VanishedAndUnreadablePathsAreQuiet) {
    TempDir dir;
    test::make_tree(dir, "a/b/c/song.mod file.mod");
    FileBrowser browser(dir.file("a/b/c/"));
    settle(browser);
    EXPECT_EQ(browser.directory(), dir.file("a/b/c"));
    EXPECT_EQ(listing(browser.entries()), "D:.. M:song.mod ");
    EXPECT_EQ(browser.entries()[0].path, dir.file("a/b"));

    for (const std::string& bad : {dir.file("nowhere"), dir.file("file.mod"), std::string()})
        EXPECT_FALSE(browser.open_directory(bad)) << bad;
    EXPECT_EQ(browser.directory(), dir.file("a/b/c"));

    std::filesystem::remove_all(dir.file("a/b"));
    EXPECT_TRUE(browser.handle(fourcc("NDMN")));
    settle(browser);
    EXPECT_EQ(browser.directory(), dir.file("a"));
    EXPECT_EQ(listing(browser.entries()), "D:.. ");
    EXPECT_FALSE(browser.handle(fourcc("news")));

    ASSERT_TRUE(browser.open_directory("/"));
    settle(browser);
    EXPECT_EQ(browser.directory(), "/");
    EXPECT_NE(listing(browser.entries()).substr(0, 5), "D:.. ");
}

}  // namespace
}  // namespace ondrel
