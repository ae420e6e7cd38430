#pragma once
#include <array>
#include <cstdint>
#include <memory>

#include "render/denormal.h"

namespace ondrel {

// The reverberator of type 10: four low-passed combs, two all-passes and an output delay.
// One instance serves every slot of the type.
class Reverb {
public:
    static constexpr int kLines = 7;
    static constexpr uint32_t kShortLineFloats = 45056 / 4;  // lines 0 to 5
    static constexpr uint32_t kLongLineFloats = 180224 / 4;  // line 6

    Reverb();
    bool IsOk() const { return ok_; }
    // Adds the reverberated send: left += y x gain_left, right -= y x gain_right.
    void compute(const float* in, float* out, long frames, float gain_left, float gain_right);

    // Settings, as the panel types them: a delay in microseconds for line 0..6, a gain in
    // thousandths (four comb feedbacks, two all-passes, the output), a comb cutoff in Hz.
    void set_delay_us(int line, uint32_t microseconds);
    void set_gain(int field, int thousandths);
    void set_cutoff(int comb, float hz);
    uint16_t length(int line) const { return length_[line]; }
    float gain(int field) const;
    float cutoff(int comb) const { return cutoff_[comb]; }

private:
    static constexpr long kChunk = 64;  // frames a block step works on at most
    std::array<OnePole, 4> lowpass_{};
    std::array<float, 4> cutoff_ = {1000, 2000, 2000, 1500};
    std::array<float, 4> feedback_ = {0.918f, 0.5f, 0.573f, 0.552f};
    std::array<float, 2> allpass_ = {0.699f, 0.697f};
    float output_gain_ = 0.184f;
    std::array<uint16_t, kLines> length_ = {6201, 6053, 5951, 5760, 918, 2488, 506};
    std::array<std::unique_ptr<float[]>, kLines> line_;
    std::array<uint32_t, kLines> cursor_{};
    bool ok_ = false;
};

// Microseconds to frames at 44100 Hz as the panels convert them, raised to 4 when 3 or
// less, and kept within limit.
uint16_t reverb_frames(uint32_t microseconds, uint32_t limit);

}  // namespace ondrel
