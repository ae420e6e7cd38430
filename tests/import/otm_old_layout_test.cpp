// The older big-endian chunk layout, built byte by byte.
#include <gtest/gtest.h>

#include "import/module_reader.h"
#include "support/chunk_builder.h"

namespace ondrel {
namespace {

using test::Bytes;
using test::ChunkFile;
using test::OldSampleHeader;

ModuleRead read(const std::vector<uint8_t>& bytes) {
    ModuleRead out;
    ByteReader r(bytes);
    EXPECT_TRUE(read_otm(r, out)) << out.error;
    return out;
}

TEST(OtmOldLayout, HeaderAndSequence) {
    ChunkFile f;
    f.chunk("O.T.", test::old_header(3, 150, "Old Song"));
    f.chunk("S.Q.", test::old_sequence({2, 0, 1}, 1));
    const ModuleRead r = read(f.bytes);
    const TMOD& m = *r.song.mod;
    EXPECT_EQ(m.speed, 3);
    EXPECT_EQ(m.tempo, 400000u);
    EXPECT_STREQ(m.name, "Old Song");
    EXPECT_EQ(m.nbpos, 3);
    EXPECT_EQ(m.repeat, 1);
    EXPECT_EQ(m.sequence[0], 2);
    EXPECT_EQ(m.sequence[2], 1);
    EXPECT_FALSE(r.truncated);
}

TEST(OtmOldLayout, ZeroSpeedAndTempoKeepThePresets) {
    ModuleRead out;
    out.song.mod->speed = 9;  // the current song's values are replaced by the presets
    out.song.mod->tempo = 1000;
    ChunkFile f;
    f.chunk("O.T.", test::old_header(0, 0, ""));
    ByteReader r(f.bytes);
    ASSERT_TRUE(read_otm(r, out));
    EXPECT_EQ(out.song.mod->speed, 6);
    EXPECT_EQ(out.song.mod->tempo, 480000u);
}

std::vector<uint8_t> layout1_file(const std::string& tag) {
    ChunkFile f;
    f.chunk("PATT", test::old_pattern_format(2, tag));
    Bytes p;
    p.zeros(4).be16(2).be16(3);
    // Row 0: track 0 a full cell, track 1 empty; rows 1 and 2: track 1 a note only.
    p.bytes({0x25, (45 << 2) | 2, 0x3C, 0x40}).zeros(4);
    p.zeros(4).bytes({0x13, 0, 0, 0});
    p.zeros(4).bytes({0x01, 0, 0, 0});
    f.chunk("OAPT", p);
    return f.bytes;
}

TEST(OtmOldLayout, Layout1CellsAreUnpacked) {
    const ModuleRead r = read(layout1_file("2.04"));
    EXPECT_EQ(r.song.mod->nbtrack, 2);
    EXPECT_EQ(r.song.mod->rows[2], 3);
    const Pattern* p = r.song.patterns[2].get();
    ASSERT_NE(p, nullptr);
    EXPECT_EQ(p->allocated_tracks(), 2);
    const TNOTE c = p->col[0][0];
    EXPECT_EQ(c.note, 5 + 12 * 2 - 1);
    EXPECT_EQ(c.volume, 90);
    EXPECT_EQ(c.instrument, 2 * 16 + 3);
    EXPECT_EQ(c.command, 12);
    EXPECT_EQ(c.parameter, 0x40);
    EXPECT_TRUE(p->col[1][0].empty());
    EXPECT_EQ(p->col[1][1].note, 3 + 12 - 1);
    EXPECT_EQ(p->col[1][2].note, 0);  // note byte 1: low nibble 1, octave 0 gives 0
}

TEST(OtmOldLayout, UnknownPatternTagLoadsEmptyPatterns) {
    const ModuleRead r = read(layout1_file("2.03"));
    const Pattern* p = r.song.patterns[2].get();
    ASSERT_NE(p, nullptr);
    EXPECT_EQ(r.song.mod->rows[2], 3);
    for (int t = 0; t < 2; ++t)
        for (int row = 0; row < 3; ++row) EXPECT_TRUE(p->col[t][row].empty());
}

Bytes event(int note, int volume, int instrument, int command, int parameter, int delta) {
    Bytes b;
    b.bytes({note, volume, instrument, command, parameter, delta & 0xff});
    return b;
}

TEST(OtmOldLayout, Layout2PlacesEventsByTick) {
    ChunkFile f;
    f.chunk("O.T.", test::old_header(6, 125, ""));
    f.chunk("PATT", test::old_pattern_format(3, "2.05"));
    Bytes p;
    p.zeros(4).be16(9).be16(200).zeros(4);  // 200 ticks at speed 6: 33 rows
    Bytes t0;
    t0.raw(event(40, 10, 1, 0, 0, 6).v);     // tick 0, row 0
    t0.raw(event(41, 11, 2, 0, 0, 3).v);     // tick 6, row 1
    t0.raw(event(42, 12, 3, 0, 0, 3).v);     // tick 9: between rows, dropped
    t0.raw(event(43, 13, 4, 4, 0x21, 0).v);  // tick 12, row 2
    t0.raw(event(44, 14, 5, 0, 0, -6).v);    // tick 12 again: same row, dropped
    t0.raw(event(0x85, 1, 1, 1, 1, 12).v);   // note bit 7: skipped, tick still advances
    t0.raw(event(46, 16, 7, 0, 0, 0).v);     // tick 18, row 3
    t0.u8(0x77);                             // an odd trailing byte, then the pad
    p.be16(static_cast<int>(t0.size())).raw(t0.v).u8(0);
    p.be16(0);  // track 1: cleared
    Bytes t2;
    t2.raw(event(50, 0, 9, 0, 0, 0).v);
    p.be16(static_cast<int>(t2.size())).raw(t2.v);
    f.chunk("OAPT", p);

    const ModuleRead r = read(f.bytes);
    EXPECT_EQ(r.song.mod->rows[9], 33);
    const Pattern* pat = r.song.patterns[9].get();
    ASSERT_NE(pat, nullptr);
    EXPECT_EQ(pat->col[0][0].note, 40);
    EXPECT_EQ(pat->col[0][0].volume, 20);
    EXPECT_EQ(pat->col[0][1].note, 41);
    EXPECT_EQ(pat->col[0][2].note, 43);
    EXPECT_EQ(pat->col[0][2].command, 4);
    EXPECT_EQ(pat->col[0][2].parameter, 0x21);
    EXPECT_EQ(pat->col[0][3].note, 46);
    EXPECT_TRUE(pat->col[1][0].empty());
    EXPECT_EQ(pat->col[2][0].note, 50);
    EXPECT_EQ(pat->col[2][0].instrument, 9);
}

TEST(OtmOldLayout, Layout3StartsAtTheTrackStartTickAndStopsAtTheRowCount) {
    ChunkFile f;
    f.chunk("O.T.", test::old_header(4, 125, ""));
    f.chunk("PATT", test::old_pattern_format(1, "2.06"));
    Bytes p;
    p.zeros(4).be16(0).be16(8).zeros(4);  // 8 ticks at speed 4: 2 rows
    Bytes t;
    t.zeros(5).u8(4);                   // start tick 4
    t.raw(event(60, 0, 1, 0, 0, 4).v);  // row 1
    t.raw(event(61, 0, 1, 0, 0, 0).v);  // row 2: past the pattern, reading stops
    p.be16(static_cast<int>(t.size())).raw(t.v);
    f.chunk("OAPT", p);
    const ModuleRead r = read(f.bytes);
    const Pattern* pat = r.song.patterns[0].get();
    ASSERT_NE(pat, nullptr);
    EXPECT_EQ(r.song.mod->rows[0], 2);
    EXPECT_TRUE(pat->col[0][0].empty());
    EXPECT_EQ(pat->col[0][1].note, 60);
}

TEST(OtmOldLayout, SampleHeadersAreTakenInOrderByTheDataChunks) {
    OldSampleHeader a;
    a.length = 4;
    a.finetune = -3;
    a.volume = 32;
    a.looplen = 4;
    a.name = "word";
    a.format = 16;
    a.refnote = 60;
    a.rate = 22050;
    OldSampleHeader b;
    b.length = 12;
    b.loopstart = 10;
    b.looplen = 50;  // length - loopstart is 2: no loop, whatever the loop length says
    b.format = 0x0808;
    ChunkFile f;
    f.chunk("INST", test::old_instruments({a, b}, false));
    Bytes d0;
    d0.be16(0).bytes({0x12, 0x34, 0xAB, 0xCD});
    f.chunk("OAIT", d0);
    Bytes skipped;
    skipped.be16(300).zeros(8);
    f.chunk("OAIT", skipped);  // numbered 256 or more: passed over, no header used
    Bytes d1;
    d1.be16(1).zeros(12);
    f.chunk("OAIT", d1);
    Bytes extra;
    extra.be16(2).zeros(8);
    f.chunk("OAIT", extra);  // beyond the headers: passed over

    const ModuleRead r = read(f.bytes);
    const p_s* s0 = r.song.samples[0].get();
    ASSERT_NE(s0, nullptr);
    EXPECT_EQ(s0->length, 4u);
    EXPECT_EQ(s0->bits, 16);
    EXPECT_EQ(s0->framecode, 1);
    EXPECT_EQ(s0->data[0], 0x34);  // big-endian words swapped to native order
    EXPECT_EQ(s0->data[1], 0x12);
    EXPECT_EQ(s0->data[3], 0xAB);
    EXPECT_EQ(s0->volume, 64);
    EXPECT_EQ(s0->finetune, -3);
    EXPECT_EQ(s0->refnote, 60);
    EXPECT_EQ(s0->rate, 22050u);
    EXPECT_STREQ(s0->name, "word");
    EXPECT_EQ(s0->loopon, 1);
    EXPECT_EQ(s0->loopend, 4u);
    EXPECT_EQ(s0->level, 64);  // the rest of the record is reset

    const p_s* s1 = r.song.samples[1].get();
    ASSERT_NE(s1, nullptr);
    EXPECT_EQ(s1->stereo, 1);
    EXPECT_EQ(s1->bits, 8);
    EXPECT_EQ(s1->loopon, 0);
    EXPECT_EQ(s1->framecode, 1);
    EXPECT_EQ(r.song.samples[2], nullptr);
}

TEST(OtmOldLayout, LoopRuleUsesTheLoopStartNotTheLength) {
    OldSampleHeader h;
    h.length = 100;
    h.loopstart = 10;
    h.looplen = 2;  // a two-byte loop still loops: 100 - 10 > 3
    ChunkFile f;
    f.chunk("INST", test::old_instruments({h}, true));
    Bytes d;
    d.be16(5).zeros(100);
    f.chunk("OAIT", d);
    const ModuleRead r = read(f.bytes);
    const p_s* s = r.song.samples[5].get();
    ASSERT_NE(s, nullptr);
    EXPECT_EQ(s->loopon, 1);
    EXPECT_EQ(s->loopstart, 10u);
    EXPECT_EQ(s->loopend, 12u);
}

TEST(OtmOldLayout, SettingsChunkIsReadOnlyWhenLongEnough) {
    auto settings = [](size_t length) {
        Bytes b;
        b.zeros(86).be16(100).zeros(216 - 88);
        for (int t = 0; t < 32; ++t) b.be16(t + 1);
        b.zeros(length - b.size());
        return b;
    };
    ChunkFile small;
    small.chunk("SV19", settings(309));
    EXPECT_EQ(read(small.bytes).song.mod->globalvol, 64);

    ChunkFile big;
    big.chunk("SV19", settings(310));
    const ModuleRead r = read(big.bytes);
    EXPECT_EQ(r.song.mod->globalvol, 100);
    EXPECT_EQ(r.song.mod->trackpan[0], 2);
    EXPECT_EQ(r.song.mod->trackpan2[31], 64);
    EXPECT_EQ(r.song.mod->trackpan[32], 128);
}

}  // namespace
}  // namespace ondrel
