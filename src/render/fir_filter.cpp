#include "render/fir_filter.h"

#include <algorithm>
#include <cmath>

namespace ondrel {

void FirFilter::calcfilter(int type) {
    const double fn = fc / 44100.0;
    for (int n = -7; n <= 7; ++n) {
        const int i = n + 7;
        double h;
        if (n == 0) {
            h = 2 * fn;
        } else {
            const double w = n * 6.2831855 * fn;
            h = w == 0 ? 0 : 2 * fn * std::sin(w) / w;
        }
        // A Blackman window over 15 points rather than 14: tap 0 weighs 0, tap 14 does
        // not. The response the songs were made with.
        h *= 0.42 - 0.5 * std::cos(2 * M_PI * i / 15) + 0.08 * std::cos(4 * M_PI * i / 15);
        coefc[i] = static_cast<float>(h);
    }
    if (type == 3) {
        for (int i = 0; i < 15; ++i)
            if (i != 7) coefc[i] = -coefc[i];
        coefc[7] = 1.0f - coefc[7];
    }
}

void FirFilter::run(int type, const float* send, float* out, int frames, int control) {
    fc = static_cast<float>(control * 0.00390625 * 22050);
    calcfilter(type);
    // The ring position starts at 0 in every call while its contents carry over, so tap k
    // of frame i reads the input of frame i - 14 + k, or before this call the ring entry
    // (i + 1 + k) mod 15. Laid out in one line, that is a plain convolution.
    std::array<float, 14 + kMaxFrames> line;
    if (frames > kMaxFrames) frames = kMaxFrames;
    for (int m = 0; m < 14; ++m) line[m] = tourne[m + 1];
    std::copy(send, send + frames, line.begin() + 14);
    for (int i = 0; i < frames; ++i) {
        const float* h = &line[i];
        float y = 0;
        for (int k = 0; k < 15; ++k) y += coefc[k] * h[k];
        out[2 * i] += y;
        out[2 * i + 1] += y;
    }
    // The ring as the frame-by-frame walk leaves it: entry j mod 15 holds frame j.
    for (int j = std::max(0, frames - 15); j < frames; ++j) tourne[j % 15] = send[j];
}

}  // namespace ondrel
