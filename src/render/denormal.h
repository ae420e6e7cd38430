#pragma once
#include <bit>
#include <cmath>
#include <cstdint>

namespace ondrel {

// Values this small become exact zeros, so that decaying feedback never reaches the slow
// denormal range.
// (One comparison of the magnitude, which compilers turn into vector code.)
inline float flush(float v) {
    return std::fabs(v) < 1e-5f ? 0.0f : v;
}

// The same written so that compilers keep a branch: for a single recursion whose values
// rarely come near the threshold, a predicted branch costs nothing where the branch-free
// form adds its latency to every step. (Several chains side by side do better branch-free.)
inline float flush_branching(float v) {
    return (v > -1e-5f && v < 1e-5f) ? 0.0f : v;
}

// The one-pole low pass of the reverbs, bilinear form:
// y = ((K - 1) y1 + (u + u1)) / (K + 1) with K = 44100 / (fc pi), the division taken
// once per buffer as the two coefficients below.
struct OnePoleCoefficients {
    float feedback;  // (K - 1) / (K + 1)
    float gain;      // 1 / (K + 1)
    static OnePoleCoefficients for_cutoff(float fc) {
        const float k = 44100.0f / (fc * 3.1415927f);
        return {(k - 1.0f) / (k + 1.0f), 1.0f / (k + 1.0f)};
    }
};

// The low pass in two parts: what the inputs give, which needs no earlier output, and the
// recursion on the output. Blocks can compute the first part for many frames at once.
inline float one_pole_drive(float u, float u1, const OnePoleCoefficients& c) {
    return c.gain * (u + u1);
}
inline float one_pole_output(float y1, float drive, const OnePoleCoefficients& c) {
    return flush(c.feedback * y1 + drive);
}

struct OnePole {
    float y1 = 0;
    float u1 = 0;
    float step(float u, const OnePoleCoefficients& c) {
        const float y = one_pole_output(y1, one_pole_drive(u, u1, c), c);
        y1 = y;
        u1 = u;
        return y;
    }
};

}  // namespace ondrel
