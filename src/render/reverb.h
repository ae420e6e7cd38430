#pragma once
#include <array>
#include <cstdint>
#include <memory>
#include <utility>

#include "render/denormal.h"

namespace ondrel {

// What the panel of the reverberator of type 10 sets, as the panel types it: a delay in
// microseconds for line 0..6 (four combs, two all-passes, the output delay), a gain in
// thousandths for field 0..6 (the four comb feedbacks, the two all-passes, the output), a
// comb cutoff in Hz.
struct ReverbSettings {
    static constexpr int kLines = 7;
    static constexpr int kGains = 7;
    static constexpr int kCombs = 4;
    std::array<float, kCombs> cutoff = {1000, 2000, 2000, 1500};
    std::array<float, kCombs> feedback = {0.918f, 0.5f, 0.573f, 0.552f};
    std::array<float, 2> allpass = {0.699f, 0.697f};
    float output_gain = 0.184f;
    std::array<uint16_t, kLines> length = {6201, 6053, 5951, 5760, 918, 2488, 506};

    void set_delay_us(int line, uint32_t microseconds);
    void set_gain(int field, int thousandths);
    void set_cutoff(int comb, float hz);
    float gain(int field) const;
    bool operator==(const ReverbSettings&) const = default;
};

// The reverberator of type 10: four low-passed combs, two all-passes and an output delay.
// One instance serves every slot of the type.
class Reverb {
public:
    static constexpr int kLines = ReverbSettings::kLines;
    static constexpr uint32_t kShortLineFloats = 45056 / 4;  // lines 0 to 5
    static constexpr uint32_t kLongLineFloats = 180224 / 4;  // line 6

    Reverb();
    bool IsOk() const { return ok_; }
    // Adds the reverberated send: left += y x gain_left, right -= y x gain_right.
    void compute(const float* in, float* out, long frames, float gain_left, float gain_right);

    // The settings, changed one at a time or exchanged whole (an undo); the audio thread
    // reads them in compute, so callers hold the structure lock around a change.
    void set_delay_us(int line, uint32_t microseconds) { s_.set_delay_us(line, microseconds); }
    void set_gain(int field, int thousandths) { s_.set_gain(field, thousandths); }
    void set_cutoff(int comb, float hz) { s_.set_cutoff(comb, hz); }
    const ReverbSettings& settings() const { return s_; }
    void swap_settings(ReverbSettings& other) { std::swap(s_, other); }
    uint16_t length(int line) const { return s_.length[line]; }
    float gain(int field) const { return s_.gain(field); }
    float cutoff(int comb) const { return s_.cutoff[comb]; }

private:
    static constexpr long kChunk = 64;  // frames a block step works on at most
    std::array<OnePole, 4> lowpass_{};
    ReverbSettings s_;
    std::array<std::unique_ptr<float[]>, kLines> line_;
    std::array<uint32_t, kLines> cursor_{};
    bool ok_ = false;
};

// Microseconds to frames at 44100 Hz as the panels convert them, raised to 4 when 3 or
// less, and kept within limit.
uint16_t reverb_frames(uint32_t microseconds, uint32_t limit);
// What a panel shows for a line of frames: the fewest microseconds that convert back to
// it, so that a value shown and typed again changes nothing.
uint32_t reverb_microseconds(uint32_t frames);
// What a panel shows for a gain: thousandths, truncated.
int gain_thousandths(float gain);

}  // namespace ondrel
