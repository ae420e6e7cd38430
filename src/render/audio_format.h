#pragma once
#include <cstdint>

namespace ondrel {

inline constexpr uint32_t kFormatFloat = 0x24;  // 32-bit float samples
inline constexpr uint32_t kFormatShort = 0x2;   // 16-bit signed samples
inline constexpr double kOutputRate = 44100.0;

// What the audio device hands the render callback along with a buffer.
struct AudioFormat {
    float frame_rate = 44100.0f;
    uint32_t channel_count = 2;
    uint32_t format = kFormatFloat;
};

}  // namespace ondrel
