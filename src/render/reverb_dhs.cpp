#include "render/reverb_dhs.h"

#include <algorithm>
#include <new>

#include "render/low_pass_bank.h"
#include "render/reverb.h"

namespace ondrel {

ReverbDHS::ReverbDHS() {
    combs_.reset(new (std::nothrow) float[kCombs * kCombFloats]());
    delay_.reset(new (std::nothrow) float[kDelayFloats]());
    ok_ = combs_ && delay_;
}

void ReverbDHSSettings::set_delay_us(int field, uint32_t microseconds) {
    if (field >= 0 && field < kCombs) length[field] = reverb_frames(microseconds, kCombFloats - 1);
    if (field == kDelayField) delay_length = microseconds ? reverb_frames(microseconds, 44099) : 0;
}

void ReverbDHSSettings::set_gain(int field, int thousandths) {
    const float g = thousandths / 1000.0f;
    if (field >= 0 && field < kCombs) feedback[field] = g;
    if (field >= kCombs && field < 2 * kCombs) tap[field - kCombs] = g;
    if (field == 2 * kCombs) delay_gain = g;
}

float ReverbDHSSettings::gain(int field) const {
    if (field >= 0 && field < kCombs) return feedback[field];
    if (field >= kCombs && field < 2 * kCombs) return tap[field - kCombs];
    return delay_gain;
}

void ReverbDHS::compute(const float* in, float* out, long frames, float gain_left, float gain_right) {
    if (!ok_) return;
    const bool delayed = s_.delay_length != 0;
    std::array<OnePoleCoefficients, kCombs> k{};
    for (int c = 0; c < kCombs; ++c) {
        k[c] = OnePoleCoefficients::for_cutoff(s_.cutoff[c]);
        if (cursor_[c] >= s_.length[c]) cursor_[c] = 0;
    }
    if (delay_cursor_ >= s_.delay_length) delay_cursor_ = 0;
    long done = 0;
    while (done < frames) {
        // As in the other reverberator: blocks end at the first wrap and hold no more
        // frames than the shortest line, so each step runs over a whole block.
        long block = std::min<long>(frames - done, kChunk);
        for (int c = 0; c < kCombs; ++c) block = std::min<long>(block, s_.length[c] - cursor_[c]);
        for (int c = 0; c < kCombs; ++c) block = std::min<long>(block, s_.length[c]);
        if (delayed) block = std::min<long>(block, s_.delay_length - delay_cursor_);
        std::array<float*, kCombs> p{};
        for (int c = 0; c < kCombs; ++c) p[c] = combs_.get() + c * kCombFloats + cursor_[c];
        float* dp = delay_.get() + delay_cursor_;
        float x[kChunk], s[kChunk], u[kCombs][kChunk];
        for (long i = 0; i < block; ++i) {
            x[i] = flush(0.4f * in[done + i]);
            s[i] = 0.0f;
        }
        for (int c = 0; c < kCombs; ++c)
            for (long i = 0; i < block; ++i) {
                const float d = flush(p[c][i]);
                u[c][i] = x[i] - s_.feedback[c] * d;
                s[i] += s_.tap[c] * d;
            }
        // The low passes, the only serial work, write the lines.
        low_passes(lowpass_.data(), k.data(), u, p.data(), block);
        float* o = out + 2 * done;
        for (long i = 0; i < block; ++i) {
            float v = flush(s[i]);
            if (delayed) {
                const float delayed_v = flush(dp[i]);
                dp[i] = v * s_.delay_gain;
                v = delayed_v;
            }
            o[2 * i] += v * gain_left;
            o[2 * i + 1] -= v * gain_right;
        }
        done += block;
        for (int c = 0; c < kCombs; ++c) {
            cursor_[c] += static_cast<uint32_t>(block);
            if (cursor_[c] >= s_.length[c]) cursor_[c] = 0;
        }
        if (delayed) {
            delay_cursor_ += static_cast<uint32_t>(block);
            if (delay_cursor_ >= s_.delay_length) delay_cursor_ = 0;
        }
    }
}

}  // namespace ondrel
