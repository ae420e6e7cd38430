#include "render/reverb_dhs.h"

#include <algorithm>
#include <new>

#include "render/reverb.h"

namespace ondrel {

ReverbDHS::ReverbDHS() {
    combs_.reset(new (std::nothrow) float[kCombs * kCombFloats]());
    delay_.reset(new (std::nothrow) float[kDelayFloats]());
    ok_ = combs_ && delay_;
}

void ReverbDHS::set_delay_us(int field, uint32_t microseconds) {
    if (field >= 0 && field < kCombs) length_[field] = reverb_frames(microseconds, kCombFloats - 1);
    if (field == 9) delay_length_ = microseconds ? reverb_frames(microseconds, 44099) : 0;
}

void ReverbDHS::set_feedback(int comb, int thousandths) {
    if (comb >= 0 && comb < kCombs) feedback_[comb] = thousandths / 1000.0f;
}

void ReverbDHS::set_tap(int comb, int thousandths) {
    if (comb >= 0 && comb < kCombs) tap_[comb] = thousandths / 1000.0f;
}

void ReverbDHS::compute(const float* in, float* out, long frames, float gain_left, float gain_right) {
    if (!ok_) return;
    const bool delayed = delay_length_ != 0;
    std::array<OnePoleCoefficients, kCombs> k{};
    for (int c = 0; c < kCombs; ++c) {
        k[c] = OnePoleCoefficients::for_cutoff(cutoff_[c]);
        if (cursor_[c] >= length_[c]) cursor_[c] = 0;
    }
    if (delay_cursor_ >= delay_length_) delay_cursor_ = 0;
    long done = 0;
    while (done < frames) {
        long block = frames - done;
        for (int c = 0; c < kCombs; ++c) block = std::min<long>(block, length_[c] - cursor_[c]);
        if (delayed) block = std::min<long>(block, delay_length_ - delay_cursor_);
        std::array<float*, kCombs> p{};
        for (int c = 0; c < kCombs; ++c) p[c] = combs_.get() + c * kCombFloats + cursor_[c];
        float* dp = delay_.get() + delay_cursor_;
        for (long i = 0; i < block; ++i) {
            const float x = flush(0.4f * in[done + i]);
            float s = 0;
            for (int c = 0; c < kCombs; ++c) {
                float& cell = p[c][i];
                const float d = flush(cell);
                cell = lowpass_[c].step(x - feedback_[c] * d, k[c]);
                s += tap_[c] * d;
            }
            s = flush(s);
            if (delayed) {
                const float y = flush(dp[i]);
                dp[i] = s * delay_gain_;
                s = y;
            }
            out[2 * (done + i)] += s * gain_left;
            out[2 * (done + i) + 1] -= s * gain_right;
        }
        done += block;
        for (int c = 0; c < kCombs; ++c) {
            cursor_[c] += static_cast<uint32_t>(block);
            if (cursor_[c] >= length_[c]) cursor_[c] = 0;
        }
        if (delayed) {
            delay_cursor_ += static_cast<uint32_t>(block);
            if (delay_cursor_ >= delay_length_) delay_cursor_ = 0;
        }
    }
}

}  // namespace ondrel
