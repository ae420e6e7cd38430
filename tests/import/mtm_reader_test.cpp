// MTM files built byte by byte.
#include <gtest/gtest.h>

#include "import/module_reader.h"
#include "support/chunk_builder.h"

namespace ondrel {
namespace {

using test::Bytes;

struct MtmSample {
    std::string name;
    std::vector<uint8_t> data;
    uint32_t loop_start = 0, loop_end = 0;
    int finetune = 0, volume = 64, attribute = 0;
};

// Two stored tracks, one pattern (track 1, empty, track 2) plus a second pattern.
std::vector<uint8_t> mtm_file(const std::vector<MtmSample>& samples, int channels = 3, int comment = 5) {
    Bytes b;
    b.text("MTM", 3).u8(0x10).text("Multi Song", 20).le16(2).u8(1).u8(2).le16(comment);
    b.u8(static_cast<int>(samples.size())).u8(0).u8(64).u8(channels);
    b.zeros(32);
    for (const auto& s : samples) {
        b.text(s.name, 22).le32(static_cast<uint32_t>(s.data.size())).le32(s.loop_start).le32(s.loop_end);
        b.u8(s.finetune).u8(s.volume).u8(s.attribute);
    }
    b.bytes({1, 0, 1});
    b.zeros(125);
    Bytes track1;
    track1.bytes({0x03, 0x1C, 0x20});           // row 0: no note (not above 3), instrument 49
    track1.bytes({(40 << 2) | 1, 0x2A, 0x33});  // row 1: note 64, instrument 18, command 10
    track1.zeros(192 - 6);
    Bytes track2;
    track2.bytes({(10 << 2), 0x30, 0});  // note 34, instrument 3
    track2.zeros(189);
    b.raw(track1.v).raw(track2.v);
    b.le16(1).le16(0).le16(2);
    b.zeros(64 - 6);
    b.le16(2);
    b.zeros(62);
    b.zeros(static_cast<size_t>(comment));
    for (const auto& s : samples) b.raw(s.data);
    return b.v;
}

ModuleRead read(const std::vector<uint8_t>& bytes) {
    ModuleRead out;
    ByteReader r(bytes);
    EXPECT_TRUE(read_mtm(r, out)) << out.error;
    return out;
}

TEST(MtmReader, HeaderOrdersAndTracks) {
    const ModuleRead r = read(mtm_file({}));
    const TMOD& m = *r.song.mod;
    EXPECT_STREQ(m.name, "Multi Song");
    EXPECT_EQ(m.format, 1);
    EXPECT_EQ(m.repeat, 0);
    EXPECT_EQ(m.nbpos, 3);
    EXPECT_EQ(m.sequence[0], 1);
    EXPECT_EQ(m.sequence[2], 1);
    EXPECT_EQ(m.nbtrack, 3);
    const Pattern& p = *r.song.patterns[0];
    EXPECT_EQ(p.col[0][0].note, 0);
    EXPECT_EQ(p.col[0][0].instrument, 49);
    EXPECT_EQ(p.col[0][0].command, 12);
    EXPECT_EQ(p.col[0][0].parameter, 0x20);
    EXPECT_EQ(p.col[0][1].note, 64);
    EXPECT_EQ(p.col[0][1].instrument, 18);
    EXPECT_EQ(p.col[0][1].command, 10);
    EXPECT_TRUE(p.col[1][0].empty());
    EXPECT_EQ(p.col[2][0].note, 34);
    EXPECT_EQ(p.col[2][0].instrument, 3);
    EXPECT_EQ(r.song.patterns[1]->col[0][0].note, 34);
    EXPECT_EQ(r.song.patterns[2], nullptr);
}

TEST(MtmReader, SamplesAndLoops) {
    MtmSample a{"piano", {0x80, 0x00, 0xff, 0x7f}, 0, 4, 0x13, 20, 0};
    MtmSample b{"", {0x00, 0x80, 0xff, 0x7f}, 0, 0, 0, 64, 1};
    MtmSample c{"later", std::vector<uint8_t>(40, 0x80), 8, 0, 0, 64, 0};
    const ModuleRead r = read(mtm_file({a, b, c}));
    const p_s& s0 = *r.song.samples[0];
    EXPECT_STREQ(s0.name, "piano");
    EXPECT_EQ(s0.rate, 8363u);
    EXPECT_EQ(s0.refnote, 48);
    EXPECT_EQ(s0.finetune, 3);
    EXPECT_EQ(s0.volume, 40);
    EXPECT_EQ(static_cast<int8_t>(s0.data[0]), 0);
    EXPECT_EQ(static_cast<int8_t>(s0.data[1]), -128);
    EXPECT_EQ(s0.loopon, 1);
    EXPECT_EQ(s0.data[4], s0.data[0]);  // loop start copied past the end
    const p_s& s1 = *r.song.samples[1];
    EXPECT_STREQ(s1.name, "None");
    EXPECT_EQ(s1.bits, 16);
    EXPECT_EQ(s1.framecode, 1);
    EXPECT_EQ(reinterpret_cast<const int16_t*>(s1.data)[0], -32768);
    EXPECT_EQ(s1.loopon, 0);  // start 0 and end 0
    EXPECT_EQ(s1.loopstart, 4u);
    EXPECT_EQ(s1.loopend, 4u);
    const p_s& s2 = *r.song.samples[2];
    EXPECT_EQ(s2.loopon, 1);  // a start above 0 turns the loop on whenever there is data
    EXPECT_LE(s2.loopend, s2.length);
}

TEST(MtmReader, ChannelsBeyondThePatternTableAreBounded) {
    const ModuleRead r = read(mtm_file({}, 40));
    EXPECT_EQ(r.song.mod->nbtrack, 32);
}

TEST(MtmReader, OtherFilesAreRefusedAndShortOnesKeptInBounds) {
    auto bytes = mtm_file({{"s", std::vector<uint8_t>(100, 1)}});
    ModuleRead out;
    std::vector<uint8_t> junk(bytes);
    junk[0] = 'X';
    ByteReader j(junk);
    EXPECT_FALSE(read_mtm(j, out));
    for (size_t n = 66; n < bytes.size(); n += 3) {
        std::vector<uint8_t> part(bytes.begin(), bytes.begin() + static_cast<long>(n));
        ModuleRead cut;
        ByteReader r(part);
        ASSERT_TRUE(read_mtm(r, cut)) << n;
        EXPECT_TRUE(cut.truncated) << n;
    }
}

}  // namespace
}  // namespace ondrel

namespace ondrel {
namespace {

// Found by fuzzing: headers claiming far more than the file holds made the reader zero
// megabytes per file. What is allocated follows the file, not the claim.
TEST(MtmReader, ClaimedSizesAreBoundedByTheFile) {
    Bytes b;
    b.text("MTM", 3).u8(0x10).text("liar", 20).le16(65535).u8(0).u8(0).le16(0).u8(1).u8(0).u8(64).u8(4);
    b.zeros(32);
    b.text("big", 22).le32(0xFFFFFFF0u).le32(0).le32(0).u8(0).u8(64).u8(0);
    b.zeros(128 + 10);
    ModuleRead out;
    ByteReader r(b.v);
    ASSERT_TRUE(read_mtm(r, out));
    EXPECT_TRUE(out.truncated);
    ASSERT_NE(out.song.samples[0], nullptr);
    EXPECT_EQ(out.song.samples[0]->length, 0u);
    ASSERT_NE(out.song.patterns[0], nullptr);
    EXPECT_TRUE(out.song.patterns[0]->col[0][0].empty());
}

}  // namespace
}  // namespace ondrel
