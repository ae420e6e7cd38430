// MOD files built byte by byte.
#include <gtest/gtest.h>

#include "import/module_reader.h"
#include "support/chunk_builder.h"

namespace ondrel {
namespace {

using test::Bytes;

struct ModSample {
    std::string name;
    int words = 0;
    int finetune = 0;
    int volume = 64;
    int loop_start = 0;  // words
    int loop_words = 1;
};

// A MOD file: title, sample headers, positions, sequence, signature (when given),
// pattern bytes, then each sample's data (bytes i * 3 + 1).
std::vector<uint8_t> mod_file(const std::vector<ModSample>& samples, int samples_in_header,
                              const std::vector<int>& sequence, int positions, int repeat,
                              const std::string& signature, const std::vector<uint8_t>& patterns) {
    Bytes b;
    b.text("Title Of The Song!!!", 20);
    for (int i = 0; i < samples_in_header; ++i) {
        const ModSample s = i < static_cast<int>(samples.size()) ? samples[i] : ModSample{};
        b.text(s.name, 22).be16(s.words).u8(s.finetune).u8(s.volume).be16(s.loop_start).be16(s.loop_words);
    }
    b.u8(positions).u8(repeat);
    for (int i = 0; i < 128; ++i) b.u8(i < static_cast<int>(sequence.size()) ? sequence[i] : 0);
    if (!signature.empty()) b.text(signature, 4);
    b.raw(patterns);
    for (const auto& s : samples)
        for (int i = 0; i < 2 * s.words; ++i) b.u8(i * 3 + 1);
    return b.v;
}

std::vector<uint8_t> cell(int period, int instrument, int command, int parameter) {
    return {static_cast<uint8_t>((instrument & 0xf0) | (period >> 8)), static_cast<uint8_t>(period & 0xff),
            static_cast<uint8_t>((instrument & 0x0f) << 4 | command), static_cast<uint8_t>(parameter)};
}

ModuleRead read(const std::vector<uint8_t>& bytes) {
    ModuleRead out;
    ByteReader r(bytes);
    EXPECT_TRUE(read_mod(r, out)) << out.error;
    return out;
}

TEST(ModReader, ThirtyOneSamplesFourChannels) {
    std::vector<uint8_t> pat(1024, 0);
    const auto c = cell(428, 0x12, 0xC, 0x40);
    std::copy(c.begin(), c.end(), pat.begin() + 16 + 4);  // row 1, channel 1
    const auto bytes = mod_file({{"first", 4, 0x1F, 40, 0, 1}}, 31, {0}, 1, 0, "M.K.", pat);
    const ModuleRead r = read(bytes);
    const TMOD& m = *r.song.mod;
    EXPECT_STREQ(m.name, "Title Of The Song!!!");
    EXPECT_EQ(m.format, 1);
    EXPECT_EQ(m.nbtrack, 4);
    EXPECT_EQ(m.nbpos, 1);
    const TNOTE n = r.song.patterns[0]->col[1][1];
    EXPECT_EQ(n.note, 48);
    EXPECT_EQ(n.instrument, 0x12);
    EXPECT_EQ(n.command, 12);
    EXPECT_EQ(n.parameter, 0x40);
    EXPECT_EQ(n.volume, 0);
    const p_s* s = r.song.samples[0].get();
    ASSERT_NE(s, nullptr);
    EXPECT_STREQ(s->name, "first");
    EXPECT_EQ(s->length, 8u);
    EXPECT_EQ(s->rate, 8363u);
    EXPECT_EQ(s->refnote, 48);
    EXPECT_EQ(s->bits, 8);
    EXPECT_EQ(s->volume, 80);
    EXPECT_EQ(s->finetune, 15);
    EXPECT_EQ(s->data[2], 7);
    ASSERT_NE(r.song.samples[30], nullptr);  // every header makes a record
    EXPECT_STREQ(r.song.samples[30]->name, "None");
    EXPECT_EQ(r.song.samples[30]->data, nullptr);
    EXPECT_EQ(r.song.samples[31], nullptr);
}

TEST(ModReader, FifteenSampleFilesKeepTheirOffsets) {
    std::vector<uint8_t> pats(2 * 1024, 0);
    const auto c = cell(856, 2, 0, 0);
    std::copy(c.begin(), c.end(), pats.begin() + 1024);  // pattern 1, row 0, channel 0
    const auto bytes = mod_file({{"a", 2}, {"b", 1}}, 15, {1, 0}, 2, 1, "", pats);
    ASSERT_EQ(bytes.size(), 600u + 2048 + 6);
    const ModuleRead r = read(bytes);
    EXPECT_EQ(r.song.mod->sequence[0], 1);
    EXPECT_EQ(r.song.mod->repeat, 1);
    EXPECT_EQ(r.song.patterns[1]->col[0][0].note, 36);
    EXPECT_EQ(r.song.samples[1]->data[0], 1);  // sample data follows both patterns
    EXPECT_EQ(r.song.samples[0]->data[3], 10);
    EXPECT_EQ(r.song.samples[15], nullptr);
}

TEST(ModReader, ChannelCountsFromTheSignature) {
    struct Case {
        const char* sig;
        int channels;
        int samples;
    };
    for (const Case& c :
         {Case{"12CH", 12, 31}, Case{"6CHN", 6, 31}, Case{"OCTA", 8, 31}, Case{"32CH", 32, 31},
          Case{"M!K!", 4, 31}, Case{"FLT8", 4, 15}, Case{"33CH", 4, 15}, Case{"0CHN", 4, 15}}) {
        const int row = 4 * c.channels;
        std::vector<uint8_t> pat(64 * static_cast<size_t>(row), 0);
        const auto last = cell(113, 3, 0, 0);
        std::copy(last.begin(), last.end(), pat.begin() + row + 4 * (c.channels - 1));
        const ModuleRead r = read(mod_file({}, 31, {0}, 1, 0, c.sig, pat));
        EXPECT_EQ(r.song.mod->nbtrack, c.channels) << c.sig;
        EXPECT_EQ(r.song.samples[15] != nullptr, c.samples == 31) << c.sig;
        if (c.samples == 31) {
            EXPECT_EQ(r.song.patterns[0]->col[c.channels - 1][1].note, 71) << c.sig;
        }
    }
}

TEST(ModReader, PeriodsOutsideTheTableGiveNoNote) {
    std::vector<uint8_t> pat(1024, 0);
    const std::vector<std::vector<uint8_t>> cells = {cell(0, 5, 0, 0), cell(907, 1, 0, 0), cell(429, 1, 0, 0),
                                                     cell(808, 0, 0, 0)};
    for (size_t i = 0; i < cells.size(); ++i)
        std::copy(cells[i].begin(), cells[i].end(), pat.begin() + 4 * i);
    const ModuleRead r = read(mod_file({}, 31, {0}, 1, 0, "M.K.", pat));
    const Pattern& p = *r.song.patterns[0];
    EXPECT_EQ(p.col[0][0].note, 0);
    EXPECT_EQ(p.col[0][0].instrument, 5);
    EXPECT_EQ(p.col[1][0].note, 0);
    EXPECT_EQ(p.col[2][0].note, 0);
    EXPECT_EQ(p.col[3][0].note, 37);
}

TEST(ModReader, LoopRules) {
    const std::vector<ModSample> samples = {
        {"one word at 0", 50, 0, 64, 0, 1},   // no loop
        {"nothing", 50, 0, 64, 0, 0},         // end 0: no loop
        {"past the end", 50, 0, 64, 10, 60},  // runs over the whole sample
        {"inside", 50, 0, 64, 5, 10},         // bytes 10..30
        {"empty", 0, 0, 64, 0, 4},
    };
    const ModuleRead r = read(mod_file(samples, 31, {0}, 1, 0, "M.K.", std::vector<uint8_t>(1024, 0)));
    const auto& s = r.song.samples;
    EXPECT_EQ(s[0]->loopon, 0);
    EXPECT_EQ(s[1]->loopon, 0);
    EXPECT_EQ(s[1]->loopstart, 100u);
    EXPECT_EQ(s[1]->loopend, 100u);
    EXPECT_EQ(s[2]->loopon, 1);
    EXPECT_EQ(s[2]->loopstart, 0u);
    EXPECT_EQ(s[2]->loopend, 100u);
    EXPECT_EQ(s[3]->loopon, 1);
    EXPECT_EQ(s[3]->loopstart, 10u);
    EXPECT_EQ(s[3]->loopend, 30u);
    // Three bytes from the loop start repeat past its end for interpolation.
    EXPECT_EQ(s[3]->data[30], s[3]->data[10]);
    EXPECT_EQ(s[3]->data[32], s[3]->data[12]);
    EXPECT_EQ(s[2]->data[100], s[2]->data[0]);  // in the slack
    EXPECT_EQ(s[4]->loopon, 0);
}

TEST(ModReader, RepeatBeyondThePositionsBecomesZero) {
    EXPECT_EQ(read(mod_file({}, 31, {0, 0}, 2, 3, "M.K.", std::vector<uint8_t>(1024, 0))).song.mod->repeat,
              0);
    EXPECT_EQ(read(mod_file({}, 31, {0, 0}, 2, 2, "M.K.", std::vector<uint8_t>(1024, 0))).song.mod->repeat,
              2);
}

TEST(ModReader, EverySequenceByteCountsForThePatternsStored) {
    // Position 1 is past the song's length but names pattern 2: three patterns are
    // stored before the samples.
    std::vector<uint8_t> pats(3 * 1024, 0);
    const auto bytes = mod_file({{"s", 1}}, 31, {0, 2}, 1, 0, "M.K.", pats);
    const ModuleRead r = read(bytes);
    EXPECT_NE(r.song.patterns[2], nullptr);
    EXPECT_EQ(r.song.samples[0]->data[1], 4);
    EXPECT_FALSE(r.truncated);
}

TEST(ModReader, ShortFilesKeepWhatWasRead) {
    auto bytes = mod_file({{"s", 100}}, 31, {0}, 1, 0, "M.K.", std::vector<uint8_t>(1024, 0));
    bytes.resize(1084 + 1024 + 10);
    const ModuleRead r = read(bytes);
    EXPECT_TRUE(r.truncated);
    EXPECT_EQ(r.song.samples[0]->length, 200u);
    EXPECT_EQ(r.song.samples[0]->data[9], 28);
    EXPECT_EQ(r.song.samples[0]->data[10], 0);

    ModuleRead out;
    std::vector<uint8_t> tiny(599, 0);
    ByteReader tr(tiny);
    EXPECT_FALSE(read_mod(tr, out));
    EXPECT_FALSE(out.error.empty());
}

}  // namespace
}  // namespace ondrel
