// Every set of mix loops the CPU runs (each sample width, interpolation, send and output
// mode) against a plain reference, over steps on both sides of the vector regimes.
#include "render/voice_mix.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <random>
#include <vector>

#include "song/sample.h"

namespace ondrel {
namespace {

// Sample data of n frames followed by exactly the slack a sample record has, at the end of
// its allocation so that a read past the slack is out of bounds.
struct Data {
    std::vector<uint8_t> bytes;
    const void* data() const { return bytes.data(); }
};

template <typename S>
Data random_data(int frames, int channels, uint32_t seed) {
    Data d;
    d.bytes.assign(frames * channels * sizeof(S) + kSampleSlack, 0);
    std::mt19937 gen(seed);
    std::uniform_int_distribution<int> value(sizeof(S) == 1 ? -128 : -32768, sizeof(S) == 1 ? 127 : 32767);
    for (int i = 0; i < frames * channels; ++i) {
        const S v = static_cast<S>(value(gen));
        std::memcpy(&d.bytes[i * sizeof(S)], &v, sizeof(S));
    }
    return d;
}

template <typename S>
float at(const Data& d, int64_t i) {
    S v;
    std::memcpy(&v, &d.bytes[i * sizeof(S)], sizeof(S));
    return static_cast<float>(v);
}

// The read offset of frame i: in single precision for the vector loops (each operation
// rounded to float, whatever the compiler fuses here), double for the portable ones.
double offset(LoopSet set, double f, double step, int i) {
    if (set == LoopSet::Portable) return f + i * step;
    const float product = static_cast<float>(static_cast<double>(i) * static_cast<float>(step));
    return static_cast<float>(static_cast<double>(static_cast<float>(f)) + product);
}

struct Case {
    bool bits16;
    bool interpolate;
    SendMode send;
    OutMode out;
    LoopSet set;
};

template <typename S>
void check_mono(const Case& c, double f, double step, int count) {
    SCOPED_TRACE(testing::Message() << "bits16 " << c.bits16 << " interpolate " << c.interpolate << " send "
                                    << static_cast<int>(c.send) << " set " << (c.out == OutMode::Set)
                                    << " loops " << static_cast<int>(c.set) << " f " << f << " step " << step
                                    << " count " << count);
    const int frames = static_cast<int>(std::floor(f + (count - 1) * step)) + 1;
    const Data d = random_data<S>(frames, 1, static_cast<uint32_t>(count * 7919 + frames));
    std::vector<float> out(2 * count + 2), send(count + 1);
    for (size_t i = 0; i < out.size(); ++i) out[i] = static_cast<float>(i % 5) - 2.0f;
    for (size_t i = 0; i < send.size(); ++i) send[i] = 0.5f * static_cast<float>(i % 3);
    const std::vector<float> out0 = out, send0 = send;
    const MixGains g{0.25f, -0.5f, 0.125f};

    const double end = mono_mixer(c.bits16, c.interpolate, c.send, c.out, c.set)(
        d.data(), 0, f, step, count, out.data(), c.send == SendMode::None ? nullptr : send.data(), g);
    EXPECT_NEAR(end, f + count * step, 1e-9);

    for (int i = 0; i < count; ++i) {
        const double x = offset(c.set, f, step, i);
        const int64_t whole = static_cast<int64_t>(x);
        const float a = at<S>(d, whole), b = at<S>(d, whole + 1);
        const float s = c.interpolate ? a + (b - a) * static_cast<float>(x - whole) : a;
        // Rounding of the neighbours' sum, far below one step of a sample's value.
        const float tolerance = 1e-5f * (std::fabs(a) + std::fabs(b)) + 1e-4f;
        const float base_left = c.out == OutMode::Set ? 0.0f : out0[2 * i];
        const float base_right = c.out == OutMode::Set ? 0.0f : out0[2 * i + 1];
        ASSERT_NEAR(out[2 * i], base_left + s * g.left, tolerance) << "frame " << i;
        ASSERT_NEAR(out[2 * i + 1], base_right + s * g.right, tolerance) << "frame " << i;
        float sent = send0[i];
        if (c.send == SendMode::First) sent = s * g.send;
        if (c.send == SendMode::Add) sent = send0[i] + s * g.send;
        ASSERT_NEAR(send[i], sent, tolerance) << "frame " << i;
    }
    EXPECT_EQ(out[2 * count], out0[2 * count]);  // nothing past the frames asked for
    EXPECT_EQ(out[2 * count + 1], out0[2 * count + 1]);
    EXPECT_EQ(send[count], send0[count]);
}

const double kSteps[] = {0.0, 0.19, 0.5, 0.98, 0.995, 1.5, 1.97, 1.985, 2.6, 7.3};
const double kStarts[] = {0.0, 0.73};
const int kCounts[] = {1, 7, 8, 9, 17, 883, 4096};

// Every set of loops this CPU runs.
std::vector<LoopSet> loop_sets() {
    std::vector<LoopSet> sets;
    for (LoopSet set : {LoopSet::Best, LoopSet::Avx2, LoopSet::Portable})
        if (cpu_runs(set)) sets.push_back(set);
    return sets;
}

TEST(MixLoops, MonoMatchesTheReferenceInEveryCase) {
    for (LoopSet set : loop_sets())
        for (bool bits16 : {false, true})
            for (bool interpolate : {false, true})
                for (SendMode send : {SendMode::None, SendMode::First, SendMode::Add})
                    for (OutMode out : {OutMode::Add, OutMode::Set})
                        for (double step : kSteps)
                            for (double f : kStarts)
                                for (int count : kCounts) {
                                    const Case c{bits16, interpolate, send, out, set};
                                    if (bits16)
                                        check_mono<int16_t>(c, f, step, count);
                                    else
                                        check_mono<int8_t>(c, f, step, count);
                                    if (HasFatalFailure()) return;
                                }
}

template <typename S>
void check_stereo(OutMode mode, LoopSet set, double f, double step, int count) {
    SCOPED_TRACE(testing::Message() << "stereo bits " << 8 * sizeof(S) << " set " << (mode == OutMode::Set)
                                    << " loops " << static_cast<int>(set) << " f " << f << " step " << step
                                    << " count " << count);
    const int frames = static_cast<int>(std::floor(f + (count - 1) * step)) + 1;
    const Data d = random_data<S>(frames, 2, static_cast<uint32_t>(count + 31 * frames));
    std::vector<float> out(2 * count + 2, 1.0f);
    const MixGains g{0.5f, 0.75f, 0.0f};
    const double end = stereo_mixer(sizeof(S) == 2, mode, set)(d.data(), 0, f, step, count, out.data(), g);
    const float base = mode == OutMode::Set ? 0.0f : 1.0f;
    EXPECT_NEAR(end, f + count * step, 1e-9);
    for (int i = 0; i < count; ++i) {
        const int64_t whole = static_cast<int64_t>(f + i * step);  // stereo offsets stay in double
        ASSERT_FLOAT_EQ(out[2 * i], base + at<S>(d, 2 * whole) * g.left) << "frame " << i;
        ASSERT_FLOAT_EQ(out[2 * i + 1], base + at<S>(d, 2 * whole + 1) * g.right) << "frame " << i;
    }
    EXPECT_EQ(out[2 * count], 1.0f);
}

TEST(MixLoops, StereoKeepsEachChannelInEveryCase) {
    for (LoopSet set : loop_sets())
        for (OutMode mode : {OutMode::Add, OutMode::Set})
            for (double step : kSteps)
                for (double f : kStarts)
                    for (int count : kCounts) {
                        check_stereo<int8_t>(mode, set, f, step, count);
                        check_stereo<int16_t>(mode, set, f, step, count);
                        if (HasFatalFailure()) return;
                    }
}

}  // namespace
}  // namespace ondrel
