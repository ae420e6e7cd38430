#include "playback/tables.h"

#include <cmath>

namespace ondrel {

const std::array<float, 128>& floatnote() {
    static const std::array<float, 128> table = [] {
        std::array<float, 128> t{};
        constexpr double kSemitoneDown = 0.943874312;
        for (int i = 0; i < 60; ++i) t[i] = static_cast<float>(6848.0 * std::pow(kSemitoneDown, i));
        for (int i = 0; i < 68; ++i) t[60 + i] = static_cast<float>(214.0 * std::pow(kSemitoneDown, i));
        return t;
    }();
    return table;
}

float finetune_factor(int finetune) {
    // Signed finetunes from files map onto the same sixteen steps.
    const int f = finetune & 15;
    if (f == 0) return 1.0f;
    const int d = 15 - f;
    if (d <= 7) return static_cast<float>(1.0 + d * 0.059463094 * 0.125);
    return static_cast<float>(1.0 - f * 0.056125688 * 0.125);
}

}  // namespace ondrel
