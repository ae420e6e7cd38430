#include "render/iir2_filter.h"

#include <algorithm>
#include <cmath>

#include "render/denormal.h"

namespace ondrel {

void Iir2Filter::clear() {
    std::fill_n(tournex.begin(), used16_, std::array<float, 4>{});
    std::fill_n(tourney.begin(), used16_, std::array<float, 4>{});
    std::fill_n(tournex2.begin(), used17_, std::array<float, 4>{});
    std::fill_n(tourney2.begin(), used17_, std::array<float, 4>{});
    used16_ = used17_ = 0;
}

void Iir2Filter::run(int type, int slot, const float* send, float* out, int frames, int control, int q,
                     float gain_left, float gain_right) {
    const bool high = type == 17;
    int& next_row = high ? row17_ : row16_;
    if (next_row >= kRows || slot < 0 || slot >= 100) return;
    auto& x = (high ? tournex2 : tournex)[next_row];
    auto& y = (high ? tourney2 : tourney)[next_row];
    ++next_row;
    int& used = high ? used17_ : used16_;
    used = std::max(used, next_row);

    double fc = control * 0.00390625 * 22040;
    if (fc == 0) fc = 100;
    const double w = 1.0 / std::tan(M_PI * fc / 44100.0);
    const double a = q * w * w;
    const double d = a + q + 2 * w;
    const float a0 = static_cast<float>(q / d);
    const float b1 = static_cast<float>((a - q) / d);
    const float b2 = static_cast<float>((a + q - 2 * w) / d);
    // The two-entry rings in locals (entry r and the other one), as out could otherwise be
    // taken to alias them; they go back to the rings after the loop.
    int r = lesind[slot] & 1;
    float xr = x[r], xo = x[r ^ 1], yr = y[r], yo = y[r ^ 1];
    for (int i = 0; i < frames; ++i) {
        const float s = send[i];
        xr = s;
        const float x1 = xo;
        const float y1 = yr;
        const float y2 = yo;
        // Only two history entries: the feed-forward part is 2 a0 (x + x1), computed in
        // this order.
        const float v = flush_branching(a0 * x1 + 2 * a0 * s + 2 * b1 * y1 + (a0 * x1 - b2 * y2));
        yo = v;
        // r ^= 1: the entries swap roles.
        std::swap(xr, xo);
        std::swap(yr, yo);
        const float o = high ? s - v : v;
        out[2 * i] += o * gain_left;
        out[2 * i + 1] += o * gain_right;
        r ^= 1;
    }
    x[r] = xr;
    x[r ^ 1] = xo;
    y[r] = yr;
    y[r ^ 1] = yo;
    lesind[slot] = static_cast<int16_t>(r);
}

}  // namespace ondrel
