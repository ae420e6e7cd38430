// What the readers decide that the JSON report does not show: the song fields it leaves
// out, the effect-slot facts a file carries, where a native file counts as cut, and the
// channel counts of the MOD signatures.
#include <gtest/gtest.h>

#include <algorithm>

#include "import/module_reader.h"
#include "support/temp_dir.h"

namespace ondrel {
namespace {

std::vector<uint8_t> format_case(const std::string& name) {
    return test::read_all("tests/import/cases/" + name);
}

ModuleRead read(ModuleReaderFn reader, const std::vector<uint8_t>& bytes) {
    ModuleRead out;
    ByteReader r(bytes);
    EXPECT_TRUE(reader(r, out)) << out.error;
    return out;
}

TEST(ReaderRules, NativeFieldsAndEffectFactsOutsideTheReport) {
    const ModuleRead r = read(read_otm, format_case("otm-new-layout.otm"));
    const TMOD& m = *r.song.mod;
    EXPECT_EQ(m.trackblock[255], 255);
    EXPECT_EQ(m.trackd[1], 301);
    EXPECT_EQ(m.trackf[2], 402);
    EXPECT_EQ(m.patmark[1][2].position, 10);
    EXPECT_EQ(m.patmark[1][2].value, -10);
    EXPECT_EQ(m.efxval[7], 70u);
    EXPECT_EQ(r.effects.echo_units_set, 7u);
    ASSERT_TRUE(r.effects.has_added_types);
    EXPECT_EQ(r.effects.added_types[3], 0);  // fixed slots are not taken from the file
    EXPECT_EQ(r.effects.added_types[21], 11);
    EXPECT_EQ(r.effects.added_types[22], 16);
    EXPECT_EQ(r.effects.added_types[23], 999);  // no such unit: kept all the same

    const ModuleRead short_chunk = read(read_otm, format_case("otm-mixed-layouts.otm"));
    EXPECT_EQ(short_chunk.effects.echo_units_set, 1u);
    EXPECT_FALSE(short_chunk.effects.has_added_types);
}

TEST(ReaderRules, ANativeFileCutAtAChunkEndIsWhole) {
    const std::vector<uint8_t> full = format_case("otm-old-layout.otm");  // big-endian chunk lengths
    std::vector<size_t> ends;
    for (size_t at = 0; at + 8 <= full.size(); ends.push_back(at))
        at += 8 + (size_t{full[at + 4]} << 24 | full[at + 5] << 16 | full[at + 6] << 8 | full[at + 7]);
    ASSERT_TRUE(!ends.empty() && ends.back() == full.size());
    for (size_t n = 8; n <= full.size(); ++n) {
        const std::vector<uint8_t> part(full.begin(), full.begin() + static_cast<long>(n));
        const bool at_end = std::find(ends.begin(), ends.end(), n) != ends.end();
        EXPECT_EQ(read(read_otm, part).truncated, !at_end) << n;
    }
}

TEST(ReaderRules, ModSignaturesGiveSamplesAndChannels) {
    struct Case {
        const char* signature;
        int channels, samples;
    };
    for (const Case& c : {Case{"M.K.", 4, 31}, Case{"M!K!", 4, 31}, Case{"6CHN", 6, 31}, Case{"OCTA", 8, 31},
                          Case{"12CH", 12, 31}, Case{"32CH", 32, 31}, Case{"33CH", 4, 15},
                          Case{"0CHN", 4, 15}, Case{"FLT8", 4, 15}}) {
        // A song of one position whose pattern has a note in the last channel of row 1.
        std::vector<uint8_t> file(1084 + 64 * 4 * static_cast<size_t>(c.channels), 0);
        file[950] = 1;
        std::copy(c.signature, c.signature + 4, file.begin() + 1080);
        file[1084 + 4 * c.channels + 4 * (c.channels - 1) + 1] = 113;
        const ModuleRead r = read(read_mod, file);
        EXPECT_EQ(r.song.mod->nbtrack, c.channels) << c.signature;
        EXPECT_EQ(r.song.samples[15] != nullptr, c.samples == 31) << c.signature;
        if (c.samples == 31) {
            EXPECT_EQ(r.song.patterns[0]->col[c.channels - 1][1].note, 71) << c.signature;
        }
    }
}

}  // namespace
}  // namespace ondrel
