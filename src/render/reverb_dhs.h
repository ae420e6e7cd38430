#pragma once
#include <array>
#include <cstdint>
#include <memory>

#include "render/denormal.h"

namespace ondrel {

// The reverberator of type 9: five low-passed combs whose feedback is subtracted, summed
// through output taps, with an optional output delay. One instance for every slot of the
// type.
class ReverbDHS {
public:
    static constexpr int kCombs = 5;
    static constexpr uint32_t kCombFloats = 16384;
    static constexpr uint32_t kDelayFloats = 180224 / 4;

    ReverbDHS();
    bool IsOk() const { return ok_; }
    void compute(const float* in, float* out, long frames, float gain_left, float gain_right);

    // Fields 0..4 are the comb lines; field 9 the output delay (0 switches it off).
    void set_delay_us(int field, uint32_t microseconds);
    void set_feedback(int comb, int thousandths);
    void set_tap(int comb, int thousandths);
    void set_output_gain(int thousandths) { delay_gain_ = thousandths / 1000.0f; }
    uint16_t comb_length(int comb) const { return length_[comb]; }
    uint16_t delay_length() const { return delay_length_; }

private:
    static constexpr long kChunk = 64;  // frames a block step works on at most
    std::array<OnePole, 10> lowpass_{};
    std::array<float, 10> cutoff_ = {2000, 2000, 2000, 2000, 2000, 2000, 2000, 2000, 2000, 2000};
    std::array<float, kCombs> feedback_ = {0.818f, 0.5f, 0.573f, 0.552f, 0.699f};
    float delay_gain_ = 1.0f;
    std::array<float, kCombs> tap_ = {0.2f, 0.2f, 0.273f, 0.252f, 0.299f};
    uint16_t delay_length_ = 0;
    std::array<uint16_t, 10> length_ = {6201, 6053, 5951, 5760, 5400};
    std::unique_ptr<float[]> combs_;  // five slots of 16384 floats
    std::unique_ptr<float[]> delay_;
    std::array<uint32_t, kCombs> cursor_{};
    uint32_t delay_cursor_ = 0;
    bool ok_ = false;
};

}  // namespace ondrel
