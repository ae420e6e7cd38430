#pragma once
#include <array>
#include <cstdint>

namespace ondrel {

// Note periods, Amiga style (larger is lower): 6848 x 0.943874312^i for i below 60, then
// 214 x 0.943874312^i again from exactly 214 so that rounding does not drift.
const std::array<float, 128>& floatnote();

// The positive half of a sine scaled to 255, for vibrato.
inline constexpr std::array<uint8_t, 32> a_sin = {0,   24,  49,  74,  97,  120, 141, 161, 180, 197, 212,
                                                  224, 235, 244, 250, 253, 255, 253, 250, 244, 235, 224,
                                                  212, 197, 180, 161, 141, 120, 97,  74,  49,  24};

// Period factor of a finetune step. Finetune 15 and 0 give 1.0, 8 gives 7/8 of a
// semitone of period: one step off the usual signed nibble, which songs rely on.
float finetune_factor(int finetune);

inline constexpr float kPeriodMin = 16.0f;
inline constexpr float kPeriodMax = 6848.0f;
inline constexpr float kVibratoPeriodMin = 2.0f;

}  // namespace ondrel
