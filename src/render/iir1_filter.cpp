#include "render/iir1_filter.h"

namespace ondrel {

void Iir1Filter::run(const float* send, float* out, int frames, int control) {
    const float fc = static_cast<float>(control * 0.00390625 * 11025);
    if (fc == 0) return;  // control 0 silences the slot
    const float k = 44100.0f / (fc * 3.1415927f);
    const float feedback = (k - 1) / (k + 1);
    const float gain = 1 / (k + 1);
    // The history in locals: out could otherwise be taken to alias it, putting a store and
    // a reload into every step of the recursion.
    float x1 = flm1, y1 = fdm1;
    for (int i = 0; i < frames; ++i) {
        const float s = send[i];
        const float y = gain * (s + x1) + feedback * y1;
        y1 = y;
        x1 = s;
        out[2 * i] += y;
        out[2 * i + 1] += y;
    }
    flm1 = x1;
    fdm1 = y1;
}

}  // namespace ondrel
