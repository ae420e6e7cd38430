#pragma once
#include <array>
#include <cstdint>

#include "song/effect_slots.h"

namespace ondrel {

// The feedback delays of type 11 and the 512-frame cross delays of type 12 ("Stereo
// space"), one instance per slot of the type: the basic slot is instance 0, clones 1, 2...
class DelayUnits {
public:
    static constexpr int kStereoSpaceFrames = 512;

    // Echo instance k over its line in slots (the song's delay, feedback and invert flag).
    void echo(EffectSlots& slots, int k, uint32_t delay, uint32_t feedback, bool invert, const float* send,
              float* out, int frames, float gain_left, float gain_right);
    void stereo_space(int k, const float* send, float* out, int frames);
    // Clears every echo line and puts its cursor back to its start.
    void clear(EffectSlots& slots);

    std::array<uint32_t, kEchoUnits> pechoefx{};  // cursors, in floats from the line start
    std::array<bool, kEchoUnits> used{};          // lines written since they were last cleared
    std::array<std::array<float, kStereoSpaceFrames>, kEchoUnits> echoste{};
    std::array<uint32_t, kEchoUnits> pechoste{};
};

}  // namespace ondrel
