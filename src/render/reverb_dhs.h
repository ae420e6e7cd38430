#pragma once
#include <array>
#include <cstdint>
#include <memory>
#include <utility>

#include "render/denormal.h"

namespace ondrel {

// What the panel of the reverberator of type 9 sets: delays in microseconds for fields
// 0..4 (the comb lines) and 9 (the output delay, 0 switching it off); gains in thousandths
// for fields 0..4 (comb feedbacks), 5..9 (comb output taps) and 10 (the output delay's).
struct ReverbDHSSettings {
    static constexpr int kCombs = 5;
    static constexpr int kDelayField = 9;
    static constexpr int kGains = 11;
    static constexpr uint32_t kCombFloats = 16384;
    std::array<float, 10> cutoff = {2000, 2000, 2000, 2000, 2000, 2000, 2000, 2000, 2000, 2000};
    std::array<float, kCombs> feedback = {0.818f, 0.5f, 0.573f, 0.552f, 0.699f};
    float delay_gain = 1.0f;
    std::array<float, kCombs> tap = {0.2f, 0.2f, 0.273f, 0.252f, 0.299f};
    uint16_t delay_length = 0;
    std::array<uint16_t, 10> length = {6201, 6053, 5951, 5760, 5400};

    void set_delay_us(int field, uint32_t microseconds);
    void set_gain(int field, int thousandths);
    float gain(int field) const;
    bool operator==(const ReverbDHSSettings&) const = default;
};

// The reverberator of type 9: five low-passed combs whose feedback is subtracted, summed
// through output taps, with an optional output delay. One instance for every slot of the
// type.
class ReverbDHS {
public:
    static constexpr int kCombs = ReverbDHSSettings::kCombs;
    static constexpr uint32_t kCombFloats = ReverbDHSSettings::kCombFloats;
    static constexpr uint32_t kDelayFloats = 180224 / 4;

    ReverbDHS();
    bool IsOk() const { return ok_; }
    void compute(const float* in, float* out, long frames, float gain_left, float gain_right);

    // The settings, changed one at a time or exchanged whole (an undo); the audio thread
    // reads them in compute, so callers hold the structure lock around a change.
    void set_delay_us(int field, uint32_t microseconds) { s_.set_delay_us(field, microseconds); }
    void set_gain(int field, int thousandths) { s_.set_gain(field, thousandths); }
    const ReverbDHSSettings& settings() const { return s_; }
    void swap_settings(ReverbDHSSettings& other) { std::swap(s_, other); }
    uint16_t comb_length(int comb) const { return s_.length[comb]; }
    uint16_t delay_length() const { return s_.delay_length; }

private:
    static constexpr long kChunk = 64;  // frames a block step works on at most
    std::array<OnePole, 10> lowpass_{};
    ReverbDHSSettings s_;
    std::unique_ptr<float[]> combs_;  // five slots of 16384 floats
    std::unique_ptr<float[]> delay_;
    std::array<uint32_t, kCombs> cursor_{};
    uint32_t delay_cursor_ = 0;
    bool ok_ = false;
};

}  // namespace ondrel
