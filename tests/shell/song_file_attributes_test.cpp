#include "shell/song_file_attributes.h"

#include <gtest/gtest.h>

#include "platform/file_attributes.h"
#include "support/temp_dir.h"

namespace ondrel {
namespace {

using test::TempDir;

// A song file under /tmp, or a skip when that file system keeps no user attributes.
class SongFileAttributes : public ::testing::Test {
protected:
    void SetUp() override {
        path_ = dir_.write("song.otm", {1, 2, 3});
        const uint8_t probe = 0;
        if (!write_file_attribute(path_, "user.ondrel_probe", &probe, 1))
            GTEST_SKIP() << "no user extended attributes on " << dir_.path();
    }
    std::vector<uint8_t> raw(const char* name) const {
        uint8_t buf[16];
        const long n = read_file_attribute(path_, name, buf, sizeof buf);
        return n < 0 ? std::vector<uint8_t>{} : std::vector<uint8_t>(buf, buf + n);
    }
    TempDir dir_;
    std::string path_;
};

TEST_F(SongFileAttributes, RoundTripAsSignExtendedLittleEndian) {
    const EditorPosition written{12, -2, 32767, -32768, 63};
    writeinfo_in_file(path_, written);
    EXPECT_EQ(raw("user.on_nopat"), (std::vector<uint8_t>{12, 0, 0, 0}));
    EXPECT_EQ(raw("user.on_v"), (std::vector<uint8_t>{0xFE, 0xFF, 0xFF, 0xFF}));
    EXPECT_EQ(raw("user.on_x"), (std::vector<uint8_t>{0xFF, 0x7F, 0, 0}));
    EXPECT_EQ(raw("user.on_y"), (std::vector<uint8_t>{0x00, 0x80, 0xFF, 0xFF}));
    EXPECT_EQ(raw("user.oftrack"), (std::vector<uint8_t>{63, 0, 0, 0}));

    EditorPosition read{};
    TMOD song{};
    set_text(song.path, path_.c_str());
    readinfo_in_file(song, read);
    EXPECT_EQ(read.nopat, 12);
    EXPECT_EQ(read.poscurv, -2);
    EXPECT_EQ(read.poscurx, 32767);
    EXPECT_EQ(read.scroll_y, -32768);
    EXPECT_EQ(read.oftrack, 63);
}

TEST_F(SongFileAttributes, OnlyExactlyFourBytesAreTaken) {
    const uint8_t two[2] = {5, 0};
    const uint8_t eight[8] = {6, 0, 0, 0, 0, 0, 0, 0};
    const uint8_t four[4] = {7, 0, 0, 0};
    write_file_attribute(path_, "user.on_nopat", two, sizeof two);
    write_file_attribute(path_, "user.on_v", eight, sizeof eight);
    write_file_attribute(path_, "user.on_x", four, sizeof four);
    // "user.on_y" and "user.oftrack" are missing.
    EditorPosition position{-1, -1, -1, -1, -1};
    readinfo_in_file(path_, position);
    EXPECT_EQ(position.nopat, -1);
    EXPECT_EQ(position.poscurv, -1);
    EXPECT_EQ(position.poscurx, 7);
    EXPECT_EQ(position.scroll_y, -1);
    EXPECT_EQ(position.oftrack, -1);
}

TEST(SongFileAttributesQuiet, MissingFileOrNoPathChangesNothing) {
    TempDir dir;
    EditorPosition position{1, 2, 3, 4, 5};
    writeinfo_in_file(dir.file("absent.otm"), position);
    writeinfo_in_file(std::string(), position);
    readinfo_in_file(dir.file("absent.otm"), position);
    readinfo_in_file(TMOD{}, position);
    EXPECT_FALSE(std::filesystem::exists(dir.file("absent.otm")));
    EXPECT_EQ(position.poscurx, 3);
    EXPECT_EQ(position.oftrack, 5);
}

}  // namespace
}  // namespace ondrel
