#include "import/loader.h"

#include <gtest/gtest.h>

#include <algorithm>

#include "support/chunk_builder.h"
#include "support/temp_dir.h"

namespace ondrel {
namespace {

using test::Bytes;
using test::ChunkFile;

// A small old-layout song with one pattern and one sample.
std::vector<uint8_t> old_song(const std::string& name) {
    ChunkFile f;
    f.chunk("O.T.", test::old_header(5, 140, name));
    f.chunk("S.Q.", test::old_sequence({0, 0}));
    f.chunk("PATT", test::old_pattern_format(4, "2.04"));
    Bytes p;
    p.zeros(4).be16(0).be16(2);
    for (int i = 0; i < 2 * 4; ++i) p.bytes({0x31, 0x04, 0x1C, 0x05});
    f.chunk("OAPT", p);
    test::OldSampleHeader h;
    h.length = 64;
    h.name = "square";
    f.chunk("INST", test::old_instruments({h}, false));
    Bytes d;
    d.be16(0);
    for (int i = 0; i < 64; ++i) d.u8(i < 32 ? 100 : -100);
    f.chunk("OAIT", d);
    return f.bytes;
}

class LoaderTest : public ::testing::Test {
protected:
    AlertLog alerts;
    SongBank bank{&alerts};
    EffectSlots slots;
    test::TempDir dir;
};

TEST_F(LoaderTest, LoadsIntoTheCurrentSongAndRecordsThePath) {
    set_text(bank.current().name, "before");
    const std::string path = dir.write("song.otm", old_song("loaded"));
    const LoadResult r = load(path, bank, slots);
    ASSERT_TRUE(r.ok) << r.error;
    EXPECT_FALSE(r.truncated);
    EXPECT_EQ(r.song, 0);
    EXPECT_EQ(bank.nbimod, 1);
    EXPECT_STREQ(bank.current().name, "loaded");
    EXPECT_EQ(bank.current().path, path);
    EXPECT_EQ(bank.current().nbtrack, 4);
    EXPECT_EQ(bank.nbvoie, 4);
    ASSERT_NE(bank.song_sample(0), nullptr);
    EXPECT_STREQ(bank.song_sample(0)->name, "square");
    EXPECT_EQ(bank.song_pattern(0)->col[3][1].instrument, 1);
    EXPECT_EQ(bank.loadin.load(), 0);
}

TEST_F(LoaderTest, PackedFilesAreRefusedAndNothingChanges) {
    set_text(bank.current().name, "mine");
    bank.t_sound[0] = make_sample(8);
    for (const char* magic : {"ICE!", "PP20", "EKO!", "ATM5"}) {
        Bytes b;
        b.text(magic, 4).zeros(100);
        const LoadResult r = load(dir.write("packed.otm", b.v), bank, slots);
        EXPECT_FALSE(r.ok);
        EXPECT_NE(r.error.find(magic), std::string::npos) << r.error;
    }
    ASSERT_EQ(alerts.shown.size(), 4u);
    EXPECT_EQ(alerts.shown[0].title, "title");
    EXPECT_EQ(alerts.shown[0].text, "Packed with unknown packer");
    EXPECT_EQ(alerts.shown[0].buttons, std::vector<std::string>{"Arg!!"});
    EXPECT_STREQ(bank.current().name, "mine");
    EXPECT_NE(bank.song_sample(0), nullptr);
}

TEST_F(LoaderTest, AFailedLoadLeavesTheSongTheUserHad) {
    set_text(bank.current().name, "mine");
    bank.song_pattern(0)->col[0][0].note = 42;
    const LoadResult missing = load(dir.file("absent.otm"), bank, slots);
    EXPECT_FALSE(missing.ok);
    EXPECT_NE(missing.error.find("absent.otm"), std::string::npos);
    const LoadResult junk = load(dir.write("junk.otm", {'n', 'o', 'p', 'e', 0, 0, 0, 0}), bank, slots);
    EXPECT_FALSE(junk.ok);
    const LoadResult empty = load(dir.write("empty.otm", {}), bank, slots);
    EXPECT_FALSE(empty.ok);
    EXPECT_STREQ(bank.current().name, "mine");
    EXPECT_EQ(bank.song_pattern(0)->col[0][0].note, 42);
}

TEST_F(LoaderTest, ReaderIsChosenByTheEndingWithoutCase) {
    EXPECT_STREQ(reader_for("a/b/SONG.OTM").extension, ".otm");
    EXPECT_STREQ(reader_for("x.S3m").extension, ".s3m");
    EXPECT_STREQ(reader_for("x.mtm").extension, ".mtm");
    EXPECT_STREQ(reader_for("x.xm").extension, ".xm");
    EXPECT_STREQ(reader_for("mod.ode2ptk").extension, "");  // anything else: MOD
    EXPECT_STREQ(reader_for("otm").extension, "");
    const LoadResult r = load(dir.write("upper.OTM", old_song("caps")), bank, slots);
    EXPECT_TRUE(r.ok) << r.error;
}

TEST_F(LoaderTest, MultipleMusicLoadingAddsASong) {
    set_text(bank.current().name, "first");
    bank.fmulload = 1;
    const LoadResult r = load(dir.write("second.otm", old_song("second")), bank, slots);
    ASSERT_TRUE(r.ok) << r.error;
    EXPECT_EQ(bank.nbimod, 2);
    EXPECT_EQ(bank.noimod, 1);
    EXPECT_EQ(r.song, 1);
    EXPECT_STREQ(bank.timod[0]->name, "first");
    EXPECT_STREQ(bank.current().name, "second");
    EXPECT_EQ(bank.current().patbase, 128);
    ASSERT_NE(bank.sample(128), nullptr);
    EXPECT_EQ(bank.sample(0), nullptr);
    EXPECT_NE(bank.pattern(0), nullptr);  // the first song's own pattern stays

    // A failed multiple load adds nothing.
    EXPECT_FALSE(load(dir.write("bad.otm", {'x'}), bank, slots).ok);
    EXPECT_EQ(bank.nbimod, 2);
}

TEST_F(LoaderTest, EffectBuffersAreNumberedAndReserved) {
    Bytes ot;
    ot.le16(0).le16(2).le16(64).le16(6).le32(480000).le16(1).le16(0).u8(0).text("fx", 64);
    for (int t = 0; t < 64; ++t) ot.le16(128);
    for (int t = 0; t < 64; ++t) ot.le16(128);
    for (int t = 0; t < 64; ++t) ot.le16(64);
    for (int t = 0; t < 64; ++t) ot.le16(t == 1 ? 11 : t == 2 ? 5 : 0);
    Bytes patt;
    patt.le16(1).le16(1).le16(0);
    Bytes track;
    track.bytes({8 | 16, 33, 10});
    patt.le16(static_cast<int>(track.size())).raw(track.v);
    ChunkFile f;
    f.chunk("o.t.", ot);
    f.chunk("patt", patt);
    slots.number_buffer(40);  // a numbering from an earlier song is cleared
    const LoadResult r = load(dir.write("fx.otm", f.bytes), bank, slots);
    ASSERT_TRUE(r.ok) << r.error;
    EXPECT_EQ(slots.nbbufferefx, 3);
    EXPECT_EQ(slots.bufnumber[10], 1);
    EXPECT_EQ(slots.bufnumber[11], 2);
    EXPECT_EQ(slots.bufnumber[5], 3);
    EXPECT_EQ(slots.bufnumber[40], 0);
    for (int k = 0; k < 3; ++k) EXPECT_NE(slots.pbufferefx[k], nullptr) << k;
    EXPECT_EQ(slots.pbufferefx[3], nullptr);
}

TEST_F(LoaderTest, EveryTruncationLoadsWithinBoundsAndKeepsAPrefix) {
    const std::vector<uint8_t> full = old_song("cut");
    const std::vector<size_t> chunk_ends = test::chunk_ends(full);
    ASSERT_EQ(chunk_ends.back(), full.size());
    for (size_t n = 0; n <= full.size(); ++n) {
        // An exactly sized buffer, so that any read past the end trips the sanitizer.
        std::vector<uint8_t> part(full.begin(), full.begin() + static_cast<std::ptrdiff_t>(n));
        ModuleRead out;
        ByteReader r(part);
        const bool ok = read_otm(r, out);
        EXPECT_EQ(ok, n >= 8) << n;
        if (!ok) continue;
        if (out.song.samples[0]) {
            EXPECT_LE(out.song.samples[0]->length, 64u);
            EXPECT_LE(out.song.samples[0]->loopend, out.song.samples[0]->length);
        }
        const bool on_boundary = std::find(chunk_ends.begin(), chunk_ends.end(), n) != chunk_ends.end();
        EXPECT_EQ(out.truncated, !on_boundary) << n;
    }
}

}  // namespace
}  // namespace ondrel
