#include "song_fixture.h"

namespace ondrel {
namespace {

using Voices = test::SongFixture;

TEST_F(Voices, MonoTracksOwnTheirVoicesAndPolyTracksRotate) {
    make_song(4, {0});
    song().nbvoice[2] = 3;
    EXPECT_EQ(player.track_to_poly(1), 1);
    EXPECT_EQ(player.track_to_poly(1), 1);
    std::vector<int> seen;
    for (int i = 0; i < 6; ++i) seen.push_back(player.track_to_poly(2));
    EXPECT_EQ(seen, (std::vector<int>{2, 3, 4, 2, 3, 4}));
    EXPECT_EQ(player.track_to_poly(3), 5);
    EXPECT_EQ(player.polytotrack[3], 2);
    EXPECT_EQ(player.polytotrack[5], 3);
}

TEST_F(Voices, AutoTakesTheHighestFreeVoiceAboveTheReservedOnes) {
    make_song(3, {0});
    song().nbvoice[0] = 2;
    song().nbvoice[1] = 127;
    EXPECT_EQ(player.track_to_poly(1), 255);
    voice(255).active = 1;
    EXPECT_EQ(player.track_to_poly(1), 254);
    // Every voice above the reserved ones (2 + 1 + 1 = 4) busy: the track's own slot.
    for (int v = 5; v < kVoices; ++v) voice(v).active = 1;
    EXPECT_EQ(player.track_to_poly(1), 2);
    EXPECT_EQ(player.polytotrack[2], 1);
}

TEST_F(Voices, NotesOfAPolyTrackSoundTogether) {
    make_song(1, {0});
    song().nbvoice[0] = 2;
    add_sample(1);
    put(0, 0, 0, 48, 1);
    put(0, 1, 0, 52, 1);
    put(0, 2, 0, 55, 1);
    play();
    rows(2);
    EXPECT_EQ(voice(0).note, 48);
    EXPECT_EQ(voice(1).note, 52);
    EXPECT_EQ(voice(0).active + voice(1).active, 2);
    rows(1);
    EXPECT_EQ(voice(0).note, 55);  // the third note takes the first voice again
}

TEST_F(Voices, PeriodTableAndFinetune) {
    const auto& t = floatnote();
    EXPECT_EQ(t[0], 6848.0f);
    EXPECT_EQ(t[60], 214.0f);
    EXPECT_NEAR(t[12], 3424.0f, 0.01f);  // an octave halves the period
    EXPECT_NEAR(t[48], 428.0f, 0.01f);   // the MOD table's C-3
    for (int i = 1; i < 128; ++i) EXPECT_LT(t[i], t[i - 1]) << i;
    EXPECT_EQ(finetune_factor(0), 1.0f);
    EXPECT_EQ(finetune_factor(15), 1.0f);
    EXPECT_EQ(finetune_factor(-1), finetune_factor(15));
    // 1 to 7 sharpen by up to 7/8 semitone; 8 to 14 flatten by 7/8 down to 1/8.
    const float semitone = 1.059463094f;
    EXPECT_LT(finetune_factor(1), 1.0f);
    EXPECT_GT(finetune_factor(7), 1 / semitone);
    EXPECT_LT(finetune_factor(7), finetune_factor(1));
    EXPECT_GT(finetune_factor(8), finetune_factor(14));
    EXPECT_GT(finetune_factor(14), 1.0f);
    EXPECT_LT(finetune_factor(8), semitone);
}

class Envelopes : public test::SongFixture {
protected:
    SampleRef env = make_sample(0);
    void set(int kind, std::array<int, 5> x, std::array<int, 5> level) {
        for (int j = 0; j < 5; ++j) env->env(kind, j) = static_cast<uint16_t>(x[j] << 8 | level[j]);
    }
    float at(int kind, uint32_t position, unsigned long length) {
        voice(9).position = position;
        voice(9).count1 = position;
        return player.compute_adsr(kind, 9, length, env.get());
    }
};

TEST_F(Envelopes, SegmentsAreLaidOverTheSampleLength) {
    set(0, {0, 64, 128, 192, 255}, {0, 128, 64, 64, 32});
    set(1, {0, 64, 128, 192, 255}, {100, 100, 100, 100, 100});
    set(2, {0, 64, 128, 192, 255}, {200, 200, 200, 200, 200});
    set(3, {0, 64, 128, 192, 255}, {70, 70, 70, 70, 70});
    set(4, {0, 64, 128, 192, 255}, {128, 96, 64, 32, 0});
    struct Case {
        int kind;
        uint32_t position;
        unsigned long length;
        float want;
    };
    const Case cases[] = {
        {0, 0, 1000, 0.0f},
        {0, 100, 1000, 50 / 128.0f},  // x 25 on the rising first segment
        {0, 251, 1000, 1.0f},         // x 64: the start of the second segment
        {0, 500, 1000, 65 / 128.0f},  // x 127, between 128 at x 64 and 64 at x 128
        {0, 999, 1000, 33 / 128.0f},  // x 254: the last segment, not yet 0
        {0, 1000, 1000, 0.0f},        // x 255 = the last point: zero only at the very end
        {0, 5000, 1000, 0.0f},
        {1, 123, 0, 200.0f},         // send: the level doubled
        {2, 0, 0, 127.0f},           // pan, not above 127
        {3, 0, 0, 70.0f},            // pitch: the level itself
        {4, 100, 200, 65 / 128.0f},  // fade, on the mixer's counter: x = 100 x 255 / 200 = 127
    };
    for (const Case& c : cases)
        EXPECT_EQ(at(c.kind, c.position, c.length), c.want) << "kind " << c.kind << " at " << c.position;
    set(0, {0, 32, 64, 96, 128}, {128, 128, 128, 128, 128});  // an end point at the middle
    EXPECT_EQ(at(0, 499, 1000), 1.0f);
    EXPECT_EQ(at(0, 503, 1000), 0.0f);
    set(0, {0, 64, 128, 192, 255}, {0, 0, 0, 128, 128});  // kind 16 reads envelope 0 at x 192
    EXPECT_EQ(player.compute_adsr(16, 9, 255, env.get()), 1.0f);
}

}  // namespace
}  // namespace ondrel
