#include "shell/sound_pitch.h"

#include <gtest/gtest.h>

#include <cmath>
#include <numbers>

#include "edit/song_fixture.h"

namespace ondrel {
namespace {

// A sine at 0.6 of full scale, the same on both channels of a stereo sound.
SampleRef sine_sound(double hz, uint32_t rate, int bits, bool stereo, uint32_t frames) {
    const double full = bits == 16 ? 32767 : 127;
    std::vector<int> values;
    for (uint32_t i = 0; i < frames; ++i) {
        const double v = 0.6 * std::sin(2 * std::numbers::pi * hz * i / rate);
        values.insert(values.end(), stereo ? 2 : 1, static_cast<int>(std::lround(v * full)));
    }
    SampleRef s = test::make_sound({bits, stereo}, values);
    s->rate = rate;
    return s;
}

TEST(Calcfft, FindsTheFrequencyAndTheNearestNote) {
    struct Case {
        double hz;
        uint32_t rate;
        int bits;
        bool stereo;
        uint32_t frames;
        int note;
        const char* name;
    };
    const Case cases[] = {
        {440.0, 44100, 16, false, 8000, 69, "A  3"},
        {261.63, 44100, 16, true, 4096, 60, "C  3"},
        {1000.0, 22050, 8, false, 3000, 83, "B  4"},
        {110.0, 8363, 8, true, 2000, 45, "A  1"},
    };
    for (const auto& c : cases) {
        const SampleRef s = sine_sound(c.hz, c.rate, c.bits, c.stereo, c.frames);
        const SoundPitch p = calcfft(*s);
        ASSERT_TRUE(p.found) << c.hz;
        EXPECT_NEAR(p.frequency, c.hz, c.rate / 4096.0 * 0.25) << c.hz;
        EXPECT_EQ(p.note, c.note) << c.hz;
        EXPECT_EQ(p.note_name, c.name) << c.hz;
        EXPECT_LT(std::abs(p.cents), 50.0);
    }
    EXPECT_FALSE(calcfft(*make_sample(4000)).found) << "silence";
    EXPECT_FALSE(calcfft(*make_sample(0)).found) << "nothing";
}

TEST(NoteText, AsTheProgramWritesNotes) {
    const std::pair<int, const char*> cases[] = {{0, "C -2"},  {12, "C -1"}, {24, "C  0"},
                                                 {61, "C# 3"}, {69, "A  3"}, {127, "G  8"}};
    for (const auto& [note, text] : cases) EXPECT_EQ(note_text(note), text) << note;
}

}  // namespace
}  // namespace ondrel
