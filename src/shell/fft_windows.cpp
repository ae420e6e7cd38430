#include "shell/fft_windows.h"

#include <cmath>
#include <numbers>

namespace ondrel {

namespace {
double turn(int i, int n) {
    return 2 * std::numbers::pi * i / n;
}
}  // namespace

void BlackmanHarris4T(int n, double* w) {
    for (int i = 0; i < n; ++i)
        w[i] = 0.35875 - 0.48829 * std::cos(turn(i, n)) + 0.14128 * std::cos(2 * turn(i, n)) -
               0.01168 * std::cos(3 * turn(i, n));
}

void Cosine(int n, double* w) {
    for (int i = 0; i < n; ++i) {
        const double h = 0.5 * (1 - std::cos(turn(i, n)));
        w[i] = h * h;
    }
}

void Hamming(int n, double* w) {
    for (int i = 0; i < n; ++i) w[i] = 0.46 * (1 - std::cos(turn(i, n))) + 0.08;
}

void HalfCycleSine(int n, double* w) {
    for (int i = 0; i < n; ++i) {
        const double s = std::sin(std::numbers::pi * i / n);
        w[i] = s * s * s;
    }
}

void Hanning(int n, double* w) {
    for (int i = 0; i < n; ++i) w[i] = 0.5 * (1 - std::cos(turn(i, n)));
}

void Triangle(int n, double* w) {
    for (int i = 0; i < n; ++i) w[i] = i < n / 2 ? 2.0 * i / n : 2.0 - 2.0 * i / n;
}

void Rosenfeld(int n, double* w) {
    for (int i = 0; i < n; ++i) w[i] = 0.724 - 0.95 * std::cos(turn(i, n)) + 0.226 * std::cos(2 * turn(i, n));
}

}  // namespace ondrel
