// The newer little-endian chunk layout, built byte by byte.
#include <gtest/gtest.h>

#include "import/module_reader.h"
#include "support/chunk_builder.h"

namespace ondrel {
namespace {

using test::Bytes;
using test::ChunkFile;

// An "o.t." body; version 1 adds the extended block. Values follow a pattern per field
// so that a field read into the wrong table shows.
Bytes song_block(int version, std::initializer_list<int> sequence) {
    Bytes b;
    b.le16(version).le16(1).le16(80).le16(4).le32(500000);
    b.le16(static_cast<int>(sequence.size())).le16(1);
    for (int p : sequence) b.u8(p);
    b.text("New Song", 64);
    for (int t = 0; t < 64; ++t) b.le16(100 + t);         // trackpan and trackpan2
    for (int t = 0; t < 64; ++t) b.le16(t);               // trackc
    for (int t = 0; t < 64; ++t) b.le16(t);               // trackvol
    for (int t = 0; t < 64; ++t) b.le16(t == 3 ? 7 : 0);  // tracke
    if (version < 1) return b;
    for (int t = 0; t < 64; ++t) b.le16(200 + t);    // trackpan2
    for (int t = 0; t < 64; ++t) b.le16(t % 5 + 1);  // nbvoice
    for (int i = 0; i < 256; ++i) b.u8(i);           // trackblock
    for (int t = 0; t < 64; ++t) b.le16(t % 16);     // trackword1
    for (int t = 0; t < 64; ++t) b.le16(300 + t);    // trackd
    for (int t = 0; t < 64; ++t) b.le16(400 + t);    // trackf
    for (int i = 0; i < 128 * 8; ++i) b.le32(static_cast<uint32_t>(i)).le32(static_cast<uint32_t>(-i));
    for (int s = 0; s < 100; ++s) b.u8(s & 1);                            // efxflag
    for (int s = 0; s < 100; ++s) b.u8(0xEE);                             // overwritten by block B
    for (int s = 0; s < 100; ++s) b.le16(s);                              // efxa
    for (int s = 0; s < 100; ++s) b.le16(255 - s);                        // efxb
    for (int s = 0; s < 100; ++s) b.le16(-s);                             // efxc
    for (int s = 0; s < 100; ++s) b.le32(static_cast<uint32_t>(s * 10));  // efxval
    return b;
}

ModuleRead read(const std::vector<uint8_t>& bytes) {
    ModuleRead out;
    ByteReader r(bytes);
    EXPECT_TRUE(read_otm(r, out)) << out.error;
    return out;
}

TEST(OtmNewLayout, Version0SongBlock) {
    ChunkFile f;
    f.chunk("o.t.", song_block(0, {3, 1}));
    const ModuleRead r = read(f.bytes);
    const TMOD& m = *r.song.mod;
    EXPECT_EQ(m.tempo, 500000u);
    EXPECT_EQ(m.nbpos, 2);
    EXPECT_EQ(m.sequence[0], 3);
    EXPECT_STREQ(m.name, "New Song");
    EXPECT_EQ(m.trackpan2[5], 105);  // version 0 copies the pans into both tables
    EXPECT_EQ(m.tracke[3], 7);
    EXPECT_EQ(m.nbvoice[2], 1);  // not in version 0: the preset stays
}

TEST(OtmNewLayout, Version1ExtendedBlock) {
    ChunkFile f;
    f.chunk("o.t.", song_block(1, {0}));
    const ModuleRead r = read(f.bytes);
    const TMOD& m = *r.song.mod;
    EXPECT_EQ(m.trackpan[5], 105);
    EXPECT_EQ(m.trackpan2[5], 205);
    EXPECT_EQ(m.nbvoice[2], 3);
    EXPECT_EQ(m.trackblock[255], 255);
    EXPECT_EQ(m.trackword1[17], 1);
    EXPECT_EQ(m.trackd[1], 301);
    EXPECT_EQ(m.trackf[2], 402);
    EXPECT_EQ(m.patmark[1][2].position, 10);
    EXPECT_EQ(m.patmark[1][2].value, -10);
    EXPECT_EQ(m.efxflag[3], 1);
    EXPECT_EQ(m.efxa[99], 99);
    EXPECT_EQ(m.efxb[0], 255);
    EXPECT_EQ(m.efxc[4], -4);
    EXPECT_EQ(m.efxval[7], 70u);
}

TEST(OtmNewLayout, ReversedIdIsAcceptedAndLengthsTurnLittleEndian) {
    ChunkFile f;
    f.chunk("O.T.", test::old_header(3, 0, "big first"));
    f.chunk(".t.o", song_block(0, {0}));
    Bytes inst;
    inst.le16(0).text("after", 32).le32(2).zeros(12).le16(8).le16(72).zeros(2).zeros(10);
    inst.zeros(50).le32(0).bytes({1, 2});
    f.chunk("inst", inst);
    const ModuleRead r = read(f.bytes);
    EXPECT_STREQ(r.song.mod->name, "New Song");
    ASSERT_NE(r.song.samples[0], nullptr);
    EXPECT_STREQ(r.song.samples[0]->name, "after");
    EXPECT_EQ(r.song.samples[0]->data[1], 2);
}

TEST(OtmNewLayout, SampleChunk) {
    Bytes b;
    b.le16(4).text("lead", 32).le32(8).le32(2).le32(6).le32(44100);
    b.le16(16).le16(60).u8(1).u8(1).le16(1).le16(100).le16(50).le16(7).le16(0x11);
    for (int k = 0; k < 5; ++k)
        for (int j = 0; j < 5; ++j) b.le16(k * 16 + j);  // envelope after envelope
    b.le32(777);
    b.bytes({1, 0, 2, 0, 3, 0, 4, 0});
    ChunkFile f;
    f.chunk("o.t.", song_block(0, {0}));
    f.chunk("inst", b);
    const ModuleRead r = read(f.bytes);
    const p_s* s = r.song.samples[4].get();
    ASSERT_NE(s, nullptr);
    EXPECT_STREQ(s->name, "lead");
    EXPECT_EQ(s->length, 8u);
    EXPECT_EQ(s->loopstart, 2u);
    EXPECT_EQ(s->loopend, 6u);
    EXPECT_EQ(s->rate, 44100u);
    EXPECT_EQ(s->bits, 16);
    EXPECT_EQ(s->refnote, 60);
    EXPECT_EQ(s->stereo, 1);
    EXPECT_EQ(s->flag2, 1);
    EXPECT_EQ(s->framecode, 2);
    EXPECT_EQ(s->loopon, 1);
    EXPECT_EQ(s->volume, 100);
    EXPECT_EQ(s->level, 50);
    EXPECT_EQ(s->finetune, 7);
    EXPECT_EQ(s->flagword, 0x11);
    EXPECT_EQ(s->env(2, 3), 2 * 16 + 3);  // stored point-major
    EXPECT_EQ(s->envelope[3 * 5 + 2], 2 * 16 + 3);
    EXPECT_EQ(s->setting, 777u);
    EXPECT_EQ(s->data[4], 3);
    EXPECT_EQ(s->data[8], 0);  // slack
}

TEST(OtmNewLayout, PackedPatternWithJumpsAndEmptyTracks) {
    Bytes b;
    b.le16(3).le16(140).le16(7);
    // Track 0: jump to row 5 (note + command), next row (instrument, volume, parameter),
    // then a jump to the last row the 7-bit jump reaches and empty rows to the end.
    Bytes t0;
    t0.bytes({0x80 | 5, 1 | 8, 49, 12});
    t0.bytes({2 | 4 | 16, 3, 64, 0x20});
    t0.bytes({0x80 | 127, 0});
    for (int r = 128; r < 140; ++r) t0.u8(0);
    b.le16(static_cast<int>(t0.size())).raw(t0.v);
    b.le16(65535);  // track 1 empty
    Bytes t2;
    t2.bytes({8 | 16, 33, 12, 8 | 16, 33, 5, 8 | 16, 33, 12});
    t2.bytes({0x80 | 127, 0});
    for (int r = 128; r < 140; ++r) t2.u8(0);
    b.le16(static_cast<int>(t2.size())).raw(t2.v);
    ChunkFile f;
    f.chunk("o.t.", song_block(0, {7}));
    f.chunk("patt", b);
    const ModuleRead r = read(f.bytes);
    EXPECT_EQ(r.song.mod->nbtrack, 3);
    EXPECT_EQ(r.song.mod->rows[7], 140);
    const Pattern* p = r.song.patterns[7].get();
    ASSERT_NE(p, nullptr);
    EXPECT_EQ(p->allocated_tracks(), 3);
    EXPECT_TRUE(p->col[0][4].empty());
    EXPECT_EQ(p->col[0][5].note, 49);
    EXPECT_EQ(p->col[0][5].command, 12);
    EXPECT_EQ(p->col[0][5].instrument, 0);
    EXPECT_EQ(p->col[0][6].instrument, 3);
    EXPECT_EQ(p->col[0][6].volume, 64);
    EXPECT_EQ(p->col[0][6].parameter, 0x20);
    EXPECT_TRUE(p->col[1][0].empty());
    EXPECT_EQ(p->col[2][2].parameter, 12);
    // Effect buffers named by command 33, then by the tracks' routing (track 3: 7).
    EXPECT_EQ(r.effects.numbered_slots, (std::vector<int>{12, 5, 12, 7}));
}

TEST(OtmNewLayout, ShortEffectChunkSetsOnlyEchoUnit0) {
    Bytes b;
    b.le16(0).le32(22050).le32(100).le32(1);
    ChunkFile f;
    f.chunk("o.t.", song_block(0, {0}));
    f.chunk("efx.", b);
    const ModuleRead r = read(f.bytes);
    EXPECT_EQ(r.song.mod->echolen[0], 22050u);
    EXPECT_EQ(r.song.mod->echolevel[0], 100u);
    EXPECT_EQ(r.song.mod->echoon[0], 1);
    EXPECT_EQ(r.song.mod->echolen[1], 44100u);
    EXPECT_EQ(r.effects.echo_units_set, 1u);
    EXPECT_FALSE(r.effects.has_added_types);
}

TEST(OtmNewLayout, FullEffectChunkSetsAddedSlotsAndEchoUnits) {
    Bytes b;
    b.le16(0).le32(1000).le32(50).le32(0).le16(0);
    for (int s = 0; s < 100; ++s) b.le16(s == 3 ? 3 : s == 21 ? 11 : s == 22 ? 16 : s == 23 ? 999 : 0);
    b.le16(3);
    b.le32(2000).le32(60).le32(1);
    b.le32(3000).le32(70).le32(0);
    ChunkFile f;
    f.chunk("o.t.", song_block(0, {0}));
    f.chunk("efx.", b);
    const ModuleRead r = read(f.bytes);
    const TMOD& m = *r.song.mod;
    EXPECT_EQ(m.echolen[1], 2000u);
    EXPECT_EQ(m.echoon[1], 1);
    EXPECT_EQ(m.echolevel[2], 70u);
    EXPECT_EQ(m.echolen[3], 44100u);
    EXPECT_EQ(r.effects.echo_units_set, 7u);
    ASSERT_TRUE(r.effects.has_added_types);
    EXPECT_EQ(r.effects.added_types[3], 0);  // fixed slots are not taken from the file
    EXPECT_EQ(r.effects.added_types[21], 11);
    EXPECT_EQ(r.effects.added_types[22], 16);
    EXPECT_EQ(r.effects.added_types[23], 0);  // no such unit
}

TEST(OtmNewLayout, UnknownChunkEndsTheReadingAndKeepsWhatWasRead) {
    Bytes inst;
    inst.le16(0).text("late", 32).le32(0).zeros(12).le16(8).le16(72).zeros(2).zeros(10).zeros(50).le32(0);
    ChunkFile f;
    f.chunk("o.t.", song_block(0, {0}));
    f.chunk("ABCD", Bytes().zeros(4));
    f.chunk("inst", inst);
    const ModuleRead r = read(f.bytes);
    EXPECT_STREQ(r.song.mod->name, "New Song");
    EXPECT_EQ(r.song.samples[0], nullptr);
}

TEST(OtmNewLayout, IgnoredChunksArePassedOver) {
    Bytes inst;
    inst.le16(1).text("kept", 32).le32(0).zeros(12).le16(8).le16(72).zeros(2).zeros(10).zeros(50).le32(0);
    ChunkFile f;
    f.chunk("o.t.", song_block(0, {0}));
    for (const char* id : {"TEXT", "VERS", "TRKN", "PATN", "IENV", "OENV", "PEFX"})
        f.chunk(id, Bytes().zeros(3));
    f.chunk("inst", inst);
    const ModuleRead r = read(f.bytes);
    ASSERT_NE(r.song.samples[1], nullptr);
    EXPECT_STREQ(r.song.samples[1]->name, "kept");
}

TEST(OtmNewLayout, AFileWithNoKnownChunkIsRefused) {
    const std::vector<uint8_t> junk = {'R', 'I', 'F', 'F', 0, 0, 0, 4, 'W', 'A', 'V', 'E'};
    ModuleRead out;
    ByteReader r(junk);
    EXPECT_FALSE(read_otm(r, out));
    EXPECT_FALSE(out.error.empty());
}

TEST(OtmNewLayout, HostileSizesAreBounded) {
    Bytes inst;
    inst.le16(2).text("huge", 32).le32(0xFFFFFFF0u).le32(5).le32(0xFFFFFFFFu).le32(8000);
    inst.le16(16).le16(900).zeros(2).le16(1).zeros(8).zeros(50).le32(0);
    inst.bytes({9, 9, 9, 9});
    Bytes patt;
    patt.le16(500).le16(60000).le16(200);  // pattern number out of range: ignored
    Bytes patt2;
    patt2.le16(90).le16(3000).le16(1);  // 90 tracks, 3000 rows, no data
    ChunkFile f;
    f.chunk("o.t.", song_block(0, {0}));
    f.chunk("inst", inst);
    f.chunk("patt", patt);
    f.chunk("patt", patt2);
    const ModuleRead r = read(f.bytes);
    const p_s* s = r.song.samples[2].get();
    ASSERT_NE(s, nullptr);
    EXPECT_EQ(s->length, 4u);  // only the bytes that are really there
    EXPECT_LE(s->loopend, s->length);
    EXPECT_LE(s->loopstart, s->loopend);
    EXPECT_EQ(s->refnote, 127);
    EXPECT_TRUE(r.truncated);
    EXPECT_EQ(r.song.mod->nbtrack, 64);
    EXPECT_EQ(r.song.mod->rows[1], kMaxRows);
    ASSERT_NE(r.song.patterns[1], nullptr);
    EXPECT_EQ(r.song.patterns[1]->allocated_tracks(), 64);
}

}  // namespace
}  // namespace ondrel
