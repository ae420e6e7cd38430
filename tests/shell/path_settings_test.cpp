#include "shell/path_settings.h"

#include <gtest/gtest.h>

#include <filesystem>

#include "support/temp_dir.h"

namespace ondrel {
namespace {

using test::TempDir;

std::string read_text(const std::string& path) {
    const auto bytes = test::read_all(path);
    return {bytes.begin(), bytes.end()};
}

// "DIR | music... | sound..." with the temporary directory shown as "@".
std::string summary(const PathSettings& s, const std::string& existing) {
    std::string out = s.browser_directory == existing ? "@" : s.browser_directory;
    out += " |";
    for (const auto& d : s.music_directories()) out += " " + d;
    out += " |";
    for (const auto& d : s.sound_directories()) out += " " + d;
    return out;
}

TEST(PathFile, ReadsTheGrammarWithItsQuirks) {
    struct Case {
        std::string file;  // "@" stands for a directory that exists
        const char* expected;
    };
    // clang-format off
    const Case cases[] = {
        // Music entries go in one ahead of the other; sound entries keep their order.
        {"<Path>@\n<Music Path>/m/a\n<Music Path>/m/b\n<Music Path>/m/c\n<Sound Path>/s/a\n<Sound Path>/s/b\n",
         "@ | /m/c /m/b /m/a | /s/a /s/b"},
        // A line of the wrong group, or of none, ends the reading of its group.
        {"<Path>@\n<Music Path>/m/a\n<Sound Path>/s/a\n<Music Path>/m/b\n<Sound Path>/s/b\n", "@ | /m/a | /s/a"},
        {"<Path>@\n<Sound Path>/s/a\n<Music Path>/m/a\n", "@ | | /s/a"},
        {"<Path>@\n# mine\n<Music Path>/m/a\n", "@ | |"},
        {std::string("<Path>@\n") + '\0' + "<Music Path>/m/a\n", "@ | |"},
        // The last line without its newline runs into the (zeroed) end of the block.
        {"<Path>@\n<Music Path>/m/a\n<Sound Path>/s/last", "@ | /m/a | /s/last"},
        // A vanished browser directory is ignored, favourites are not checked.
        {"<Path>/no/such/ondrel/dir\n<Music Path>/gone/too\n", "/start | /gone/too |"},
        {"<Music Path>/m/a\n", "/start | /m/a |"},
        {"<Path>@\n<Music Path>\n<Music Path>/m/a\n<Sound Path>\n", "@ | /m/a |"},
        {"", "/start | |"},
    };
    // clang-format on
    for (const Case& c : cases) {
        SCOPED_TRACE(c.file);
        TempDir dir;
        const std::string existing = dir.path().string();
        std::string text = c.file;
        if (const size_t at = text.find('@'); at != std::string::npos) text.replace(at, 1, existing);
        dir.write("ondrel.txt", std::vector<uint8_t>(text.begin(), text.end()));
        PathSettings settings("/start");
        read_info_path(settings, existing);
        EXPECT_EQ(summary(settings, existing), c.expected);
    }
}

TEST(PathFile, MissingOrUnreadableFileLeavesTheDefaults) {
    TempDir dir;
    PathSettings settings("/start");
    read_info_path(settings, dir.file("absent"));
    std::filesystem::create_directory(dir.file("ondrel.txt"));  // a directory where the file should be
    read_info_path(settings, dir.path().string());
    EXPECT_EQ(summary(settings, ""), "/start | |");
    EXPECT_EQ(settings.menu.size(), 5u);
}

TEST(PathFile, WritesPathFirstTruncatesAndFlipsMusicAtEveryStart) {
    TempDir dir;
    const std::string thepath = dir.file("config/ondrel");  // created on first write
    PathSettings settings("/home/me/songs");
    std::string why;
    ASSERT_TRUE(write_info_path(settings, thepath, why)) << why;
    EXPECT_EQ(read_text(path_file_of(thepath)), "<Path>/home/me/songs\n");

    for (const char* d : {"/m/1", "/m/2", "/m/3"}) settings.add_music_directory(d);
    for (const char* d : {"/s/1", "/s/2", "/s/3"}) settings.add_sound_directory(d);
    ASSERT_TRUE(write_info_path(settings, thepath, why)) << why;
    const std::string sound = "<Sound Path>/s/1\n<Sound Path>/s/2\n<Sound Path>/s/3\n";
    EXPECT_EQ(read_text(path_file_of(thepath)),
              "<Path>/home/me/songs\n<Music Path>/m/3\n<Music Path>/m/2\n<Music Path>/m/1\n" + sound);

    // Each start reads what the last one wrote.
    for (const char* music : {"/m/1 /m/2 /m/3", "/m/3 /m/2 /m/1", "/m/1 /m/2 /m/3"}) {
        PathSettings next("/start");
        read_info_path(next, thepath);
        EXPECT_EQ(summary(next, ""), std::string("/start | ") + music + " | /s/1 /s/2 /s/3");
        ASSERT_TRUE(write_info_path(next, thepath, why)) << why;
    }

    ASSERT_TRUE(settings.remove_directory("/m/2"));
    ASSERT_TRUE(settings.remove_directory("/s/1"));
    ASSERT_TRUE(write_info_path(settings, thepath, why)) << why;
    EXPECT_EQ(read_text(path_file_of(thepath)),
              "<Path>/home/me/songs\n<Music Path>/m/3\n<Music Path>/m/1\n"
              "<Sound Path>/s/2\n<Sound Path>/s/3\n");
}

TEST(PathsMenu, ItemsCarryCodesInAddingOrderAndAreToldApartByIndex) {
    TempDir dir;
    const std::string fav = dir.file("fav");
    std::filesystem::create_directory(fav);
    PathSettings settings(dir.path().string());
    settings.add_music_directory(fav);  // first added: the same code as "Add Path To music"
    settings.add_music_directory("/vanished/ondrel");
    settings.add_sound_directory("/s/a");
    // Each item as LABEL:N, N its code's distance from 'GO00'; separators as "-".
    std::string items;
    for (const PathsMenuItem& item : settings.menu)
        items += item.label.empty() ? "- "
                                    : item.label + ":" + std::to_string(item.code - kAddMusicPathCode) + " ";
    EXPECT_EQ(items, "Add Path To music:0 Add Path To sound:1 Remove path:2 - /vanished/ondrel:1 " + fav +
                         ":0 - /s/a:2 ");

    // The favourite sharing 'GO00' opens its directory and adds nothing; a vanished one
    // leaves the browser where it is.
    EXPECT_EQ(settings.choose(5), PathsChoice::OpenedDirectory);
    EXPECT_EQ(settings.choose(4), PathsChoice::MissingDirectory);
    for (size_t separator : {3, 6, 99}) EXPECT_EQ(settings.choose(separator), PathsChoice::Nothing);
    EXPECT_EQ(summary(settings, ""), fav + " | /vanished/ondrel " + fav + " | /s/a");

    // "Remove path", "Add Path To sound" and "Add Path To music" act on the browser's directory,
    // once; sound entries still land last after a music entry has gone.
    using enum PathsChoice;
    const std::pair<size_t, PathsChoice> clicks[] = {
        {2, RemovedDirectory}, {2, Nothing}, {1, AddedDirectory}, {1, Nothing}, {0, AddedDirectory}};
    for (const auto& [index, result] : clicks) EXPECT_EQ(settings.choose(index), result) << index;
    EXPECT_EQ(summary(settings, ""), fav + " | " + fav + " /vanished/ondrel | /s/a " + fav);
    EXPECT_EQ(settings.menu[4].code, kAddMusicPathCode + 4);
}

}  // namespace
}  // namespace ondrel
