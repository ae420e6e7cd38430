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

constexpr float kContiguousStep = 0.99f;  // a span of 1 less room for rounding

// Eight samples from d as floats.
__attribute__((target("avx2"))) inline __m256 load8(const int8_t* d) {
    return _mm256_cvtepi32_ps(_mm256_cvtepi8_epi32(_mm_loadl_epi64(reinterpret_cast<const __m128i*>(d))));
}
__attribute__((target("avx2"))) inline __m256 load8(const sample16_t* d) {
    return _mm256_cvtepi32_ps(_mm256_cvtepi16_epi32(_mm_loadu_si128(reinterpret_cast<const __m128i*>(d))));
}

// Adds eight mono frames s into interleaved out at the gains, and into send (set or added)
// when there is one.
__attribute__((target("avx2,fma"))) inline void accumulate8(__m256 s, float* out, float* send, __m256 gains,
                                                        __m256 gsend, bool add_to_send) {
    // [s0 s0 s1 s1 | s4 s4 s5 s5] and [s2 s2 s3 s3 | s6 s6 s7 s7] into frame order.
    const __m256 lo = _mm256_unpacklo_ps(s, s);
    const __m256 hi = _mm256_unpackhi_ps(s, s);
    _mm256_storeu_ps(out, _mm256_fmadd_ps(_mm256_permute2f128_ps(lo, hi, 0x20), gains, _mm256_loadu_ps(out)));
    _mm256_storeu_ps(out + 8,
                     _mm256_fmadd_ps(_mm256_permute2f128_ps(lo, hi, 0x31), gains, _mm256_loadu_ps(out + 8)));
    if (send)
        _mm256_storeu_ps(send, add_to_send ? _mm256_fmadd_ps(s, gsend, _mm256_loadu_ps(send)) : _mm256_mul_ps(s, gsend));
}

// Samples d[idx] for eight lane indices below 8 x Span, read from contiguous memory.
template <int Span, typename S>
__attribute__((target("avx2"))) inline __m256 pick8(const S* d, __m256i idx) {
    const __m256 low = _mm256_permutevar8x32_ps(load8(d), idx);
    if constexpr (Span == 1) {
        return low;
    } else {
        const __m256 high = _mm256_permutevar8x32_ps(load8(d + 8), idx);
        return _mm256_blendv_ps(low, high, _mm256_castsi256_ps(_mm256_cmpgt_epi32(idx, _mm256_set1_epi32(7))));
    }
}

// Steps below Span: eight frames span at most 8 x Span + 1 samples, so contiguous loads
// and lane permutes give both neighbours without a gather. Returns the frames done.
template <int Span, typename S, bool Interpolate, SendMode Send>
__attribute__((target("avx2,fma"))) int mix_mono_contiguous(const S* d, float f, float step, int count,
                                                            float* out, float* send, const MixGains& g) {
    const __m256 vstep = _mm256_set1_ps(step);
    const __m256 vf = _mm256_set1_ps(f);
    const __m256 gains = _mm256_setr_ps(g.left, g.right, g.left, g.right, g.left, g.right, g.left, g.right);
    const __m256 gsend = _mm256_set1_ps(g.send);
    const __m256 eight = _mm256_set1_ps(8.0f);
    __m256 k = _mm256_setr_ps(0, 1, 2, 3, 4, 5, 6, 7);  // frame numbers, exact in single precision
    int i = 0;
    for (; i + 8 <= count; i += 8) {
        const __m256 x = _mm256_add_ps(vf, _mm256_mul_ps(k, vstep));
        k = _mm256_add_ps(k, eight);
        const __m256i whole = _mm256_cvttps_epi32(x);
        const int w = _mm_cvtsi128_si32(_mm256_castsi256_si128(whole));
        const __m256i idx = _mm256_sub_epi32(whole, _mm256_set1_epi32(w));
        __m256 s = pick8<Span>(d + w, idx);
        if constexpr (Interpolate) {
            const __m256 b = pick8<Span>(d + w + 1, idx);
            const __m256 frac = _mm256_sub_ps(x, _mm256_cvtepi32_ps(whole));
            s = _mm256_fmadd_ps(_mm256_sub_ps(b, s), frac, s);
        }
        accumulate8(s, out + 2 * i, Send == SendMode::None ? nullptr : send + i, gains, gsend,
                    Send == SendMode::Add);
    }
    return i;
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
    if (fstep < kContiguousStep)
        i = mix_mono_contiguous<1, S, Interpolate, Send>(d, ff, fstep, count, out, send, g);
    else if (fstep < 2 * kContiguousStep)
        i = mix_mono_contiguous<2, S, Interpolate, Send>(d, ff, fstep, count, out, send, g);
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
        accumulate8(s, out + 2 * i, Send == SendMode::None ? nullptr : send + i, gains, gsend,
                    Send == SendMode::Add);
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

// Eight stereo frames from d, one a 32-bit lane (8-bit frames sign-extended from 16 bits).
template <typename S>
__attribute__((target("avx2"))) inline __m256i load_frames8(const S* d) {
    if constexpr (sizeof(S) == 1)
        return _mm256_cvtepi16_epi32(_mm_loadu_si128(reinterpret_cast<const __m128i*>(d)));
    else
        return _mm256_loadu_si256(reinterpret_cast<const __m256i*>(d));
}

// The frames at eight lane indices below 8 x Span, read from contiguous memory.
template <int Span, typename S>
__attribute__((target("avx2"))) inline __m256i pick_frames8(const S* d, __m256i idx) {
    const __m256i low = _mm256_permutevar8x32_epi32(load_frames8(d), idx);
    if constexpr (Span == 1) {
        return low;
    } else {
        const __m256i high = _mm256_permutevar8x32_epi32(load_frames8(d + 16), idx);
        return _mm256_blendv_epi8(low, high, _mm256_cmpgt_epi32(idx, _mm256_set1_epi32(7)));
    }
}

// Steps below Span: eight stereo frames from contiguous loads and a lane permute.
// Returns the frames done.
template <int Span, typename S>
__attribute__((target("avx2,fma"))) int mix_stereo_contiguous(const S* d, double f, double step, int count,
                                                              float* out, const MixGains& g) {
    const __m256d lanes = _mm256_setr_pd(0, 1, 2, 3);
    const __m256d four = _mm256_set1_pd(4);
    const __m256d vstep = _mm256_set1_pd(step);
    const __m256d vf = _mm256_set1_pd(f);
    const __m256 gains = _mm256_setr_ps(g.left, g.right, g.left, g.right, g.left, g.right, g.left, g.right);
    int i = 0;
    for (; i + 8 <= count; i += 8) {
        const __m256d k = _mm256_add_pd(_mm256_set1_pd(static_cast<double>(i)), lanes);
        const __m128i first = _mm256_cvttpd_epi32(_mm256_add_pd(vf, _mm256_mul_pd(k, vstep)));
        const __m128i second = _mm256_cvttpd_epi32(_mm256_add_pd(vf, _mm256_mul_pd(_mm256_add_pd(k, four), vstep)));
        const int w = _mm_cvtsi128_si32(first);
        const __m256i idx = _mm256_sub_epi32(_mm256_set_m128i(second, first), _mm256_set1_epi32(w));
        const __m256i frames = pick_frames8<Span>(d + 2 * w, idx);
        __m256i left, right;
        if constexpr (sizeof(S) == 1) {
            left = _mm256_srai_epi32(_mm256_slli_epi32(frames, 24), 24);
            right = _mm256_srai_epi32(_mm256_slli_epi32(frames, 16), 24);
        } else {
            left = _mm256_srai_epi32(_mm256_slli_epi32(frames, 16), 16);
            right = _mm256_srai_epi32(frames, 16);
        }
        const __m256 l = _mm256_cvtepi32_ps(left);
        const __m256 r = _mm256_cvtepi32_ps(right);
        // [l0 r0 l1 r1 | l4 r4 l5 r5] and [l2 r2 l3 r3 | l6 r6 l7 r7] into frame order.
        const __m256 lo = _mm256_unpacklo_ps(l, r);
        const __m256 hi = _mm256_unpackhi_ps(l, r);
        float* o = out + 2 * i;
        _mm256_storeu_ps(o, _mm256_fmadd_ps(_mm256_permute2f128_ps(lo, hi, 0x20), gains, _mm256_loadu_ps(o)));
        _mm256_storeu_ps(o + 8,
                         _mm256_fmadd_ps(_mm256_permute2f128_ps(lo, hi, 0x31), gains, _mm256_loadu_ps(o + 8)));
    }
    return i;
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
    if (step < kContiguousStep)
        i = mix_stereo_contiguous<1>(d, f, step, count, out, g);
    else if (step < 2 * kContiguousStep)
        i = mix_stereo_contiguous<2>(d, f, step, count, out, g);
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
MonoMixFn pick(bool vector) {
    return vector && has_avx2() ? mix_mono_avx2<S, Interpolate, Send> : mix_mono<S, Interpolate, Send>;
}

template <typename S>
MonoMixFn pick_mono(bool interpolate, SendMode send, bool vector) {
    switch (send) {
        case SendMode::None:
            return interpolate ? pick<S, true, SendMode::None>(vector) : pick<S, false, SendMode::None>(vector);
        case SendMode::First:
            return interpolate ? pick<S, true, SendMode::First>(vector) : pick<S, false, SendMode::First>(vector);
        case SendMode::Add:
            return interpolate ? pick<S, true, SendMode::Add>(vector) : pick<S, false, SendMode::Add>(vector);
    }
    return nullptr;
}

}  // namespace

MonoMixFn mono_mixer(bool bits16, bool interpolate, SendMode send, bool vector) {
    return bits16 ? pick_mono<sample16_t>(interpolate, send, vector) : pick_mono<int8_t>(interpolate, send, vector);
}

StereoMixFn stereo_mixer(bool bits16, bool vector) {
    if (vector && has_avx2()) return bits16 ? mix_stereo_avx2<sample16_t> : mix_stereo_avx2<int8_t>;
    return bits16 ? mix_stereo<sample16_t> : mix_stereo<int8_t>;
}

}  // namespace ondrel
