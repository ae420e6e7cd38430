#include "render/output_clip.h"

#include <immintrin.h>

#include <algorithm>
#include <cmath>

namespace ondrel {

namespace {

// A NaN (from an effect unit driven wild) goes out as -1, as the vector max makes it, never
// to the device.
Peaks clip_frames(float* out, int from, int frames, Peaks p) {
    for (int i = from; i < frames; ++i) {
        const float l = std::min(std::max(-1.0f, out[2 * i] * 0.25f), 1.0f);
        const float r = std::min(std::max(-1.0f, out[2 * i + 1] * 0.25f), 1.0f);
        out[2 * i] = l;
        out[2 * i + 1] = r;
        p.left = std::max(p.left, std::fabs(l));
        p.right = std::max(p.right, std::fabs(r));
    }
    return p;
}

// Clips eight values in place; returns their magnitudes.
__attribute__((target("avx2"))) inline __m256 clip8(float* o) {
    const __m256 v = _mm256_min_ps(
        _mm256_max_ps(_mm256_mul_ps(_mm256_loadu_ps(o), _mm256_set1_ps(0.25f)), _mm256_set1_ps(-1.0f)),
        _mm256_set1_ps(1.0f));
    _mm256_storeu_ps(o, v);
    return _mm256_and_ps(v, _mm256_castsi256_ps(_mm256_set1_epi32(0x7fffffff)));
}

__attribute__((target("avx2"))) Peaks clip_avx2(float* out, int frames) {
    // Two peak registers, so the maxima do not wait on each other.
    __m256 peak = _mm256_setzero_ps();
    __m256 peak2 = _mm256_setzero_ps();
    int i = 0;
    for (; i + 8 <= frames; i += 8) {  // four stereo frames a vector: L R L R L R L R
        peak = _mm256_max_ps(peak, clip8(out + 2 * i));
        peak2 = _mm256_max_ps(peak2, clip8(out + 2 * i + 8));
    }
    for (; i + 4 <= frames; i += 4) peak = _mm256_max_ps(peak, clip8(out + 2 * i));
    alignas(32) float lanes[8];
    _mm256_store_ps(lanes, _mm256_max_ps(peak, peak2));
    Peaks p{std::max({lanes[0], lanes[2], lanes[4], lanes[6]}),
            std::max({lanes[1], lanes[3], lanes[5], lanes[7]})};
    return clip_frames(out, i, frames, p);
}

// GCC 12's AVX-512 min and max start from a self-initialised "undefined" vector, which its
// own uninitialised-value warnings then report.
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wuninitialized"
#pragma GCC diagnostic ignored "-Wmaybe-uninitialized"

// Clips sixteen scaled values (eight frames) in place, only those in mask; returns their
// magnitudes.
__attribute__((target("avx512f"))) inline __m512 clip16(float* o, __mmask16 mask) {
    const __m512 v = _mm512_min_ps(_mm512_max_ps(_mm512_maskz_loadu_ps(mask, o), _mm512_set1_ps(-1.0f)),
                                   _mm512_set1_ps(1.0f));
    _mm512_mask_storeu_ps(o, mask, v);
    return _mm512_abs_ps(v);
}

// Each channel's largest lane: left in the even lanes, right in the odd.
__attribute__((target("avx512f"))) Peaks channel_peaks(__m512 magnitudes) {
    alignas(64) float lanes[16];
    _mm512_store_ps(lanes, magnitudes);
    Peaks p{0, 0};
    for (int k = 0; k < 16; k += 2) {
        p.left = std::max(p.left, lanes[k]);
        p.right = std::max(p.right, lanes[k + 1]);
    }
    return p;
}

// Clips values already scaled.
__attribute__((target("avx512f"))) Peaks clip_scaled_avx512(float* out, int frames) {
    __m512 peak = _mm512_setzero_ps();
    __m512 peak2 = _mm512_setzero_ps();
    int i = 0;
    for (; i + 16 <= frames; i += 16) {
        peak = _mm512_max_ps(peak, clip16(out + 2 * i, 0xffff));
        peak2 = _mm512_max_ps(peak2, clip16(out + 2 * i + 16, 0xffff));
    }
    for (; i < frames; i += 8) {  // the last frames under a mask
        const int values = 2 * std::min(frames - i, 8);
        peak = _mm512_max_ps(peak, clip16(out + 2 * i, static_cast<__mmask16>((1u << values) - 1)));
    }
    return channel_peaks(_mm512_max_ps(peak, peak2));
}

// Scales sixteen values in place and widens the running extremes. max and min pass a NaN by,
// so it is looked for apart.
__attribute__((target("avx512f"))) inline void scale16(float* o, __mmask16 mask, __m512& high, __m512& low,
                                                       __mmask16& nan) {
    const __m512 v = _mm512_mul_ps(_mm512_maskz_loadu_ps(mask, o), _mm512_set1_ps(0.25f));
    _mm512_mask_storeu_ps(o, mask, v);
    high = _mm512_max_ps(v, high);
    low = _mm512_min_ps(v, low);
    nan = static_cast<__mmask16>(nan | _mm512_cmp_ps_mask(v, v, _CMP_UNORD_Q));
}

// Music seldom needs clipping once scaled: a pass that only scales and finds the extremes
// does less per value, and the clip runs over the scaled values only when they call for it.
__attribute__((target("avx512f"))) Peaks clip_avx512(float* out, int frames) {
    __m512 high = _mm512_setzero_ps(), high2 = _mm512_setzero_ps();
    __m512 low = _mm512_setzero_ps(), low2 = _mm512_setzero_ps();
    __mmask16 nan = 0;
    int i = 0;
    for (; i + 16 <= frames; i += 16) {
        scale16(out + 2 * i, 0xffff, high, low, nan);
        scale16(out + 2 * i + 16, 0xffff, high2, low2, nan);
    }
    for (; i < frames; i += 8) {
        const int values = 2 * std::min(frames - i, 8);
        scale16(out + 2 * i, static_cast<__mmask16>((1u << values) - 1), high, low, nan);
    }
    high = _mm512_max_ps(high, high2);
    low = _mm512_min_ps(low, low2);
    const __mmask16 over = _mm512_cmp_ps_mask(high, _mm512_set1_ps(1.0f), _CMP_GT_OQ) |
                           _mm512_cmp_ps_mask(low, _mm512_set1_ps(-1.0f), _CMP_LT_OQ);
    if (over == 0 && nan == 0)
        return channel_peaks(_mm512_max_ps(high, _mm512_sub_ps(_mm512_setzero_ps(), low)));
    return clip_scaled_avx512(out, frames);
}

#pragma GCC diagnostic pop

}  // namespace

Peaks headroom_and_clip(float* out, int frames, LoopSet set) {
    if (set == LoopSet::Best && has_avx512()) return clip_avx512(out, frames);
    if (set != LoopSet::Portable && has_avx2()) return clip_avx2(out, frames);
    return clip_frames(out, 0, frames, {0, 0});
}

}  // namespace ondrel
