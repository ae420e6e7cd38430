#include "render/voice_mix.h"

namespace ondrel {

namespace {

template <typename S>
inline float sample_at(const S* d, int64_t i) {
    return static_cast<float>(d[i]);
}

template <typename S, bool Interpolate, SendMode Send>
double mix_mono(const void* data, int64_t pos, double x, double step, int count, float* out, float* send,
                const MixGains& g) {
    const S* d = static_cast<const S*>(data) + pos;
    for (int i = 0; i < count; ++i) {
        const int64_t whole = static_cast<int64_t>(x);
        float s;
        if constexpr (Interpolate) {
            const float a = sample_at(d, whole);
            const float b = sample_at(d, whole + 1);  // the slack after the data covers the end
            s = a + (b - a) * static_cast<float>(x - static_cast<double>(whole));
        } else {
            s = sample_at(d, whole);
        }
        out[2 * i] += s * g.left;
        out[2 * i + 1] += s * g.right;
        if constexpr (Send == SendMode::First) send[i] = s * g.send;
        if constexpr (Send == SendMode::Add) send[i] += s * g.send;
        x += step;
    }
    return x;
}

template <typename S>
double mix_stereo(const void* data, int64_t pos, double x, double step, int count, float* out,
                  const MixGains& g) {
    const S* d = static_cast<const S*>(data) + 2 * pos;
    for (int i = 0; i < count; ++i) {
        const int64_t whole = static_cast<int64_t>(x);
        out[2 * i] += g.left * sample_at(d, 2 * whole);
        out[2 * i + 1] += g.right * sample_at(d, 2 * whole + 1);
        x += step;
    }
    return x;
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

MonoMixFn mono_mixer(bool bits16, bool interpolate, SendMode send) {
    return bits16 ? pick_mono<sample16_t>(interpolate, send) : pick_mono<int8_t>(interpolate, send);
}

StereoMixFn stereo_mixer(bool bits16) {
    return bits16 ? mix_stereo<sample16_t> : mix_stereo<int8_t>;
}

}  // namespace ondrel
