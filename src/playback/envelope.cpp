#include "playback/envelope.h"

#include <algorithm>

namespace ondrel {

float envelope_value(const p_s& sound, int kind, uint64_t position, unsigned long length) {
    // Kind 16 reads the velocity envelope's points.
    const int k = kind == 16 ? 0 : std::clamp(kind, 0, 4);
    int x = 0;
    if (length != 0) x = static_cast<int>(std::min<uint64_t>(position * 255 / length, 255));
    int px[5], level[5];
    for (int j = 0; j < 5; ++j) {
        px[j] = sound.env(k, j) >> 8;
        level[j] = sound.env(k, j) & 0xff;
    }
    // Each segment is reached only with x at or past its first point, so a segment's
    // width is never 0 where it divides.
    int value = 0;
    if (x < px[1])
        value = level[0] + (level[1] - level[0]) * x / px[1];
    else
        for (int j = 2; j <= 4; ++j)
            if (x < px[j]) {
                value = level[j - 1] + (level[j] - level[j - 1]) * (x - px[j - 1]) / (px[j] - px[j - 1]);
                break;
            }
    switch (kind) {
        case 1: return static_cast<float>(value * 2);
        case 2: return static_cast<float>(std::min(value, 127));
        case 3: return static_cast<float>(value);
        default: return static_cast<float>(value) / 128.0f;
    }
}

}  // namespace ondrel
