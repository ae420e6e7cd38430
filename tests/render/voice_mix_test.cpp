// Every set of mix loops the CPU runs (each sample width, interpolation, send and output
// mode, mono and stereo) against a plain reference, over steps on both sides of the
// vector regimes and counts around the group sizes.
#include "render/voice_mix.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <random>
#include <vector>

#include "render/voice_passes.h"
#include "song/sample.h"

namespace ondrel {
namespace {

struct Case {
    LoopSet set;
    bool bits16, stereo, interpolate;
    SendMode send;
    OutMode out;
    double f, step;
    int count;
};

// Random sample data followed by exactly the slack a sample record has, at the end of its
// allocation so that a read past the slack is out of bounds.
std::vector<uint8_t> random_data(size_t values, size_t width, uint32_t seed) {
    std::vector<uint8_t> d(values * width + kSampleSlack, 0);
    std::mt19937 gen(seed);
    for (size_t i = 0; i < values * width; ++i) d[i] = static_cast<uint8_t>(gen());
    return d;
}

float value_at(const std::vector<uint8_t>& d, bool bits16, int64_t i) {
    if (!bits16) return static_cast<int8_t>(d[i]);
    int16_t v;
    std::memcpy(&v, &d[2 * i], 2);
    return v;
}

void check(const Case& c) {
    SCOPED_TRACE(testing::Message() << "loops " << static_cast<int>(c.set) << " bits16 " << c.bits16
                                    << " stereo " << c.stereo << " interpolate " << c.interpolate << " send "
                                    << static_cast<int>(c.send) << " set " << (c.out == OutMode::Set) << " f "
                                    << c.f << " step " << c.step << " count " << c.count);
    const int channels = c.stereo ? 2 : 1;
    const int frames = static_cast<int>(std::floor(c.f + (c.count - 1) * c.step)) + 1;
    const auto d = random_data(static_cast<size_t>(frames * channels), c.bits16 ? 2 : 1,
                               static_cast<uint32_t>(c.count * 7919 + frames));
    std::vector<float> out(2 * c.count + 2), send(c.count + 1);
    for (size_t i = 0; i < out.size(); ++i) out[i] = static_cast<float>(i % 5) - 2.0f;
    for (size_t i = 0; i < send.size(); ++i) send[i] = 0.5f * static_cast<float>(i % 3);
    const std::vector<float> out0 = out, send0 = send;
    const MixGains g{0.25f, -0.5f, c.stereo ? 0.0f : 0.125f};
    const double end =
        c.stereo ? stereo_mixer(c.bits16, c.out, c.set)(d.data(), 0, c.f, c.step, c.count, out.data(), g)
                 : mono_mixer(c.bits16, c.interpolate, c.send, c.out, c.set)(
                       d.data(), 0, c.f, c.step, c.count, out.data(),
                       c.send == SendMode::None ? nullptr : send.data(), g);
    EXPECT_NEAR(end, c.f + c.count * c.step, 1e-9);
    for (int i = 0; i < c.count; ++i) {
        // Mono offsets are in single precision in the vector loops (each operation rounded
        // to float), in double in the portable ones and for stereo.
        double x = c.f + i * c.step;
        if (c.set != LoopSet::Portable && !c.stereo)
            x = static_cast<float>(static_cast<double>(static_cast<float>(c.f)) +
                                   static_cast<float>(static_cast<double>(i) * static_cast<float>(c.step)));
        const int64_t whole = static_cast<int64_t>(x);
        // Stereo: the frame's two values; mono: a sample and its neighbour.
        const float a = value_at(d, c.bits16, c.stereo ? 2 * whole : whole);
        const float b = value_at(d, c.bits16, c.stereo ? 2 * whole + 1 : whole + 1);
        const float s = c.stereo ? 0 : c.interpolate ? a + (b - a) * static_cast<float>(x - whole) : a;
        const float l = c.stereo ? a : s, r = c.stereo ? b : s;
        // Rounding of the neighbours' sum, far below one step of a sample's value.
        const float tolerance = 1e-5f * (std::fabs(a) + std::fabs(b)) + 1e-4f;
        const float base_l = c.out == OutMode::Set ? 0.0f : out0[2 * i];
        const float base_r = c.out == OutMode::Set ? 0.0f : out0[2 * i + 1];
        ASSERT_NEAR(out[2 * i], base_l + l * g.left, tolerance) << "frame " << i;
        ASSERT_NEAR(out[2 * i + 1], base_r + r * g.right, tolerance) << "frame " << i;
        const float sent =
            c.send == SendMode::First ? s * g.send : send0[i] + (c.send == SendMode::Add) * s * g.send;
        ASSERT_NEAR(send[i], c.stereo ? send0[i] : sent, tolerance) << "frame " << i;
    }
    EXPECT_EQ(out[2 * c.count], out0[2 * c.count]);  // nothing past the frames asked for
    EXPECT_EQ(out[2 * c.count + 1], out0[2 * c.count + 1]);
    EXPECT_EQ(send[c.count], send0[c.count]);
}

TEST(MixLoops, EveryLoopMatchesTheReference) {
    const double steps[] = {0.0, 0.19, 0.5, 0.98, 0.995, 1.5, 1.97, 1.985, 2.6, 7.3};
    const int counts[] = {1, 7, 8, 9, 15, 17, 24, 31, 883, 4096};  // around 8- and 16-frame groups
    for (LoopSet set : {LoopSet::Best, LoopSet::Avx2, LoopSet::Portable}) {
        if (!cpu_runs(set)) continue;
        for (int kind = 0; kind < 14; ++kind) {  // 12 mono kinds, then 2 stereo ones
            const bool stereo = kind >= 12;
            const bool bits16 = stereo ? kind == 13 : kind % 2;
            const bool interpolate = !stereo && kind / 2 % 2;
            const SendMode send = stereo ? SendMode::None : static_cast<SendMode>(kind / 4);
            for (OutMode out : {OutMode::Add, OutMode::Set})
                for (double step : steps)
                    for (double f : {0.0, 0.73})
                        for (int count : counts) {
                            check({set, bits16, stereo, interpolate, send, out, f, step, count});
                            if (HasFatalFailure()) return;
                        }
        }
    }
}

// A voice's passes over a piece through each set's voice loops: the same positions, ends
// and fade clock as the portable ones, nearly the same frames; with a send buffer the
// first pass sets it and the later ones add to it.
TEST(MixLoops, EverySetRunsAVoicesPassesAlike) {
    struct VoiceCase {
        const char* what;
        int64_t pos, loop_start, end;
        bool loop;
        double f, step;
        int frames;
    };
    const VoiceCase cases[] = {
        {"a short loop played low", 2, 4, 20, true, 0.25, 0.3127, 700},
        {"a long loop, many groups a pass", 0, 8, 300, true, 0.5, 1.37, 900},
        {"a loop past the gather step", 0, 0, 40, true, 0.0, 2.6, 333},
        {"a one-shot that ends", 10, 0, 90, false, 0.75, 0.9, 200},
        {"an empty loop", 30, 12, 12, true, 0.0, 1.0, 50},
        {"standing still", 5, 0, 64, true, 0.5, 0.0, 40},
    };
    const auto data = random_data(512, 2, 5);
    const MixGains g{0.25f, -0.5f, 0.125f};
    for (const VoiceCase& c : cases)
        for (bool bits16 : {false, true})
            for (SendMode send : {SendMode::None, SendMode::First, SendMode::Add}) {
                SCOPED_TRACE(testing::Message() << c.what << " bits16 " << bits16 << " send " << static_cast<int>(send));
                struct Result {
                    VoicePasses passes;
                    std::vector<float> out, send;
                };
                auto run = [&](LoopSet set) {
                    Result r{{data.data(), c.loop_start, c.end, c.step, c.loop, c.loop && c.end > c.loop_start,
                              c.pos, c.f, nullptr, nullptr, c.frames, c.pos},
                             std::vector<float>(2 * c.frames, 1.0f), std::vector<float>(c.frames, 2.0f)};
                    r.passes.out = r.out.data();
                    r.passes.send = send == SendMode::None ? nullptr : r.send.data();
                    voice_mixer(bits16, true, send, OutMode::Add, set)(r.passes, g);
                    return r;
                };
                const Result want = run(LoopSet::Portable);
                const int mixed = static_cast<int>(want.passes.out - want.out.data()) / 2;
                const bool wraps = c.loop && c.end > c.loop_start && c.step > 0;
                if (wraps) {
                    EXPECT_EQ(mixed, c.frames);
                }
                if (send != SendMode::None && wraps) {
                    // The first frame's send value is set or added as asked; past the first
                    // wrap every value is added.
                    const float first_sample = (want.out[0] - 1.0f) / g.left;
                    EXPECT_NEAR(want.send[0], (send == SendMode::First ? 0.0f : 2.0f) + first_sample * g.send, 1e-3f);
                    const int late = mixed - 1;
                    EXPECT_NEAR(want.send[late], 2.0f + (want.out[2 * late] - 1.0f) / g.left * g.send, 1e-3f);
                }
                // Offsets in single precision move a 16-bit value by up to about one.
                const float near = bits16 ? 1.0f : 0.02f;
                for (LoopSet set : {LoopSet::Best, LoopSet::Avx2}) {
                    if (!cpu_runs(set)) continue;
                    const Result got = run(set);
                    EXPECT_EQ(got.passes.pos, want.passes.pos);
                    EXPECT_EQ(got.passes.f, want.passes.f);
                    EXPECT_EQ(got.passes.position, want.passes.position);
                    EXPECT_EQ(got.passes.keeps, want.passes.keeps);
                    EXPECT_EQ(got.passes.ended, want.passes.ended);
                    EXPECT_EQ(got.passes.advanced, want.passes.advanced);
                    EXPECT_EQ(got.passes.out, got.out.data() + 2 * mixed);
                    for (int i = 0; i < 2 * c.frames; ++i) ASSERT_NEAR(got.out[i], want.out[i], near) << i;
                    for (int i = 0; i < c.frames; ++i) ASSERT_NEAR(got.send[i], want.send[i], near) << i;
                }
            }
}

}  // namespace
}  // namespace ondrel
