#include "render/voice_mix_avx2.h"

#include <immintrin.h>

// Eight frames a group. Frame i is read at offset f + i x step: in single precision for
// mono samples (within a piece of at most 4096 frames the error stays far below a frame),
// in double for stereo ones. The last, partial group is masked rather than left to a
// scalar loop, so every frame of a call is computed alike.
#define ONDREL_AVX2 __attribute__((target("avx2,fma"))) inline

namespace ondrel {
namespace {

// Steps below kSpanStep x Span: eight frames lie within 8 x Span + 1 samples, read with
// contiguous loads and lane permutes. Above, a gather reads them.
constexpr float kSpanStep = 0.99f;  // 1 less room for rounding
constexpr int kGather = 0;

ONDREL_AVX2 __m256i lanes_below(int n) {
    return _mm256_cmpgt_epi32(_mm256_set1_epi32(n), _mm256_setr_epi32(0, 1, 2, 3, 4, 5, 6, 7));
}

// out (8 floats) plus, or set to, v x gains; only the lanes in mask when Masked.
template <bool Masked, OutMode Out>
ONDREL_AVX2 void put8(float* out, __m256 v, __m256 gains, __m256i mask) {
    __m256 r;
    if constexpr (Out == OutMode::Set)
        r = _mm256_mul_ps(v, gains);
    else
        r = _mm256_fmadd_ps(v, gains, Masked ? _mm256_maskload_ps(out, mask) : _mm256_loadu_ps(out));
    if constexpr (Masked)
        _mm256_maskstore_ps(out, mask, r);
    else
        _mm256_storeu_ps(out, r);
}

// Eight stereo frames, given as [f0 f1 | f4 f5] and [f2 f3 | f6 f7] (two floats each),
// into out at the gains; only the first n frames when Masked.
template <bool Masked, OutMode Out>
ONDREL_AVX2 void put_frames8(__m256 lo, __m256 hi, float* out, __m256 gains, int n) {
    __m256i m1 = _mm256_set1_epi32(-1), m2 = m1;
    if constexpr (Masked) {
        const __m256i n2 = _mm256_set1_epi32(2 * n);
        m1 = _mm256_cmpgt_epi32(n2, _mm256_setr_epi32(0, 1, 2, 3, 4, 5, 6, 7));
        m2 = _mm256_cmpgt_epi32(n2, _mm256_setr_epi32(8, 9, 10, 11, 12, 13, 14, 15));
    }
    put8<Masked, Out>(out, _mm256_permute2f128_ps(lo, hi, 0x20), gains, m1);
    put8<Masked, Out>(out + 8, _mm256_permute2f128_ps(lo, hi, 0x31), gains, m2);
}

// ---- Mono ----------------------------------------------------------------------------

ONDREL_AVX2 __m256 load8(const int8_t* d) {
    return _mm256_cvtepi32_ps(_mm256_cvtepi8_epi32(_mm_loadl_epi64(reinterpret_cast<const __m128i*>(d))));
}
ONDREL_AVX2 __m256 load8(const sample16_t* d) {
    return _mm256_cvtepi32_ps(_mm256_cvtepi16_epi32(_mm_loadu_si128(reinterpret_cast<const __m128i*>(d))));
}

// Samples d[idx] for lane indices below 8 x Span, from contiguous memory.
template <int Span, typename S>
ONDREL_AVX2 __m256 pick8(const S* d, __m256i idx) {
    const __m256 low = _mm256_permutevar8x32_ps(load8(d), idx);
    if constexpr (Span == 1) {
        return low;
    } else {
        const __m256 high = _mm256_permutevar8x32_ps(load8(d + 8), idx);
        return _mm256_blendv_ps(low, high, _mm256_castsi256_ps(_mm256_cmpgt_epi32(idx, _mm256_set1_epi32(7))));
    }
}

// The (interpolated) samples at offsets x, whole = their whole parts; lanes outside
// lanes_mask are not read by the gather.
template <int Span, typename S, bool Interpolate>
ONDREL_AVX2 __m256 mono_samples8(const S* d, __m256 x, __m256i whole, __m256i lanes_mask) {
    __m256 a, b;
    if constexpr (Span == kGather) {
        // One 32-bit read holds a sample and its right neighbour.
        const int* words = reinterpret_cast<const int*>(d);
        const __m256i pair = _mm256_mask_i32gather_epi32(_mm256_setzero_si256(), words, whole, lanes_mask, sizeof(S));
        constexpr int kBits = 8 * sizeof(S);
        a = _mm256_cvtepi32_ps(_mm256_srai_epi32(_mm256_slli_epi32(pair, 32 - kBits), 32 - kBits));
        b = _mm256_cvtepi32_ps(_mm256_srai_epi32(_mm256_slli_epi32(pair, 32 - 2 * kBits), 32 - kBits));
    } else {
        const int w = _mm_cvtsi128_si32(_mm256_castsi256_si128(whole));
        const __m256i idx = _mm256_sub_epi32(whole, _mm256_set1_epi32(w));
        a = pick8<Span>(d + w, idx);
        if constexpr (Interpolate) b = pick8<Span>(d + w + 1, idx);
    }
    if constexpr (!Interpolate) return a;
    return _mm256_fmadd_ps(_mm256_sub_ps(b, a), _mm256_sub_ps(x, _mm256_cvtepi32_ps(whole)), a);
}

template <int Span, typename S, bool Interpolate, SendMode Send, OutMode Out>
struct MonoGroups {
    const S* d;
    float* out;
    float* send;
    __m256 vf, vstep, gains, gsend;

    // Frames i..i+7 (the first n of them when Masked), k holding their numbers.
    template <bool Masked>
    ONDREL_AVX2 void group(int i, __m256 k, int n) const {
        const __m256 x = _mm256_add_ps(vf, _mm256_mul_ps(k, vstep));
        const __m256i whole = _mm256_cvttps_epi32(x);
        const __m256i mask = Masked ? lanes_below(n) : _mm256_set1_epi32(-1);
        const __m256 s = mono_samples8<Span, S, Interpolate>(d, x, whole, mask);
        put_frames8<Masked, Out>(_mm256_unpacklo_ps(s, s), _mm256_unpackhi_ps(s, s), out + 2 * i, gains, n);
        if constexpr (Send != SendMode::None) {
            const __m256 old = Send == SendMode::Add ? _mm256_maskload_ps(send + i, mask) : _mm256_setzero_ps();
            const __m256 sent = _mm256_fmadd_ps(s, gsend, old);
            if constexpr (Masked)
                _mm256_maskstore_ps(send + i, mask, sent);
            else
                _mm256_storeu_ps(send + i, sent);
        }
    }

    ONDREL_AVX2 void run(int count) const {
        __m256 k = _mm256_setr_ps(0, 1, 2, 3, 4, 5, 6, 7);  // frame numbers, exact in float
        const __m256 eight = _mm256_set1_ps(8.0f);
        int i = 0;
        for (; i + 8 <= count; i += 8, k = _mm256_add_ps(k, eight)) group<false>(i, k, 8);
        if (i < count) group<true>(i, k, count - i);
    }
};

template <int Span, typename S, bool Interpolate, SendMode Send, OutMode Out>
ONDREL_AVX2 void mono_groups(const S* d, float f, float step, int count, float* out, float* send,
                             const MixGains& g) {
    const MonoGroups<Span, S, Interpolate, Send, Out> groups{
        d,
        out,
        send,
        _mm256_set1_ps(f),
        _mm256_set1_ps(step),
        _mm256_setr_ps(g.left, g.right, g.left, g.right, g.left, g.right, g.left, g.right),
        _mm256_set1_ps(g.send)};
    groups.run(count);
}

template <typename S, bool Interpolate, SendMode Send, OutMode Out>
__attribute__((target("avx2,fma"))) double mix_mono(const void* data, int64_t pos, double f, double step,
                                                    int count, float* out, float* send, const MixGains& g) {
    const S* d = static_cast<const S*>(data) + pos;
    const float ff = static_cast<float>(f);
    const float fstep = static_cast<float>(step);
    if (fstep < kSpanStep)
        mono_groups<1, S, Interpolate, Send, Out>(d, ff, fstep, count, out, send, g);
    else if (fstep < 2 * kSpanStep)
        mono_groups<2, S, Interpolate, Send, Out>(d, ff, fstep, count, out, send, g);
    else
        mono_groups<kGather, S, Interpolate, Send, Out>(d, ff, fstep, count, out, send, g);
    return f + count * step;
}

// ---- Stereo --------------------------------------------------------------------------

// Eight stereo frames from d, one a 32-bit lane (8-bit frames sign-extended from 16 bits).
template <typename S>
ONDREL_AVX2 __m256i load_frames8(const S* d) {
    if constexpr (sizeof(S) == 1)
        return _mm256_cvtepi16_epi32(_mm_loadu_si128(reinterpret_cast<const __m128i*>(d)));
    else
        return _mm256_loadu_si256(reinterpret_cast<const __m256i*>(d));
}

// The frames at whole (a 32-bit lane each, left channel in the low bits); lanes outside
// lanes_mask are not read by the gather.
template <int Span, typename S>
ONDREL_AVX2 __m256i stereo_frames8(const S* d, __m256i whole, __m256i lanes_mask) {
    if constexpr (Span == kGather) {
        return _mm256_mask_i32gather_epi32(_mm256_setzero_si256(), reinterpret_cast<const int*>(d), whole,
                                           lanes_mask, 2 * sizeof(S));
    } else {
        const int w = _mm_cvtsi128_si32(_mm256_castsi256_si128(whole));
        const __m256i idx = _mm256_sub_epi32(whole, _mm256_set1_epi32(w));
        const __m256i low = _mm256_permutevar8x32_epi32(load_frames8(d + 2 * w), idx);
        if constexpr (Span == 1) return low;
        const __m256i high = _mm256_permutevar8x32_epi32(load_frames8(d + 2 * w + 16), idx);
        return _mm256_blendv_epi8(low, high, _mm256_cmpgt_epi32(idx, _mm256_set1_epi32(7)));
    }
}

template <int Span, typename S, OutMode Out>
struct StereoGroups {
    const S* d;
    float* out;
    __m256d vf, vstep;
    __m256 gains;

    template <bool Masked>
    ONDREL_AVX2 void group(int i, __m256d k, int n) const {
        const __m128i first = _mm256_cvttpd_epi32(_mm256_add_pd(vf, _mm256_mul_pd(k, vstep)));
        const __m256d k4 = _mm256_add_pd(k, _mm256_set1_pd(4));
        const __m128i second = _mm256_cvttpd_epi32(_mm256_add_pd(vf, _mm256_mul_pd(k4, vstep)));
        const __m256i whole = _mm256_set_m128i(second, first);
        const __m256i frames =
            stereo_frames8<Span, S>(d, whole, Masked ? lanes_below(n) : _mm256_set1_epi32(-1));
        constexpr int kBits = 8 * sizeof(S);
        const __m256 l = _mm256_cvtepi32_ps(_mm256_srai_epi32(_mm256_slli_epi32(frames, 32 - kBits), 32 - kBits));
        const __m256 r =
            _mm256_cvtepi32_ps(_mm256_srai_epi32(_mm256_slli_epi32(frames, 32 - 2 * kBits), 32 - kBits));
        put_frames8<Masked, Out>(_mm256_unpacklo_ps(l, r), _mm256_unpackhi_ps(l, r), out + 2 * i, gains, n);
    }

    ONDREL_AVX2 void run(int count) const {
        __m256d k = _mm256_setr_pd(0, 1, 2, 3);
        const __m256d eight = _mm256_set1_pd(8);
        int i = 0;
        for (; i + 8 <= count; i += 8, k = _mm256_add_pd(k, eight)) group<false>(i, k, 8);
        if (i < count) group<true>(i, k, count - i);
    }
};

template <int Span, typename S, OutMode Out>
ONDREL_AVX2 void stereo_groups(const S* d, double f, double step, int count, float* out, const MixGains& g) {
    const StereoGroups<Span, S, Out> groups{
        d, out, _mm256_set1_pd(f), _mm256_set1_pd(step),
        _mm256_setr_ps(g.left, g.right, g.left, g.right, g.left, g.right, g.left, g.right)};
    groups.run(count);
}

template <typename S, OutMode Out>
__attribute__((target("avx2,fma"))) double mix_stereo(const void* data, int64_t pos, double f, double step,
                                                      int count, float* out, const MixGains& g) {
    const S* d = static_cast<const S*>(data) + 2 * pos;
    if (step < kSpanStep)
        stereo_groups<1, S, Out>(d, f, step, count, out, g);
    else if (step < 2 * kSpanStep)
        stereo_groups<2, S, Out>(d, f, step, count, out, g);
    else
        stereo_groups<kGather, S, Out>(d, f, step, count, out, g);
    return f + count * step;
}

template <typename S, OutMode Out>
MonoMixFn pick_mono(bool interpolate, SendMode send) {
    switch (send) {
        case SendMode::None:
            return interpolate ? mix_mono<S, true, SendMode::None, Out> : mix_mono<S, false, SendMode::None, Out>;
        case SendMode::First:
            return interpolate ? mix_mono<S, true, SendMode::First, Out> : mix_mono<S, false, SendMode::First, Out>;
        case SendMode::Add:
            return interpolate ? mix_mono<S, true, SendMode::Add, Out> : mix_mono<S, false, SendMode::Add, Out>;
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

}  // namespace

MonoMixFn mono_mixer_avx2(bool bits16, bool interpolate, SendMode send, OutMode out) {
    return out == OutMode::Set ? pick_mono<OutMode::Set>(bits16, interpolate, send)
                               : pick_mono<OutMode::Add>(bits16, interpolate, send);
}

StereoMixFn stereo_mixer_avx2(bool bits16, OutMode out) {
    return out == OutMode::Set ? pick_stereo<OutMode::Set>(bits16) : pick_stereo<OutMode::Add>(bits16);
}

}  // namespace ondrel
