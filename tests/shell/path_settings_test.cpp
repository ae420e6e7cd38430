#include "shell/path_settings.h"

#include <gtest/gtest.h>

#include <filesystem>

#include "support/temp_dir.h"

namespace ondrel {
namespace {

using test::TempDir;
using Dirs = std::vector<std::string>;

std::string read_text(const std::string& path) {
    const auto bytes = test::read_all(path);
    return {bytes.begin(), bytes.end()};
}

void write_text(const TempDir& dir, const std::string& name, const std::string& text) {
    dir.write(name, std::vector<uint8_t>(text.begin(), text.end()));
}

// "@" in a case's text stands for a directory that exists.
std::string with_existing(std::string text, const std::string& existing) {
    for (size_t at = text.find('@'); at != std::string::npos; at = text.find('@', at + existing.size()))
        text.replace(at, 1, existing);
    return text;
}

struct ReadCase {
    const char* what;
    std::string file;
    bool browser_moves;  // to the existing directory
    Dirs music;          // in menu order
    Dirs sound;
};

TEST(PathFile, ReadsTheGrammarWithItsQuirks) {
    const ReadCase cases[] = {
        {"music reversed, sound in order",
         "<Path>@\n<Music Path>/m/a\n<Music Path>/m/b\n<Music Path>/m/c\n"
         "<Sound Path>/s/a\n<Sound Path>/s/b\n",
         true,
         {"/m/c", "/m/b", "/m/a"},
         {"/s/a", "/s/b"}},
        {"music after sound is not read",
         "<Path>@\n<Music Path>/m/a\n<Sound Path>/s/a\n<Music Path>/m/b\n"
         "<Sound Path>/s/b\n",
         true,
         {"/m/a"},
         {"/s/a"}},
        {"sound first ends the music group",
         "<Path>@\n<Sound Path>/s/a\n<Music Path>/m/a\n",
         true,
         {},
         {"/s/a"}},
        {"a line without a key ends everything", "<Path>@\n# mine\n<Music Path>/m/a\n", true, {}, {}},
        {"last line without its newline",
         "<Path>@\n<Music Path>/m/a\n<Sound Path>/s/last",
         true,
         {"/m/a"},
         {"/s/last"}},
        {"vanished browser directory ignored",
         "<Path>/no/such/ondrel/dir\n<Music Path>/gone/too\n",
         false,
         {"/gone/too"},
         {}},
        {"no <Path> line", "<Music Path>/m/a\n", false, {"/m/a"}, {}},
        {"empty values skipped",
         "<Path>@\n<Music Path>\n<Music Path>/m/a\n<Sound Path>\n",
         true,
         {"/m/a"},
         {}},
        {"empty file", "", false, {}, {}},
        {"text after a NUL is never read",
         std::string("<Path>@\n") + '\0' + "<Music Path>/m/a\n",
         true,
         {},
         {}},
    };
    for (const ReadCase& c : cases) {
        SCOPED_TRACE(c.what);
        TempDir dir;
        const std::string existing = dir.path().string();
        write_text(dir, "ondrel.txt", with_existing(c.file, existing));
        PathSettings settings("/start");
        read_info_path(settings, existing);
        EXPECT_EQ(settings.browser_directory, c.browser_moves ? existing : "/start");
        EXPECT_EQ(settings.music_directories(), c.music);
        EXPECT_EQ(settings.sound_directories(), c.sound);
    }
}

TEST(PathFile, MissingOrUnreadableFileLeavesTheDefaults) {
    TempDir dir;
    PathSettings settings("/start");
    const auto menu_before = settings.menu.size();
    read_info_path(settings, dir.file("absent"));
    std::filesystem::create_directory(dir.file("ondrel.txt"));  // a directory where the file should be
    read_info_path(settings, dir.path().string());
    EXPECT_EQ(settings.browser_directory, "/start");
    EXPECT_EQ(settings.menu.size(), menu_before);
    EXPECT_EQ(settings.popadded, 0);
}

TEST(PathFile, WritesPathFirstAndTruncatesAnOlderList) {
    TempDir dir;
    const std::string thepath = dir.file("config/ondrel");  // created on first write
    PathSettings settings("/home/me/songs");
    std::string why;
    ASSERT_TRUE(write_info_path(settings, thepath, why)) << why;
    EXPECT_EQ(read_text(path_file_of(thepath)), "<Path>/home/me/songs\n");

    settings.add_music_directory("/m/a");
    settings.add_music_directory("/m/b");
    settings.add_sound_directory("/s/a");
    settings.add_sound_directory("/s/b");
    ASSERT_TRUE(write_info_path(settings, thepath, why)) << why;
    EXPECT_EQ(
        read_text(path_file_of(thepath)),
        "<Path>/home/me/songs\n<Music Path>/m/b\n<Music Path>/m/a\n<Sound Path>/s/a\n<Sound Path>/s/b\n");

    ASSERT_TRUE(settings.remove_directory("/m/b"));
    ASSERT_TRUE(settings.remove_directory("/s/a"));
    ASSERT_TRUE(write_info_path(settings, thepath, why)) << why;
    EXPECT_EQ(read_text(path_file_of(thepath)), "<Path>/home/me/songs\n<Music Path>/m/a\n<Sound Path>/s/b\n");
}

TEST(PathFile, MusicOrderFlipsAtEveryStart) {
    TempDir dir;
    const std::string thepath = dir.path().string();
    const std::string dirs =
        "<Music Path>/m/1\n<Music Path>/m/2\n<Music Path>/m/3\n<Sound Path>/s/1\n"
        "<Sound Path>/s/2\n";
    write_text(dir, "ondrel.txt", "<Path>" + thepath + "\n" + dirs);
    Dirs seen[3];
    for (Dirs& music : seen) {  // three starts, each reading what the last one wrote
        PathSettings settings("/start");
        read_info_path(settings, thepath);
        music = settings.music_directories();
        EXPECT_EQ(settings.sound_directories(), (Dirs{"/s/1", "/s/2"}));
        std::string why;
        ASSERT_TRUE(write_info_path(settings, thepath, why)) << why;
    }
    EXPECT_EQ(seen[0], (Dirs{"/m/3", "/m/2", "/m/1"}));
    EXPECT_EQ(seen[1], (Dirs{"/m/1", "/m/2", "/m/3"}));
    EXPECT_EQ(seen[2], seen[0]);
}

TEST(PathsMenu, ItemsCarryCodesInAddingOrderAndAreToldApartByIndex) {
    TempDir dir;
    const std::string here = dir.path().string();
    std::filesystem::create_directory(dir.file("fav"));
    PathSettings settings(here);
    settings.add_music_directory(dir.file("fav"));  // first added: the same code as "Add Path To music"
    settings.add_music_directory("/vanished/ondrel");
    settings.add_sound_directory("/s/a");
    const std::vector<std::pair<std::string, uint32_t>> expected = {
        {kAddMusicPathLabel, kAddMusicPathCode},
        {kAddSoundPathLabel, kAddSoundPathCode},
        {kRemovePathLabel, kRemovePathCode},
        {"", 0},
        {"/vanished/ondrel", kAddMusicPathCode + 1},
        {dir.file("fav"), kAddMusicPathCode},
        {"", 0},
        {"/s/a", kAddMusicPathCode + 2}};
    ASSERT_EQ(settings.menu.size(), expected.size());
    for (size_t i = 0; i < expected.size(); ++i) {
        EXPECT_EQ(settings.menu[i].label, expected[i].first) << i;
        EXPECT_EQ(settings.menu[i].code, expected[i].second) << i;
    }

    // The favourite that shares 'GO00' opens its directory; it adds nothing.
    EXPECT_EQ(settings.choose(5), PathsChoice::OpenedDirectory);
    EXPECT_EQ(settings.browser_directory, dir.file("fav"));
    EXPECT_EQ(settings.menu.size(), expected.size());
    EXPECT_EQ(settings.choose(4), PathsChoice::MissingDirectory);
    EXPECT_EQ(settings.browser_directory, dir.file("fav"));
    for (size_t separator : {size_t{3}, size_t{6}, size_t{99}})
        EXPECT_EQ(settings.choose(separator), PathsChoice::Nothing);

    // "Remove path" then "Add Path To sound" act on the browser's directory; sound entries
    // still land after the separator once a music entry has gone.
    EXPECT_EQ(settings.choose(2), PathsChoice::RemovedDirectory);
    EXPECT_EQ(settings.choose(2), PathsChoice::Nothing);
    EXPECT_EQ(settings.choose(1), PathsChoice::AddedDirectory);
    EXPECT_EQ(settings.choose(1), PathsChoice::Nothing);
    EXPECT_EQ(settings.music_directories(), (Dirs{"/vanished/ondrel"}));
    EXPECT_EQ(settings.sound_directories(), (Dirs{"/s/a", dir.file("fav")}));
    EXPECT_EQ(settings.choose(0), PathsChoice::AddedDirectory);
    EXPECT_EQ(settings.music_directories(), (Dirs{dir.file("fav"), "/vanished/ondrel"}));
    EXPECT_EQ(settings.menu[4].code, kAddMusicPathCode + 4);
    EXPECT_EQ(settings.nopopsd, static_cast<int16_t>(settings.menu.size()));
}

}  // namespace
}  // namespace ondrel
