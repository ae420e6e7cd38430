#include "render/voice_mix.h"

#include "render/voice_mix_avx2.h"

namespace ondrel {

namespace {

// The portable loops, for CPUs without AVX2. Frame i is read at offset f + i x step.

template <typename S>
inline float sample_at(const S* d, int64_t i) {
    return static_cast<float>(d[i]);
}

template <typename S, bool Interpolate, SendMode Send>
double mix_mono(const void* data, int64_t pos, double f, double step, int count, float* out, float* send,
                const MixGains& g) {
    const S* d = static_cast<const S*>(data) + pos;
    for (int i = 0; i < count; ++i) {
        const double x = f + i * step;
        const int64_t whole = static_cast<int64_t>(x);
        float s = sample_at(d, whole);
        if constexpr (Interpolate) {
            const float b = sample_at(d, whole + 1);  // the slack after the data covers the end
            s = s + (b - s) * static_cast<float>(x - static_cast<double>(whole));
        }
        out[2 * i] += s * g.left;
        out[2 * i + 1] += s * g.right;
        if constexpr (Send == SendMode::First) send[i] = s * g.send;
        if constexpr (Send == SendMode::Add) send[i] += s * g.send;
    }
    return f + count * step;
}

template <typename S>
double mix_stereo(const void* data, int64_t pos, double f, double step, int count, float* out,
                  const MixGains& g) {
    const S* d = static_cast<const S*>(data) + 2 * pos;
    for (int i = 0; i < count; ++i) {
        const int64_t whole = static_cast<int64_t>(f + i * step);
        out[2 * i] += g.left * sample_at(d, 2 * whole);
        out[2 * i + 1] += g.right * sample_at(d, 2 * whole + 1);
    }
    return f + count * step;
}

bool has_avx2() {
    static const bool yes = __builtin_cpu_supports("avx2") && __builtin_cpu_supports("fma");
    return yes;
}

template <typename S>
MonoMixFn pick_mono(bool interpolate, SendMode send) {
    switch (send) {
        case SendMode::None:
            return interpolate ? mix_mono<S, true, SendMode::None> : mix_mono<S, false, SendMode::None>;
        case SendMode::First:
            return interpolate ? mix_mono<S, true, SendMode::First> : mix_mono<S, false, SendMode::First>;
        case SendMode::Add:
            return interpolate ? mix_mono<S, true, SendMode::Add> : mix_mono<S, false, SendMode::Add>;
    }
    return nullptr;
}

}  // namespace

MonoMixFn mono_mixer(bool bits16, bool interpolate, SendMode send, bool vector) {
    if (vector && has_avx2()) return mono_mixer_avx2(bits16, interpolate, send);
    return bits16 ? pick_mono<sample16_t>(interpolate, send) : pick_mono<int8_t>(interpolate, send);
}

StereoMixFn stereo_mixer(bool bits16, bool vector) {
    if (vector && has_avx2()) return stereo_mixer_avx2(bits16);
    return bits16 ? mix_stereo<sample16_t> : mix_stereo<int8_t>;
}

}  // namespace ondrel
