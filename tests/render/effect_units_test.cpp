// Impulse and step responses of the effect units.
#include <gtest/gtest.h>

#include <cmath>
#include <vector>

#include "engine/engine.h"

namespace ondrel {
namespace {

constexpr float kTol = 1e-5f;

class Units : public ::testing::Test {
protected:
    Engine engine;
    EffectUnits& units = engine.units;

    // Runs slot's unit over input; returns the interleaved stereo it added to silence.
    std::vector<float> run(int slot, const std::vector<float>& input, int control = 128, float el = 1,
                           float er = 1) {
        std::vector<float> out(2 * input.size(), 0.0f);
        units.begin_buffer();
        units.run(slot, engine.slots.efxtype[slot], input.data(), out.data(), static_cast<int>(input.size()),
                  control, el, er);
        return out;
    }
    static std::vector<float> impulse(size_t n) {
        std::vector<float> v(n, 0.0f);
        v[0] = 1.0f;
        return v;
    }
};

TEST_F(Units, FirTapsAreAWindowedSinc) {
    units.fir.fc = 11025;  // control 128
    units.fir.calcfilter(1);
    EXPECT_NEAR(units.fir.coefc[0], 0.0f, 1e-12f);  // the window over 15 points weighs tap 0 with 0
    EXPECT_NEAR(units.fir.coefc[7], 0.491079f, 1e-5f);
    // Tap 14 is not weighed 0, and the window is not symmetric about the centre.
    EXPECT_NEAR(units.fir.coefc[14], -0.000762f, 1e-5f);
    EXPECT_GT(std::fabs(units.fir.coefc[6] - units.fir.coefc[8]), 1e-3f);
    float sum = 0;
    for (float c : units.fir.coefc) sum += c;
    EXPECT_NEAR(sum, 1.0f, 0.02f);  // a low pass passes DC
    const auto low = units.fir.coefc;
    units.fir.calcfilter(3);
    EXPECT_NEAR(units.fir.coefc[7], 1.0f - low[7], 1e-6f);
    EXPECT_EQ(units.fir.coefc[3], -low[3]);
}

TEST_F(Units, FirImpulseResponseIsTheTapsNewestFirst) {
    const auto out = run(1, impulse(20));
    const auto& c = units.fir.coefc;
    for (int i = 0; i < 15; ++i) {
        EXPECT_NEAR(out[2 * i], c[14 - i], kTol) << i;
        EXPECT_EQ(out[2 * i], out[2 * i + 1]);
    }
    for (int i = 15; i < 20; ++i) EXPECT_EQ(out[2 * i], 0.0f);
}

TEST_F(Units, FirSlotsShareOneRingWhosePositionRestartsEachCall) {
    // A first slot leaves its input in the ring; a second FIR slot in the same buffer
    // hears it.
    std::vector<float> ones(7, 1.0f), zeros(7, 0.0f);
    run(1, ones);
    const auto after = run(3, zeros);
    float heard = 0;
    for (float x : after) heard += std::fabs(x);
    EXPECT_GT(heard, 0.1f);
    // Seven frames then a call from position 0: the ring order is not that of one long run.
    units.fir.clear();
    std::vector<float> ramp(14);
    for (int i = 0; i < 14; ++i) ramp[i] = static_cast<float>(i + 1);
    const auto whole = run(1, ramp);
    units.fir.clear();
    const auto a = run(1, std::vector<float>(ramp.begin(), ramp.begin() + 7));
    const auto b = run(1, std::vector<float>(ramp.begin() + 7, ramp.end()));
    EXPECT_NEAR(a[2 * 6], whole[2 * 6], kTol);
    EXPECT_GT(std::fabs(b[2 * 6] - whole[2 * 13]), 1e-3f);
}

TEST_F(Units, OnePoleLowPassRisesToDcAndControlZeroSilences) {
    const auto out = run(2, std::vector<float>(2000, 1.0f), 256);
    const double k = 44100.0 / (11025.0 * 3.1415927);
    EXPECT_NEAR(out[0], 1.0 / (k + 1), 1e-5);
    EXPECT_NEAR(out[2 * 1999], 1.0f, 1e-4f);
    const auto silent = run(2, std::vector<float>(100, 1.0f), 0);
    for (float x : silent) EXPECT_EQ(x, 0.0f);
}

TEST_F(Units, ActiveFilterFirstOutput) {
    engine.bank.current().efxval[5] = 1000;
    const auto out = run(5, impulse(4), 128, 0.5f, 1.0f);
    const double theta = 1000 * 2 * M_PI / 44100;
    const double beta = (3 - theta) / (6 + 2 * theta);
    const double alpha = 0.25 - beta * 0.5;
    const double g = 128 * 1.2 / 256 - 0.2;
    EXPECT_NEAR(out[0], 4 * alpha * 2 * g * 0.5, 1e-6);
    EXPECT_NEAR(out[1], 4 * alpha * 2 * g, 1e-6);
}

TEST_F(Units, EchoRepeatsEveryDelayWithoutDecayAtFullFeedback) {
    TMOD& m = engine.bank.current();
    m.echolen[0] = 100;
    m.echolevel[0] = 128;
    m.echoon[0] = 1;  // invert phase on the right
    const auto out = run(11, impulse(1000));
    for (int i = 0; i < 1000; ++i) {
        const float want = (i > 0 && i % 100 == 0) ? 1.0f : 0.0f;
        ASSERT_EQ(out[2 * i], want) << i;
        ASSERT_EQ(out[2 * i + 1], -want) << i;
    }
}

TEST_F(Units, EchoDecaysByItsFeedbackAndSplitsBuffersAnywhere) {
    TMOD& m = engine.bank.current();
    m.echolen[0] = 64;
    m.echolevel[0] = 64;  // 0.5
    std::vector<float> in = impulse(300);
    const auto whole = run(11, in);
    units.delefx();
    std::vector<float> parts;
    for (size_t at = 0; at < 300; at += 37) {
        const size_t n = std::min<size_t>(37, 300 - at);
        const auto p = run(11, std::vector<float>(in.begin() + static_cast<long>(at),
                                                  in.begin() + static_cast<long>(at + n)));
        parts.insert(parts.end(), p.begin(), p.end());
    }
    EXPECT_EQ(parts, whole);
    EXPECT_FLOAT_EQ(whole[2 * 64], 0.25f);  // stored 0.5, read 0.5 x 0.5
    EXPECT_FLOAT_EQ(whole[2 * 128], 0.125f);
}

TEST_F(Units, ClonedEchoesUseTheirOwnInstanceAndMissingMemoryIsSilent) {
    engine.slots.efxtype[25] = 11;
    engine.slots.efxtype[30] = 11;
    EXPECT_EQ(units.instance_of(11), 0);
    EXPECT_EQ(units.instance_of(25), 1);
    EXPECT_EQ(units.instance_of(30), 2);
    engine.bank.current().echolen[2] = 10;
    engine.bank.current().echolevel[2] = 128;
    const auto out = run(30, impulse(30));
    EXPECT_EQ(out[2 * 10], 1.0f);
    engine.slots.echoefx[2].reset();
    const auto none = run(30, impulse(30));
    for (float x : none) EXPECT_EQ(x, 0.0f);
}

TEST_F(Units, StereoSpaceCrossesAfter512Frames) {
    const auto out = run(12, impulse(1100));
    for (int i = 0; i < 1100; ++i) {
        const float want = i == 512 ? 1.0f : 0.0f;
        ASSERT_EQ(out[2 * i], want) << i;
        ASSERT_EQ(out[2 * i + 1], -want) << i;
    }
}

TEST_F(Units, TwoPoleLowPassSettlesAtUnityAndItsHighPassAtZero) {
    engine.bank.current().efxd[16] = 2;
    engine.bank.current().efxd[17] = 2;
    const auto low = run(16, std::vector<float>(4000, 1.0f), 64);
    const auto high = run(17, std::vector<float>(4000, 1.0f), 64);
    EXPECT_NEAR(low[2 * 3999], 1.0f, 1e-3f);
    EXPECT_NEAR(high[2 * 3999], 0.0f, 1e-3f);
    // Control 0 is taken as 100 Hz, not as a closed filter.
    engine.units.iir2.clear();
    const auto slow = run(16, std::vector<float>(4000, 1.0f), 0);
    EXPECT_GT(slow[2 * 3999], 0.1f);
    EXPECT_LT(slow[2 * 10], low[2 * 10]);
}

TEST_F(Units, ReverbsSendTheNegativeToTheRightAndEndInExactZeros) {
    for (int slot : {9, 10}) {
        std::vector<float> in(44100 * 30, 0.0f);  // long enough for the tails to die
        for (int i = 0; i < 100; ++i) in[i] = 0.5f;
        const auto out = run(slot, in);
        bool heard = false;
        for (size_t i = 0; i < in.size(); ++i) {
            ASSERT_EQ(out[2 * i + 1], -out[2 * i]) << slot << " frame " << i;
            heard = heard || out[2 * i] != 0.0f;
        }
        EXPECT_TRUE(heard) << slot;
        for (size_t i = in.size() - 44100; i < in.size(); ++i)
            ASSERT_EQ(out[2 * i], 0.0f) << slot << " frame " << i;
    }
}

TEST_F(Units, ReverbBlocksMatchFrameByFrame) {
    std::vector<float> in(20000);
    for (size_t i = 0; i < in.size(); ++i) in[i] = static_cast<float>(std::sin(i * 0.01) * (i < 3000));
    for (bool dhs : {false, true}) {
        Reverb one;
        ReverbDHS two;
        Reverb one_b;
        ReverbDHS two_b;
        if (dhs) {
            two.set_delay_us(9, 100000);
            two_b.set_delay_us(9, 100000);
        }
        std::vector<float> whole(2 * in.size(), 0.0f), step(2 * in.size(), 0.0f);
        if (dhs)
            two.compute(in.data(), whole.data(), static_cast<long>(in.size()), 1, 1);
        else
            one.compute(in.data(), whole.data(), static_cast<long>(in.size()), 1, 1);
        for (size_t i = 0; i < in.size(); ++i) {
            if (dhs)
                two_b.compute(&in[i], &step[2 * i], 1, 1, 1);
            else
                one_b.compute(&in[i], &step[2 * i], 1, 1, 1);
        }
        EXPECT_EQ(whole, step) << (dhs ? "ReverbDHS" : "Reverb");
    }
}

TEST_F(Units, ReverbDhsOutputDelay) {
    auto first_heard = [](ReverbDHS& r) {
        std::vector<float> in(20000, 0.0f), out(40000, 0.0f);
        in[0] = 1.0f;
        r.compute(in.data(), out.data(), 20000, 1, 1);
        for (int i = 0; i < 20000; ++i)
            if (out[2 * i] != 0.0f) return i;
        return -1;
    };
    ReverbDHS plain;
    EXPECT_EQ(first_heard(plain), 5400);  // the shortest comb, no output delay
    ReverbDHS delayed;
    delayed.set_delay_us(9, 100000);  // 4410 frames
    EXPECT_EQ(delayed.delay_length(), 4410);
    EXPECT_EQ(first_heard(delayed), 5400 + 4410);
}

TEST_F(Units, ReverbSettingsConvertAndAreBounded) {
    Reverb r;
    r.set_delay_us(0, 1000);
    EXPECT_EQ(r.length(0), 44);
    r.set_delay_us(1, 50);
    EXPECT_EQ(r.length(1), 4);
    r.set_delay_us(2, 10000000);
    EXPECT_EQ(r.length(2), 11049);
    r.set_delay_us(6, 10000000);
    EXPECT_EQ(r.length(6), 44099);
    r.set_gain(5, 650);
    EXPECT_FLOAT_EQ(r.gain(5), 0.65f);
    r.set_cutoff(0, 5);
    EXPECT_EQ(r.cutoff(0), 10.0f);
    r.set_cutoff(1, 20000);
    EXPECT_EQ(r.cutoff(1), 11050.0f);
    ReverbDHS d;
    d.set_delay_us(4, 10000000);
    EXPECT_EQ(d.comb_length(4), 16383);
}

TEST_F(Units, StoppingClearsTheEchoLines) {
    engine.bank.current().echolen[0] = 50;
    run(11, impulse(10));
    engine.player.start(false);
    engine.player.stoppi();
    const auto out = run(11, std::vector<float>(200, 0.0f));
    for (float x : out) EXPECT_EQ(x, 0.0f);
}

}  // namespace
}  // namespace ondrel
