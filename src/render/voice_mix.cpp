#include "render/voice_mix.h"

#include <immintrin.h>

namespace ondrel {

namespace {

// Every loop computes the read offset of frame i as f + i x step (a multiply, not a
// running sum), so a vector loop and its scalar tail agree to the bit.

template <typename S>
inline float sample_at(const S* d, int64_t i) {
    return static_cast<float>(d[i]);
}

// Real is the precision of the read offsets: double for the scalar loop, float for the
// tail of the vector loop, which reads its offsets in single precision.
template <typename Real, typename S, bool Interpolate, SendMode Send>
inline void mix_mono_frames(const S* d, Real f, Real step, int from, int count, float* out, float* send,
                            const MixGains& g) {
    for (int i = from; i < count; ++i) {
        const Real x = f + static_cast<Real>(i) * step;
        const int64_t whole = static_cast<int64_t>(x);
        float s = sample_at(d, whole);
        if constexpr (Interpolate) {
            const float b = sample_at(d, whole + 1);  // the slack after the data covers the end
            s = s + (b - s) * static_cast<float>(x - static_cast<Real>(whole));
        }
        out[2 * i] += s * g.left;
        out[2 * i + 1] += s * g.right;
        if constexpr (Send == SendMode::First) send[i] = s * g.send;
        if constexpr (Send == SendMode::Add) send[i] += s * g.send;
    }
}

template <typename S, bool Interpolate, SendMode Send>
double mix_mono(const void* data, int64_t pos, double f, double step, int count, float* out, float* send,
                const MixGains& g) {
    mix_mono_frames<double, S, Interpolate, Send>(static_cast<const S*>(data) + pos, f, step, 0, count, out, send, g);
    return f + count * step;
}

// The vector path reads frame i at offset f + i x step in single precision: eight lanes a
// step, and within a piece (at most 4096 frames) the error stays far below a frame.
// Eight frames a step; one gather fetches both interpolation neighbours of each frame (a
// 32-bit read holds sample i and sample i + 1).
template <typename S, bool Interpolate, SendMode Send>
__attribute__((target("avx2,fma"))) double mix_mono_avx2(const void* data, int64_t pos, double f, double step,
                                                         int count, float* out, float* send,
                                                         const MixGains& g) {
    const S* d = static_cast<const S*>(data) + pos;
    const int* words = reinterpret_cast<const int*>(d);
    const float ff = static_cast<float>(f);
    const float fstep = static_cast<float>(step);
    const __m256 lanes = _mm256_setr_ps(0, 1, 2, 3, 4, 5, 6, 7);
    const __m256 vstep = _mm256_set1_ps(fstep);
    const __m256 vf = _mm256_set1_ps(ff);
    const __m256 gains = _mm256_setr_ps(g.left, g.right, g.left, g.right, g.left, g.right, g.left, g.right);
    const __m256 gsend = _mm256_set1_ps(g.send);
    int i = 0;
    for (; i + 8 <= count; i += 8) {
        const __m256 k = _mm256_add_ps(_mm256_set1_ps(static_cast<float>(i)), lanes);
        const __m256 x = _mm256_add_ps(vf, _mm256_mul_ps(k, vstep));
        const __m256i whole = _mm256_cvttps_epi32(x);
        __m256i a, b;
        if constexpr (sizeof(S) == 1) {
            const __m256i pair = _mm256_i32gather_epi32(words, whole, 1);
            a = _mm256_srai_epi32(_mm256_slli_epi32(pair, 24), 24);
            b = _mm256_srai_epi32(_mm256_slli_epi32(pair, 16), 24);
        } else {
            const __m256i pair = _mm256_i32gather_epi32(words, whole, 2);
            a = _mm256_srai_epi32(_mm256_slli_epi32(pair, 16), 16);
            b = _mm256_srai_epi32(pair, 16);
        }
        __m256 s = _mm256_cvtepi32_ps(a);
        if constexpr (Interpolate) {
            const __m256 frac = _mm256_sub_ps(x, _mm256_cvtepi32_ps(whole));
            s = _mm256_add_ps(s, _mm256_mul_ps(_mm256_sub_ps(_mm256_cvtepi32_ps(b), s), frac));
        } else {
            (void)b;
        }
        // [s0 s0 s1 s1 | s4 s4 s5 s5] and [s2 s2 s3 s3 | s6 s6 s7 s7] into frame order.
        const __m256 lo = _mm256_unpacklo_ps(s, s);
        const __m256 hi = _mm256_unpackhi_ps(s, s);
        float* o = out + 2 * i;
        _mm256_storeu_ps(
            o, _mm256_add_ps(_mm256_loadu_ps(o), _mm256_mul_ps(_mm256_permute2f128_ps(lo, hi, 0x20), gains)));
        _mm256_storeu_ps(o + 8, _mm256_add_ps(_mm256_loadu_ps(o + 8),
                                              _mm256_mul_ps(_mm256_permute2f128_ps(lo, hi, 0x31), gains)));
        if constexpr (Send == SendMode::First) _mm256_storeu_ps(send + i, _mm256_mul_ps(s, gsend));
        if constexpr (Send == SendMode::Add)
            _mm256_storeu_ps(send + i, _mm256_add_ps(_mm256_loadu_ps(send + i), _mm256_mul_ps(s, gsend)));
    }
    mix_mono_frames<float, S, Interpolate, Send>(d, ff, fstep, i, count, out, send, g);
    return f + count * step;
}

template <typename S>
inline void mix_stereo_frames(const S* d, double f, double step, int from, int count, float* out,
                              const MixGains& g) {
    for (int i = from; i < count; ++i) {
        const int64_t whole = static_cast<int64_t>(f + i * step);
        out[2 * i] += g.left * sample_at(d, 2 * whole);
        out[2 * i + 1] += g.right * sample_at(d, 2 * whole + 1);
    }
}

template <typename S>
double mix_stereo(const void* data, int64_t pos, double f, double step, int count, float* out,
                  const MixGains& g) {
    mix_stereo_frames(static_cast<const S*>(data) + 2 * pos, f, step, 0, count, out, g);
    return f + count * step;
}

// Four stereo frames at a time; one gather fetches a frame's two channels.
template <typename S>
__attribute__((target("avx2,fma"))) double mix_stereo_avx2(const void* data, int64_t pos, double f,
                                                           double step, int count, float* out,
                                                           const MixGains& g) {
    const S* d = static_cast<const S*>(data) + 2 * pos;
    const int* words = reinterpret_cast<const int*>(d);
    const __m256d lanes = _mm256_setr_pd(0, 1, 2, 3);
    const __m256d vstep = _mm256_set1_pd(step);
    const __m256d vf = _mm256_set1_pd(f);
    const __m256 gains = _mm256_setr_ps(g.left, g.right, g.left, g.right, g.left, g.right, g.left, g.right);
    int i = 0;
    for (; i + 4 <= count; i += 4) {
        const __m256d k = _mm256_add_pd(_mm256_set1_pd(static_cast<double>(i)), lanes);
        const __m128i whole = _mm256_cvttpd_epi32(_mm256_add_pd(vf, _mm256_mul_pd(k, vstep)));
        __m128i left, right;
        if constexpr (sizeof(S) == 1) {
            const __m128i pair = _mm_i32gather_epi32(words, whole, 2);
            left = _mm_srai_epi32(_mm_slli_epi32(pair, 24), 24);
            right = _mm_srai_epi32(_mm_slli_epi32(pair, 16), 24);
        } else {
            const __m128i pair = _mm_i32gather_epi32(words, whole, 4);
            left = _mm_srai_epi32(_mm_slli_epi32(pair, 16), 16);
            right = _mm_srai_epi32(pair, 16);
        }
        const __m128 l = _mm_cvtepi32_ps(left);
        const __m128 r = _mm_cvtepi32_ps(right);
        const __m256 frames = _mm256_set_m128(_mm_unpackhi_ps(l, r), _mm_unpacklo_ps(l, r));
        float* o = out + 2 * i;
        _mm256_storeu_ps(o, _mm256_add_ps(_mm256_loadu_ps(o), _mm256_mul_ps(gains, frames)));
    }
    mix_stereo_frames(d, f, step, i, count, out, g);
    return f + count * step;
}

bool has_avx2() {
    static const bool yes = __builtin_cpu_supports("avx2") && __builtin_cpu_supports("fma");
    return yes;
}

template <typename S, bool Interpolate, SendMode Send>
MonoMixFn pick() {
    return has_avx2() ? mix_mono_avx2<S, Interpolate, Send> : mix_mono<S, Interpolate, Send>;
}

template <typename S>
MonoMixFn pick_mono(bool interpolate, SendMode send) {
    switch (send) {
        case SendMode::None:
            return interpolate ? pick<S, true, SendMode::None>() : pick<S, false, SendMode::None>();
        case SendMode::First:
            return interpolate ? pick<S, true, SendMode::First>() : pick<S, false, SendMode::First>();
        case SendMode::Add:
            return interpolate ? pick<S, true, SendMode::Add>() : pick<S, false, SendMode::Add>();
    }
    return nullptr;
}

}  // namespace

MonoMixFn mono_mixer(bool bits16, bool interpolate, SendMode send) {
    return bits16 ? pick_mono<sample16_t>(interpolate, send) : pick_mono<int8_t>(interpolate, send);
}

StereoMixFn stereo_mixer(bool bits16) {
    if (has_avx2()) return bits16 ? mix_stereo_avx2<sample16_t> : mix_stereo_avx2<int8_t>;
    return bits16 ? mix_stereo<sample16_t> : mix_stereo<int8_t>;
}

}  // namespace ondrel
