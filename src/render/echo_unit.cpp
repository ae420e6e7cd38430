#include "render/echo_unit.h"

#include <algorithm>
#include <cstring>

namespace ondrel {

void DelayUnits::echo(EffectSlots& slots, int k, uint32_t delay, uint32_t feedback, bool invert,
                      const float* send, float* out, int frames, float gain_left, float gain_right) {
    if (k < 0 || k >= kEchoUnits) return;
    float* line = slots.echoefx[k].get();
    const uint32_t capacity = slots.sizeecho[k] / 4;
    if (!line || delay == 0) return;  // no memory, no unit
    const uint32_t d = std::min(delay, capacity);
    used[k] = true;
    const float g = feedback / 128.0f;
    const float right_sign = invert ? -1.0f : 1.0f;
    uint32_t& cursor = pechoefx[k];
    if (cursor > d) cursor = 0;
    int i = 0;
    while (i < frames) {
        // Blocks end at the line's end, so the inner loop never tests for the wrap.
        const int block = static_cast<int>(std::min<uint32_t>(d - cursor, static_cast<uint32_t>(frames - i)));
        float* z = line + cursor;
        for (int j = 0; j < block; ++j) {
            const float v = z[j] * g;
            z[j] = (z[j] + send[i + j]) * g;
            out[2 * (i + j)] += v * gain_left;
            out[2 * (i + j) + 1] += right_sign * v * gain_right;
        }
        i += block;
        cursor += static_cast<uint32_t>(block);
        if (cursor >= d) cursor = 0;
    }
}

void DelayUnits::stereo_space(int k, const float* send, float* out, int frames) {
    if (k < 0 || k >= kEchoUnits) return;
    float* line = echoste[k].data();
    uint32_t& cursor = pechoste[k];
    if (cursor > kStereoSpaceFrames) cursor = 0;
    int i = 0;
    while (i < frames) {
        const int block = std::min(kStereoSpaceFrames - static_cast<int>(cursor), frames - i);
        float* d = line + cursor;
        for (int j = 0; j < block; ++j) {
            const float v = d[j];
            d[j] = send[i + j];
            out[2 * (i + j)] += v;
            out[2 * (i + j) + 1] -= v;
        }
        i += block;
        cursor += static_cast<uint32_t>(block);
        if (cursor >= kStereoSpaceFrames) cursor = 0;
    }
}

void DelayUnits::clear(EffectSlots& slots) {
    for (int k = 0; k < kEchoUnits; ++k) {
        if (!used[k]) continue;  // a line never run holds nothing to clear
        used[k] = false;
        if (float* line = slots.echoefx[k].get()) std::memset(line, 0, slots.sizeecho[k]);
        pechoefx[k] = 0;
    }
}

}  // namespace ondrel
