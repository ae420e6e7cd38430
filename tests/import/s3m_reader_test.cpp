// S3M files built byte by byte.
#include <gtest/gtest.h>

#include "import/module_reader.h"
#include "support/chunk_builder.h"

namespace ondrel {
namespace {

using test::Bytes;

struct S3mInstrument {
    int type = 1;
    std::string name;
    std::vector<uint8_t> data;  // as stored in the file
    uint32_t frames = 0;
    uint32_t loop_start = 0, loop_end = 0;
    int volume = 64;
    int flags = 0;
    uint32_t rate = 8363;
};

class S3mFile {
public:
    std::vector<int> orders = {0};
    int channels = 4;
    int speed = 6, tempo = 125;
    int ffi = 2;
    std::vector<std::vector<uint8_t>> patterns;  // packed rows, without the length word
    std::vector<S3mInstrument> instruments;

    std::vector<uint8_t> bytes() const {
        Bytes b;
        b.text("S3M Song", 28).u8(0x1a).u8(16).zeros(2);
        b.le16(static_cast<int>(orders.size())).le16(static_cast<int>(instruments.size()));
        b.le16(static_cast<int>(patterns.size())).le16(0).le16(0x1320).le16(ffi);
        b.text("SCRM", 4).u8(64).u8(speed).u8(tempo).u8(48).zeros(2 + 8 + 2);
        for (int c = 0; c < 32; ++c) b.u8(c < channels ? c : 255);
        for (int o : orders) b.u8(o);
        const size_t pointers = b.size();
        b.zeros(2 * (instruments.size() + patterns.size()));
        auto align = [&] {
            while (b.size() % 16) b.u8(0);
            return static_cast<int>(b.size() / 16);
        };
        std::vector<int> ins_at, pat_at;
        for (size_t i = 0; i < instruments.size(); ++i) {
            ins_at.push_back(align());
            b.zeros(80);
        }
        for (const auto& p : patterns) {
            pat_at.push_back(align());
            b.le16(static_cast<int>(p.size() + 2)).raw(p);
        }
        for (size_t i = 0; i < instruments.size(); ++i) {
            const S3mInstrument& s = instruments[i];
            const int data_at = align();
            b.raw(s.data);
            Bytes h;
            h.u8(s.type).text("file.smp", 12).u8(data_at >> 16).le16(data_at & 0xffff);
            h.le32(s.frames).le32(s.loop_start).le32(s.loop_end).u8(s.volume).u8(0).u8(0).u8(s.flags);
            h.le32(s.rate).zeros(12).text(s.name, 28).text("SCRS", 4);
            std::copy(h.v.begin(), h.v.end(), b.v.begin() + 16 * static_cast<size_t>(ins_at[i]));
        }
        for (size_t i = 0; i < instruments.size(); ++i) {
            b.v[pointers + 2 * i] = static_cast<uint8_t>(ins_at[i]);
            b.v[pointers + 2 * i + 1] = static_cast<uint8_t>(ins_at[i] >> 8);
        }
        for (size_t i = 0; i < patterns.size(); ++i) {
            const size_t at = pointers + 2 * (instruments.size() + i);
            b.v[at] = static_cast<uint8_t>(pat_at[i]);
            b.v[at + 1] = static_cast<uint8_t>(pat_at[i] >> 8);
        }
        return b.v;
    }
};

// A pattern whose row 0 holds the given bytes; the other 63 rows are empty.
std::vector<uint8_t> row0(std::vector<uint8_t> bytes) {
    bytes.push_back(0);
    bytes.insert(bytes.end(), 63, 0);
    return bytes;
}

ModuleRead read(const std::vector<uint8_t>& bytes) {
    ModuleRead out;
    ByteReader r(bytes);
    EXPECT_TRUE(read_s3m(r, out)) << out.error;
    return out;
}

TEST(S3mReader, HeaderAndOrderList) {
    S3mFile f;
    f.orders = {0, 254, 1, 255, 2};
    f.channels = 6;
    f.speed = 3;
    f.tempo = 150;
    f.patterns = {row0({}), row0({}), row0({})};
    const ModuleRead r = read(f.bytes());
    const TMOD& m = *r.song.mod;
    EXPECT_STREQ(m.name, "S3M Song");
    EXPECT_EQ(m.format, 2);
    EXPECT_EQ(m.nbpos, 2);
    EXPECT_EQ(m.sequence[0], 0);
    EXPECT_EQ(m.sequence[1], 1);
    EXPECT_EQ(m.nbtrack, 6);
    EXPECT_EQ(m.speed, 3);
    EXPECT_EQ(m.tempo, 400000u);
    EXPECT_NE(r.song.patterns[1], nullptr);
    EXPECT_EQ(r.song.patterns[2], nullptr);  // named by no position: not loaded
}

TEST(S3mReader, NotesInstrumentsAndVolumes) {
    S3mFile f;
    f.patterns = {row0({32 | 64 | 0, 0x40, 3, 0,                // channel 0: C-4, instrument 3, volume 0
                        32 | 64 | 1, 254, 7, 64,                // channel 1: note cut (lost), instrument 7
                        32 | 2, 0x4B, 1,                        // channel 2: B-4
                        32 | 64 | 128 | 20, 0x50, 9, 30, 1, 3,  // channel 20 of 4: skipped
                        64 | 3, 10})};                          // channel 3: volume 10
    const ModuleRead r = read(f.bytes());
    const Pattern& p = *r.song.patterns[0];
    EXPECT_EQ(p.col[0][0].note, 48);
    EXPECT_EQ(p.col[0][0].instrument, 3);
    EXPECT_EQ(p.col[0][0].volume, 1);
    EXPECT_EQ(p.col[1][0].note, 0);
    EXPECT_EQ(p.col[1][0].instrument, 7);
    EXPECT_EQ(p.col[1][0].volume, 129);
    EXPECT_EQ(p.col[2][0].note, 59);
    EXPECT_EQ(p.col[3][0].volume, 21);
    EXPECT_TRUE(p.col[0][1].empty());
}

TEST(S3mReader, CommandConversion) {
    struct Case {
        int number, info, command, parameter;
    };
    const Case cases[] = {
        {1, 5, 15, 5},        {20, 140, 15, 140},  {2, 3, 11, 3},      {3, 0x12, 13, 0x12},
        {4, 0x32, 10, 0x32},  {4, 0xF3, 14, 179},  {4, 0x2F, 14, 162}, {5, 0x20, 2, 0x20},
        {5, 0xF4, 14, 36},    {6, 0x11, 1, 0x11},  {6, 0xF2, 14, 18},  {7, 0x08, 3, 8},
        {8, 0x44, 4, 0x44},   {10, 0x37, 0, 0x37}, {11, 0x02, 6, 2},   {12, 0x20, 5, 0x20},
        {15, 0x10, 9, 0x10},  {19, 0x23, 14, 83},  {19, 0xB2, 14, 98}, {19, 0x84, 8, 64},
        {19, 0xC3, 14, 0xC3}, {22, 40, 16, 40},
    };
    for (const Case& c : cases) {
        S3mFile f;
        f.patterns = {row0({128 | 0, static_cast<uint8_t>(c.number), static_cast<uint8_t>(c.info)})};
        const TNOTE n = read(f.bytes()).song.patterns[0]->col[0][0];
        EXPECT_EQ(n.command, c.command) << "command " << c.number << " info " << c.info;
        EXPECT_EQ(n.parameter, c.parameter) << "command " << c.number << " info " << c.info;
    }
    for (const Case& dropped :
         {Case{5, 0xE4, 0, 0}, Case{6, 0xE1, 0, 0}, Case{9, 3, 0, 0}, Case{23, 3, 0, 0}}) {
        S3mFile f;
        f.patterns = {row0(
            {128 | 0, static_cast<uint8_t>(dropped.number), static_cast<uint8_t>(dropped.info), 64 | 1, 5})};
        const ModuleRead read_p = read(f.bytes());
        const Pattern& p = *read_p.song.patterns[0];
        EXPECT_TRUE(p.col[0][0].empty()) << dropped.number;
        EXPECT_EQ(p.col[1][0].volume, 11) << dropped.number;  // the row goes on after the info byte
    }
}

TEST(S3mReader, ZeroInfoTakesTheTracksRememberedEffect) {
    S3mFile f;
    std::vector<uint8_t> rows = {128 | 0, 4, 0x05, 128 | 1, 6, 0x03, 0,  // row 0
                                 128 | 0, 4, 0x00, 128 | 1, 6, 0x00, 0,  // row 1: both remembered
                                 128 | 0, 7, 0x00, 0};                   // row 2: G takes D's
    rows.insert(rows.end(), 61, 0);
    f.patterns = {rows};
    const ModuleRead read_p = read(f.bytes());
    const Pattern& p = *read_p.song.patterns[0];
    EXPECT_EQ(p.col[0][1].command, 10);
    EXPECT_EQ(p.col[0][1].parameter, 5);
    EXPECT_EQ(p.col[1][1].command, 1);
    EXPECT_EQ(p.col[1][1].parameter, 3);
    EXPECT_EQ(p.col[0][2].command, 10);
    EXPECT_EQ(p.col[0][2].parameter, 5);
}

TEST(S3mReader, S6xAndSAxLeaveTheirInfoAsTheNextChannelByte) {
    S3mFile f;
    // S62: command 0, and 0x62 is then read as a channel byte: channel 2 with a note,
    // an instrument and a volume.
    f.patterns = {row0({128 | 0, 19, 0x62, 0x40, 5, 9})};
    const ModuleRead read_p = read(f.bytes());
    const Pattern& p = *read_p.song.patterns[0];
    EXPECT_EQ(p.col[0][0].command, 0);
    EXPECT_EQ(p.col[0][0].parameter, 0);
    EXPECT_EQ(p.col[2][0].note, 48);
    EXPECT_EQ(p.col[2][0].instrument, 5);
    EXPECT_EQ(p.col[2][0].volume, 19);
    // SA1: 0xA1 is channel 1 with a note, an instrument, a command and its info.
    f.patterns = {row0({128 | 0, 19, 0xA1, 0x40, 2, 1, 4})};
    const ModuleRead read_q = read(f.bytes());
    const Pattern& q = *read_q.song.patterns[0];
    EXPECT_EQ(q.col[1][0].instrument, 2);
    EXPECT_EQ(q.col[1][0].command, 15);
    EXPECT_EQ(q.col[1][0].parameter, 4);
}

TEST(S3mReader, SamplesAreMadeSignedInterleavedAndMeasuredInBytes) {
    S3mFile f;
    f.patterns = {row0({})};
    S3mInstrument eight;
    eight.name = "eight";
    eight.data = {0x80, 0x81, 0x7f, 0x00};
    eight.frames = 4;
    eight.flags = 1;
    eight.loop_start = 0;
    eight.loop_end = 4;
    eight.volume = 32;
    eight.rate = 0x1AC44;  // only the low 16 bits count
    S3mInstrument stereo16;
    stereo16.data = {0x00, 0x80, 0x01, 0x80, 0xff, 0x7f, 0x00, 0x00};  // left 2 frames, then right
    stereo16.frames = 2;
    stereo16.flags = 2 | 4;
    S3mInstrument short_loop;
    short_loop.data = std::vector<uint8_t>(20, 0x80);
    short_loop.frames = 20;
    short_loop.flags = 1;
    short_loop.loop_start = 10;
    short_loop.loop_end = 13;
    S3mInstrument adlib;
    adlib.type = 2;
    adlib.frames = 100;
    f.instruments = {eight, stereo16, short_loop, adlib};
    const ModuleRead r = read(f.bytes());
    const p_s& a = *r.song.samples[0];
    EXPECT_STREQ(a.name, "eight");
    EXPECT_EQ(a.length, 4u);
    EXPECT_EQ(static_cast<int8_t>(a.data[0]), 0);
    EXPECT_EQ(static_cast<int8_t>(a.data[1]), 1);
    EXPECT_EQ(static_cast<int8_t>(a.data[2]), -1);
    EXPECT_EQ(static_cast<int8_t>(a.data[3]), -128);
    EXPECT_EQ(a.loopon, 1);
    EXPECT_EQ(a.loopend, 4u);
    EXPECT_EQ(a.volume, 64);
    EXPECT_EQ(a.rate, 0xAC44u);
    const p_s& b = *r.song.samples[1];
    EXPECT_STREQ(b.name, "None");
    EXPECT_EQ(b.length, 8u);
    EXPECT_EQ(b.framecode, 2);
    const int16_t* w = reinterpret_cast<const int16_t*>(b.data);
    EXPECT_EQ(w[0], 0);   // left 0x8000 unsigned
    EXPECT_EQ(w[1], -1);  // right 0x7fff unsigned
    EXPECT_EQ(w[2], 1);
    EXPECT_EQ(w[3], -32768);
    EXPECT_EQ(r.song.samples[2]->loopon, 0);  // shorter than 4
    EXPECT_EQ(r.song.samples[3]->length, 0u);
}

// Found by fuzzing: a sample header claiming gigabytes made the reader zero them first.
TEST(S3mReader, ClaimedSampleSizesAreBoundedByTheFile) {
    S3mFile f;
    f.patterns = {row0({})};
    S3mInstrument s;
    s.data = {1, 2, 3, 4, 5, 6};
    s.frames = 0x7FFFFFFF;
    s.flags = 4;  // 16-bit: twice the bytes claimed
    f.instruments = {s};
    const ModuleRead r = read(f.bytes());
    EXPECT_TRUE(r.truncated);
    EXPECT_EQ(r.song.samples[0]->length, 6u);
}

TEST(S3mReader, FilesWithoutTheMarkAreRefused) {
    auto bytes = S3mFile{}.bytes();
    bytes[44] = 'X';
    ModuleRead out;
    ByteReader r(bytes);
    EXPECT_FALSE(read_s3m(r, out));
    EXPECT_NE(out.error.find("SCRM"), std::string::npos);
}

TEST(S3mReader, TruncationAnywhereStaysInBounds) {
    S3mFile f;
    f.patterns = {row0({32 | 64 | 128 | 0, 0x40, 1, 30, 4, 0x12})};
    S3mInstrument s;
    s.data = std::vector<uint8_t>(300, 0x90);
    s.frames = 300;
    f.instruments = {s};
    const auto full = f.bytes();
    for (size_t n = 96; n < full.size(); ++n) {
        std::vector<uint8_t> part(full.begin(), full.begin() + static_cast<long>(n));
        ModuleRead out;
        ByteReader r(part);
        ASSERT_TRUE(read_s3m(r, out)) << n;
        if (out.song.samples[0]) {
            EXPECT_LE(out.song.samples[0]->loopend, out.song.samples[0]->length);
        }
    }
}

}  // namespace
}  // namespace ondrel
