#pragma once

namespace ondrel {

// The units of the effect slots, run by the mixer once per buffer on each routed slot.
class EffectProcessor {
public:
    virtual ~EffectProcessor() = default;
    // Before the first slot of a buffer.
    virtual void begin_buffer() {}
    // Reads frames mono send values and adds the unit's stereo output into out.
    virtual void run(int slot, int type, const float* send, float* out, int frames, int control,
                     float gain_left, float gain_right) = 0;
};

}  // namespace ondrel
