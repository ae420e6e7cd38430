#include "shell/song_file_attributes.h"

#include <gtest/gtest.h>

#include "export/otm_writer.h"
#include "platform/file_attributes.h"
#include "shell/command_handlers.h"
#include "shell/editor_cursor.h"
#include "shell/program_fixture.h"

namespace ondrel {
namespace {

using test::TempDir;
using Bytes = std::vector<uint8_t>;

struct Attribute {
    const char* name;
    int16_t EditorPosition::*field;
    int16_t value;
    Bytes on_disk;  // 32-bit little-endian, sign-extended
};

const Attribute kAttributes[] = {
    {"user.on_nopat", &EditorPosition::nopat, 12, {12, 0, 0, 0}},
    {"user.on_v", &EditorPosition::poscurv, -2, {0xFE, 0xFF, 0xFF, 0xFF}},
    {"user.on_x", &EditorPosition::poscurx, 32767, {0xFF, 0x7F, 0, 0}},
    {"user.on_y", &EditorPosition::scroll_y, -32768, {0x00, 0x80, 0xFF, 0xFF}},
    {"user.oftrack", &EditorPosition::oftrack, 63, {63, 0, 0, 0}},
};

// A song file under /tmp, or a skip when that file system keeps no user attributes.
class SongFileAttributes : public ::testing::Test {
protected:
    void SetUp() override {
        path_ = dir_.write("song.otm", {1, 2, 3});
        if (!write_file_attribute(path_, "user.ondrel_probe", "", 0))
            GTEST_SKIP() << "no user extended attributes on " << dir_.path();
    }
    TempDir dir_;
    std::string path_;
};

TEST_F(SongFileAttributes, RoundTripAsSignExtendedLittleEndian) {
    EditorPosition written;
    for (const Attribute& a : kAttributes) written.*a.field = a.value;
    writeinfo_in_file(path_, written);
    EditorPosition read;
    TMOD song{};
    set_text(song.path, path_.c_str());
    readinfo_in_file(song, read);
    for (const Attribute& a : kAttributes) {
        uint8_t raw[16];
        const long n = read_file_attribute(path_, a.name, raw, sizeof raw);
        EXPECT_EQ(Bytes(raw, raw + std::max(n, 0L)), a.on_disk) << a.name;
        EXPECT_EQ(read.*a.field, a.value) << a.name;
    }
}

TEST_F(SongFileAttributes, OnlyExactlyFourBytesAreTaken) {
    // Two bytes, eight bytes, four bytes, then two attributes missing.
    const Bytes stored[] = {{5, 0}, {6, 0, 0, 0, 0, 0, 0, 0}, {7, 0, 0, 0}};
    for (size_t i = 0; i < std::size(stored); ++i)
        write_file_attribute(path_, kAttributes[i].name, stored[i].data(), stored[i].size());
    EditorPosition position{-1, -1, -1, -1, -1};
    readinfo_in_file(path_, position);
    const int16_t expected[] = {-1, -1, 7, -1, -1};
    for (size_t i = 0; i < std::size(kAttributes); ++i)
        EXPECT_EQ(position.*kAttributes[i].field, expected[i]) << kAttributes[i].name;
}

TEST(SongFileAttributesQuiet, MissingFileOrNoPathChangesNothing) {
    TempDir dir;
    EditorPosition position{1, 2, 3, 4, 5};
    writeinfo_in_file(dir.file("absent.otm"), position);
    readinfo_in_file(dir.file("absent.otm"), position);
    readinfo_in_file(TMOD{}, position);
    EXPECT_FALSE(std::filesystem::exists(dir.file("absent.otm")));
    EXPECT_EQ(position.poscurx, 3);
    EXPECT_EQ(position.oftrack, 5);
}

// Opening a song puts the editor where its file says, inside the song whatever the file holds.
TEST_F(SongFileAttributes, OpeningASongRestoresAPositionInsideIt) {
    Program p;
    std::string why;
    ASSERT_TRUE(save_otm(dir_.file("song.otm"), p.engine.bank, 0, p.engine.slots, why)) << why;
    const TMOD& song = p.engine.bank.current();
    const int rows = song.rows[song.sequence[0]], tracks = song.nbtrack;
    struct Case {
        EditorPosition stored;
        int nopat, row, track, field, view_top, oftrack;
    };
    // clang-format off
    const Case cases[] = {
        {{0, 5, 2 * kFieldsPerTrack + 3, 4, 1}, 0, 5, 2, 3, 4, 1},
        {{200, 30000, 32767, 32767, 300}, 0, rows - 1, tracks - 1, 32767 % kFieldsPerTrack, rows - 1, tracks - 1},
        {{-5, -1, -9, -2, -3}, 0, 0, 0, 0, 0, 0},
    };
    // clang-format on
    for (const Case& c : cases) {
        writeinfo_in_file(dir_.file("song.otm"), c.stored);
        test::open_files(p, {dir_.file("song.otm")});
        EXPECT_EQ(p.engine.player.tr.nopat, c.nopat);
        const CursorPlace at = cursor_place(p);
        EXPECT_EQ(std::tie(at.row, at.track, at.field), std::tie(c.row, c.track, c.field));
        EXPECT_EQ(p.editor.view_top, c.view_top);
        EXPECT_EQ(p.editor.oftrack, c.oftrack);
    }
}

}  // namespace
}  // namespace ondrel
