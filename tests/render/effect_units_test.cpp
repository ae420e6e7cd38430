// Impulse, step and sine responses of the effect units.
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
    TMOD& song() { return engine.bank.current(); }

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
    static std::vector<float> sine(double hz, size_t n) {
        std::vector<float> v(n);
        for (size_t i = 0; i < n; ++i) v[i] = static_cast<float>(std::sin(2 * M_PI * hz * i / 44100));
        return v;
    }
    // The largest left value of the last frames of out.
    static float settled_peak(const std::vector<float>& out, size_t frames) {
        float peak = 0;
        for (size_t i = out.size() / 2 - frames; i < out.size() / 2; ++i)
            peak = std::max(peak, std::fabs(out[2 * i]));
        return peak;
    }
};

TEST_F(Units, FirLowAndHighPassTaps) {
    const auto out = run(1, impulse(20));  // the impulse response is the taps, newest first
    const auto low = units.fir.coefc;
    float sum = 0;
    for (int i = 0; i < 15; ++i) {
        EXPECT_NEAR(out[2 * i], low[14 - i], kTol) << i;
        EXPECT_EQ(out[2 * i], out[2 * i + 1]);
        sum += low[i];
    }
    for (int i = 15; i < 20; ++i) EXPECT_EQ(out[2 * i], 0.0f);
    EXPECT_NEAR(sum, 1.0f, 0.02f);  // a low pass passes DC
    // The window spans 15 points rather than 14: tap 0 weighs 0, tap 14 does not, and
    // the taps are not symmetric about the centre. The centre tap, at control 128 (a cutoff
    // of a quarter of the rate), is 2 x 0.25 x (0.42 - 0.5 cos(14 pi/15) + 0.08 cos(28 pi/15)).
    EXPECT_NEAR(low[7], 0.5f * 0.982157f, 1e-5f);
    EXPECT_NEAR(low[0], 0.0f, 1e-12f);
    EXPECT_GT(std::fabs(low[14]), 1e-4f);
    EXPECT_GT(std::fabs(low[6] - low[8]), 1e-3f);
    run(3, impulse(1));  // the high pass is an impulse less the low pass
    for (int i = 0; i < 15; ++i) EXPECT_NEAR(units.fir.coefc[i], (i == 7) - low[i], 1e-6f) << i;
}

TEST_F(Units, FirSlotsShareOneRingWhosePositionRestartsEachCall) {
    // A first slot leaves its input in the ring; a second FIR slot in the same buffer
    // hears it.
    run(1, std::vector<float>(7, 1.0f));
    float heard = 0;
    for (float x : run(3, std::vector<float>(7, 0.0f))) heard += std::fabs(x);
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

TEST_F(Units, LowPassesPassDcAndHighPassesStopIt) {
    EXPECT_NEAR(run(2, std::vector<float>(2000, 1.0f), 256)[2 * 1999], 1.0f, 1e-4f);
    for (float x : run(2, std::vector<float>(100, 1.0f), 0)) EXPECT_EQ(x, 0.0f);  // control 0 silences
    song().efxd[16] = song().efxd[17] = 2;
    const auto low = run(16, std::vector<float>(4000, 1.0f), 64);
    EXPECT_NEAR(low[2 * 3999], 1.0f, 1e-3f);
    EXPECT_NEAR(run(17, std::vector<float>(4000, 1.0f), 64)[2 * 3999], 0.0f, 1e-3f);
    // Control 0 is taken as 100 Hz, not as a closed filter.
    units.iir2.clear();
    const auto slow = run(16, std::vector<float>(4000, 1.0f), 0);
    EXPECT_GT(slow[2 * 3999], 0.1f);
    EXPECT_LT(slow[2 * 10], low[2 * 10]);
}

TEST_F(Units, ActiveFilterIsABandPassOfUnityGainAtItsFrequencyWhenControlIsFull) {
    song().efxval[5] = 1000;
    // Control 256 makes the resonator's gain 1; the output is four times its value.
    const auto at = run(5, sine(1000, 30000), 256, 0.5f, 1.0f);
    EXPECT_NEAR(settled_peak(at, 5000), 2.0f, 0.02f);
    float right = 0;
    for (size_t i = 25000; i < 30000; ++i) right = std::max(right, std::fabs(at[2 * i + 1]));
    EXPECT_NEAR(right, 4.0f, 0.04f);
    units.active = ActiveFilter{};
    EXPECT_LT(settled_peak(run(5, sine(100, 30000), 256), 5000), 1.0f);
    units.active = ActiveFilter{};
    EXPECT_LT(settled_peak(run(5, std::vector<float>(30000, 1.0f), 256), 5000), 1e-3f);
}

TEST_F(Units, EchoRepeatsAtItsDelayByItsFeedback) {
    song().echolen[0] = 100;
    song().echolevel[0] = 128;
    song().echoon[0] = 1;  // invert phase on the right
    const auto full = run(11, impulse(1000));
    for (int i = 0; i < 1000; ++i) {
        const float want = (i > 0 && i % 100 == 0) ? 1.0f : 0.0f;
        ASSERT_EQ(full[2 * i], want) << i;
        ASSERT_EQ(full[2 * i + 1], -want) << i;
    }
    units.delefx();
    song().echolen[0] = 64;
    song().echolevel[0] = 64;  // 0.5
    song().echoon[0] = 0;
    std::vector<float> in = impulse(300);
    const auto whole = run(11, in);
    EXPECT_FLOAT_EQ(whole[2 * 64], 0.25f);  // stored 0.5, read 0.5 x 0.5
    EXPECT_FLOAT_EQ(whole[2 * 128 + 1], 0.125f);
    units.delefx();
    std::vector<float> parts;  // buffers split anywhere give the same
    for (size_t at = 0; at < 300; at += 37) {
        const auto p =
            run(11, std::vector<float>(in.begin() + static_cast<long>(at),
                                       in.begin() + static_cast<long>(std::min<size_t>(at + 37, 300))));
        parts.insert(parts.end(), p.begin(), p.end());
    }
    EXPECT_EQ(parts, whole);
    engine.player.start(false);  // stopping clears the lines
    engine.player.stoppi();
    for (float x : run(11, std::vector<float>(200, 0.0f))) EXPECT_EQ(x, 0.0f);
}

TEST_F(Units, ClonedEchoesUseTheirOwnInstanceAndMissingMemoryIsSilent) {
    engine.slots.efxtype[25] = 11;
    engine.slots.efxtype[30] = 11;
    EXPECT_EQ(units.instance_of(11), 0);
    EXPECT_EQ(units.instance_of(25), 1);
    EXPECT_EQ(units.instance_of(30), 2);
    song().echolen[2] = 10;
    song().echolevel[2] = 128;
    EXPECT_EQ(run(30, impulse(30))[2 * 10], 1.0f);
    engine.slots.echoefx[2].reset();
    for (float x : run(30, impulse(30))) EXPECT_EQ(x, 0.0f);
}

TEST_F(Units, StereoSpaceCrossesAfter512Frames) {
    const auto out = run(12, impulse(1100));
    for (int i = 0; i < 1100; ++i) {
        const float want = i == 512 ? 1.0f : 0.0f;
        ASSERT_EQ(out[2 * i], want) << i;
        ASSERT_EQ(out[2 * i + 1], -want) << i;
    }
}

TEST_F(Units, ReverbsSendTheNegativeToTheRightAndEndInExactZeros) {
    // Comb feedbacks of a half: tails short enough for a quick test.
    for (int c = 0; c < 4; ++c) units.firstreverb.set_gain(c, 500);
    for (int c = 0; c < 5; ++c) units.secreverb.set_gain(c, 500);
    for (int slot : {9, 10}) {
        std::vector<float> in(44100 * 5, 0.0f);
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
    auto compare = [&](auto& whole_unit, auto& step_unit, const char* what) {
        std::vector<float> whole(2 * in.size(), 0.0f), step(2 * in.size(), 0.0f);
        whole_unit.compute(in.data(), whole.data(), static_cast<long>(in.size()), 1, 1);
        for (size_t i = 0; i < in.size(); ++i) step_unit.compute(&in[i], &step[2 * i], 1, 1, 1);
        EXPECT_EQ(whole, step) << what;
    };
    Reverb one, one_b;
    compare(one, one_b, "Reverb");
    ReverbDHS two, two_b;
    two.set_delay_us(9, 100000);
    two_b.set_delay_us(9, 100000);
    compare(two, two_b, "ReverbDHS");
}

TEST_F(Units, ReverbSettingsAndTheDhsOutputDelay) {
    Reverb r;
    const std::pair<int, uint32_t> delays[] = {{0, 1000}, {1, 50}, {2, 10000000}, {6, 10000000}};
    const int frames[] = {44, 4, 11049, 44099};  // 44.1 a millisecond, at least 4, bounded
    for (int i = 0; i < 4; ++i) {
        r.set_delay_us(delays[i].first, delays[i].second);
        EXPECT_EQ(r.length(delays[i].first), frames[i]) << i;
    }
    r.set_gain(5, 650);
    EXPECT_FLOAT_EQ(r.gain(5), 0.65f);
    r.set_cutoff(0, 5);
    EXPECT_EQ(r.cutoff(0), 10.0f);
    r.set_cutoff(1, 20000);
    EXPECT_EQ(r.cutoff(1), 11050.0f);
    auto first_heard = [](ReverbDHS& dhs) {
        std::vector<float> in(20000, 0.0f), out(40000, 0.0f);
        in[0] = 1.0f;
        dhs.compute(in.data(), out.data(), 20000, 1, 1);
        for (int i = 0; i < 20000; ++i)
            if (out[2 * i] != 0.0f) return i;
        return -1;
    };
    ReverbDHS d;
    EXPECT_EQ(first_heard(d), 5400);  // the shortest comb, no output delay
    d.set_delay_us(4, 10000000);
    EXPECT_EQ(d.comb_length(4), 16383);
    ReverbDHS delayed;
    delayed.set_delay_us(9, 100000);
    EXPECT_EQ(delayed.delay_length(), 4410);
    EXPECT_EQ(first_heard(delayed), 5400 + 4410);
}

}  // namespace
}  // namespace ondrel
