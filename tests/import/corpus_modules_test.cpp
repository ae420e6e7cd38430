// Real modules made by other people's trackers: what a listener would notice must come
// through, and damaged files must load or fail cleanly.
#include <gtest/gtest.h>

#include <filesystem>

#include "import/loader.h"

namespace ondrel {
namespace {

const std::filesystem::path kCorpus = "../shared/corpus";

struct Expected {
    const char* file;
    const char* title;
    int positions;
    int tracks;
    int sample;  // 1-based
    const char* sample_name;
    uint32_t sample_bytes;
};

class CorpusModule : public ::testing::TestWithParam<Expected> {};

TEST_P(CorpusModule, LoadsWithWhatAListenerNotices) {
    const Expected& e = GetParam();
    const auto path = kCorpus / e.file;
    if (!std::filesystem::exists(path)) GTEST_SKIP() << path << " is not here";
    SongBank bank;
    EffectSlots slots;
    const LoadResult r = load(path.string(), bank, slots);
    ASSERT_TRUE(r.ok) << r.error;
    EXPECT_FALSE(r.truncated);
    const TMOD& m = bank.current();
    EXPECT_STREQ(m.name, e.title);
    if (e.positions) {
        EXPECT_EQ(m.nbpos, e.positions);
    }
    EXPECT_EQ(m.nbtrack, e.tracks);
    const p_s* s = bank.song_sample(e.sample - 1);
    ASSERT_NE(s, nullptr);
    EXPECT_STREQ(s->name, e.sample_name);
    EXPECT_EQ(s->length, e.sample_bytes);
    for (int p = 0; p < m.nbpos; ++p)
        if (m.sequence[p] < kPatternsPerSong) {
            EXPECT_NE(bank.song_pattern(m.sequence[p]), nullptr) << p;
        }
}

INSTANTIATE_TEST_SUITE_P(
    Corpus, CorpusModule,
    ::testing::Values(
        Expected{"mod/sundance.mod", "Sundance ", 44, 4, 1, "   Purple Motion ", 15044},
        Expected{"mod/crystals.mod", " Crystals...        ", 11, 4, 1, "Dreambell", 9200},
        Expected{"mod/ode2ptk.mod", "Ode to Protracker", 18, 4, 1, "-<Asle/Lithium/ReDoX>-", 152},
        Expected{"s3m/inside_out.s3m", "Insideout", 27, 8, 1, "     Purple Motion", 12558},
        Expected{"s3m/stereo.s3m", "Stereo Samples", 0, 1, 2, "16bit", 512},
        Expected{"mtm/fall1.mtm", "- One Must Fall! 1 -", 12, 5, 1, "C.C.Catch/Renaissance!", 7869},
        Expected{"mtm/TEMPO.MTM", "Tempo Testing", 2, 4, 1, "PIZZA", 9400}));

TEST(CorpusDamaged, EveryFileLoadsOrFailsWithOneLineAndKeepsTheSong) {
    const auto dir = kCorpus / "malformed";
    if (!std::filesystem::exists(dir)) GTEST_SKIP() << dir << " is not here";
    int seen = 0;
    for (const auto& entry : std::filesystem::directory_iterator(dir)) {
        ++seen;
        SongBank bank;
        EffectSlots slots;
        set_text(bank.current().name, "before");
        const LoadResult r = load(entry.path().string(), bank, slots);
        if (!r.ok) {
            EXPECT_STREQ(bank.current().name, "before") << entry.path();
            EXPECT_EQ(r.error.find('\n'), std::string::npos);
            continue;
        }
        const TMOD& m = bank.current();
        EXPECT_GE(m.nbtrack, 1);
        EXPECT_LE(m.nbtrack, kTracks);
        for (int i = 0; i < kSamplesPerSong; ++i)
            if (const p_s* s = bank.song_sample(i)) {
                EXPECT_LE(s->loopend, s->length) << entry.path() << " sample " << i;
                EXPECT_LE(s->loopstart, s->length) << entry.path() << " sample " << i;
                if (s->loopon) {
                    EXPECT_LE(s->loopstart, s->loopend) << entry.path() << " sample " << i;
                }
                EXPECT_LE(s->length, kMaxSampleBytes);
            }
    }
    EXPECT_GT(seen, 0);
}

}  // namespace
}  // namespace ondrel
