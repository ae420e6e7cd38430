#include "render/voice_mix.h"

#include "render/voice_passes.h"
#include "render/voice_mix_simd.h"

namespace ondrel {

namespace {

// The portable loops, for CPUs without AVX2. Frame i is read at offset f + i x step.

template <typename S>
inline float sample_at(const S* d, int64_t i) {
    return static_cast<float>(d[i]);
}

template <typename S, bool Interpolate, SendMode Send, OutMode Out>
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
        if constexpr (Out == OutMode::Set) {
            out[2 * i] = s * g.left;
            out[2 * i + 1] = s * g.right;
        } else {
            out[2 * i] += s * g.left;
            out[2 * i + 1] += s * g.right;
        }
        if constexpr (Send == SendMode::First) send[i] = s * g.send;
        if constexpr (Send == SendMode::Add) send[i] += s * g.send;
    }
    return f + count * step;
}

template <typename S, bool Interpolate, SendMode Send, OutMode Out>
void mix_voice(VoicePasses& passes, const MixGains& g) {
    bool first = true;
    run_voice_passes(passes, [&](int64_t pos, double f, int count, float* out, float* send) {
        if (Send == SendMode::First && !first)
            mix_mono<S, Interpolate, SendMode::Add, Out>(passes.data, pos, f, passes.step, count, out, send, g);
        else
            mix_mono<S, Interpolate, Send, Out>(passes.data, pos, f, passes.step, count, out, send, g);
        first = false;
    });
}

template <typename S, OutMode Out>
double mix_stereo(const void* data, int64_t pos, double f, double step, int count, float* out,
                  const MixGains& g) {
    const S* d = static_cast<const S*>(data) + 2 * pos;
    for (int i = 0; i < count; ++i) {
        const int64_t whole = static_cast<int64_t>(f + i * step);
        const float l = g.left * sample_at(d, 2 * whole);
        const float r = g.right * sample_at(d, 2 * whole + 1);
        out[2 * i] = Out == OutMode::Set ? l : out[2 * i] + l;
        out[2 * i + 1] = Out == OutMode::Set ? r : out[2 * i + 1] + r;
    }
    return f + count * step;
}

template <typename S, OutMode Out>
MonoMixFn pick_mono(bool interpolate, SendMode send) {
    switch (send) {
        case SendMode::None:
            return interpolate ? mix_mono<S, true, SendMode::None, Out>
                               : mix_mono<S, false, SendMode::None, Out>;
        case SendMode::First:
            return interpolate ? mix_mono<S, true, SendMode::First, Out>
                               : mix_mono<S, false, SendMode::First, Out>;
        case SendMode::Add:
            return interpolate ? mix_mono<S, true, SendMode::Add, Out>
                               : mix_mono<S, false, SendMode::Add, Out>;
    }
    return nullptr;
}

template <OutMode Out>
MonoMixFn pick_mono(bool bits16, bool interpolate, SendMode send) {
    return bits16 ? pick_mono<sample16_t, Out>(interpolate, send) : pick_mono<int8_t, Out>(interpolate, send);
}

template <OutMode Out>
StereoMixFn pick_stereo(bool bits16) {
    return bits16 ? mix_stereo<sample16_t, Out> : mix_stereo<int8_t, Out>;
}

template <OutMode Out, typename S>
VoiceMixFn pick_voice(bool interpolate, SendMode send) {
    switch (send) {
        case SendMode::None:
            return interpolate ? mix_voice<S, true, SendMode::None, Out> : mix_voice<S, false, SendMode::None, Out>;
        case SendMode::First:
            return interpolate ? mix_voice<S, true, SendMode::First, Out> : mix_voice<S, false, SendMode::First, Out>;
        case SendMode::Add:
            return interpolate ? mix_voice<S, true, SendMode::Add, Out> : mix_voice<S, false, SendMode::Add, Out>;
    }
    return nullptr;
}

}  // namespace

MonoMixFn mono_mixer(bool bits16, bool interpolate, SendMode send, OutMode out, LoopSet set) {
    if (set == LoopSet::Best && has_avx512()) return avx512::mono_mixer(bits16, interpolate, send, out);
    if (set != LoopSet::Portable && has_avx2()) return avx2::mono_mixer(bits16, interpolate, send, out);
    return out == OutMode::Set ? pick_mono<OutMode::Set>(bits16, interpolate, send)
                               : pick_mono<OutMode::Add>(bits16, interpolate, send);
}

VoiceMixFn voice_mixer(bool bits16, bool interpolate, SendMode send, OutMode out, LoopSet set) {
    if (set == LoopSet::Best && has_avx512()) return avx512::voice_mixer(bits16, interpolate, send, out);
    if (set != LoopSet::Portable && has_avx2()) return avx2::voice_mixer(bits16, interpolate, send, out);
    if (out == OutMode::Set)
        return bits16 ? pick_voice<OutMode::Set, sample16_t>(interpolate, send)
                      : pick_voice<OutMode::Set, int8_t>(interpolate, send);
    return bits16 ? pick_voice<OutMode::Add, sample16_t>(interpolate, send)
                  : pick_voice<OutMode::Add, int8_t>(interpolate, send);
}

StereoMixFn stereo_mixer(bool bits16, OutMode out, LoopSet set) {
    if (set == LoopSet::Best && has_avx512()) return avx512::stereo_mixer(bits16, out);
    if (set != LoopSet::Portable && has_avx2()) return avx2::stereo_mixer(bits16, out);
    return out == OutMode::Set ? pick_stereo<OutMode::Set>(bits16) : pick_stereo<OutMode::Add>(bits16);
}

}  // namespace ondrel
