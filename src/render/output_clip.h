#pragma once

#include "render/loop_set.h"

namespace ondrel {

struct Peaks {
    float left;
    float right;
};

// The mixer's headroom: every sample of the interleaved stereo buffer times 0.25, clipped
// to [-1, 1]; returns the largest magnitude of each channel.
Peaks headroom_and_clip(float* out, int frames, LoopSet set = LoopSet::Best);

}  // namespace ondrel
