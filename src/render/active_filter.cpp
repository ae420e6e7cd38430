#include "render/active_filter.h"

#include <algorithm>
#include <cmath>

namespace ondrel {

void ActiveFilter::run(const float* send, float* out, int frames, int control, unsigned frequency,
                       float gain_left, float gain_right) {
    fc = static_cast<float>(std::max(frequency, 10u));
    const float g = static_cast<float>(control * 1.2 * 0.00390625 - 0.2);
    const float theta = static_cast<float>(fc * 2 * M_PI / 44100.0);
    // A fixed Q of 1.5, with tan(theta / 2Q) taken as theta / 2Q.
    const float beta = (3 - theta) / (6 + 2 * theta);
    const float gamma = (beta + 0.5f) * std::cos(theta);
    const float alpha = 0.25f - beta * 0.5f;
    // The history in locals, as out could otherwise be taken to alias it.
    float x1 = entrem1, x2 = entrem2, y1 = sortiem1, y2 = sortiem2;
    for (int i = 0; i < frames; ++i) {
        const float s = send[i];
        float y = gamma * y1 + alpha * (s - x2) - beta * y2;
        if (y > -0.0001f && y < 0.0001f) y = 0;  // a branch: predicted, it adds nothing to the chain
        y *= 2 * g;
        // The history keeps the gain, so the gain shapes the resonance too.
        y2 = y1;
        y1 = y;
        x2 = x1;
        x1 = s;
        out[2 * i] += 4 * y * gain_left;
        out[2 * i + 1] += 4 * y * gain_right;
    }
    entrem1 = x1;
    entrem2 = x2;
    sortiem1 = y1;
    sortiem2 = y2;
}

}  // namespace ondrel
