#include "shell/fast_fourier_transform.h"

#include <gtest/gtest.h>

#include <cmath>
#include <numbers>
#include <numeric>
#include <random>
#include <vector>

#include "shell/fft_windows.h"

namespace ondrel {
namespace {

// The transform by its definition, in the packed order.
std::vector<double> direct_dft(const std::vector<double>& x) {
    const size_t n = x.size();
    std::vector<double> out(n);
    for (size_t k = 0; k <= n / 2; ++k) {
        double re = 0, im = 0;
        for (size_t j = 0; j < n; ++j) {
            const double a = 2 * std::numbers::pi * static_cast<double>(j * k % n) / static_cast<double>(n);
            re += x[j] * std::cos(a);
            im += x[j] * std::sin(a);
        }
        if (k == 0)
            out[0] = re;
        else if (k == n / 2)
            out[1] = re;
        else {
            out[2 * k] = re;
            out[2 * k + 1] = im;
        }
    }
    return out;
}

TEST(CFastFourierTransform, MatchesTheDirectTransformInPackedOrder) {
    std::mt19937 random(3);
    std::uniform_real_distribution<double> value(-1, 1);
    for (int n : {2, 4, 8, 16, 32, 64, 512, 2048}) {
        std::vector<double> x(static_cast<size_t>(n));
        for (auto& v : x) v = value(random);
        const auto want = direct_dft(x);
        CFastFourierTransform fft(n);
        std::vector<double> a = x;
        fft.DirectFFT(a.data());
        for (int i = 0; i < n; ++i)
            ASSERT_NEAR(a[static_cast<size_t>(i)], want[static_cast<size_t>(i)], 1e-9 * n)
                << "n " << n << " at " << i;
    }
}

TEST(CFastFourierTransform, SetWindowLooksAtTheWindowAlreadySet) {
    CFastFourierTransform fft(8);
    EXPECT_TRUE(fft.SetWindow(16, Hanning)) << "longer than n, accepted: the current one is not";
    EXPECT_EQ(fft.window_length(), 16);
    EXPECT_FALSE(fft.SetWindow(4, Hamming)) << "now the current one is longer than n";
    EXPECT_EQ(fft.window_length(), 16);
    // Only the transform's own values are windowed.
    std::vector<double> a(8, 1.0), w(16);
    Hanning(16, w.data());
    fft.DirectFFT(a.data());
    EXPECT_NEAR(a[0], std::accumulate(w.begin(), w.begin() + 8, 0.0), 1e-12);

    CFastFourierTransform other(8);
    EXPECT_TRUE(other.SetWindow(8, Hamming));
    EXPECT_TRUE(other.SetWindow(0, nullptr));
    EXPECT_EQ(other.window_length(), 0);
    std::vector<double> b(8, 1.0);
    other.DirectFFT(b.data());
    EXPECT_NEAR(b[0], 8.0, 1e-12) << "no window left";
}

struct WindowCase {
    const char* name;
    void (*fn)(int, double*);
    int n;
    int i;
    double value;
};

TEST(FftWindows, ValuesAtKnownPoints) {
    const double r2 = std::sqrt(0.5);
    const WindowCase cases[] = {
        {"Hamming", Hamming, 8, 0, 0.08},
        {"Hamming", Hamming, 8, 1, 0.46 * (1 - r2) + 0.08},
        {"Hamming", Hamming, 8, 4, 1.0},
        {"Hanning", Hanning, 8, 2, 0.5},
        {"Hanning", Hanning, 8, 0, 0.0},
        {"Cosine", Cosine, 8, 2, 0.25},
        {"Cosine", Cosine, 8, 4, 1.0},
        {"HalfCycleSine", HalfCycleSine, 8, 2, r2 * r2 * r2},
        {"HalfCycleSine", HalfCycleSine, 8, 4, 1.0},
        {"Triangle", Triangle, 8, 3, 0.75},
        {"Triangle", Triangle, 8, 5, 0.75},
        {"Triangle odd n: the fall starts at n/2 rounded down", Triangle, 7, 3, 2.0 - 6.0 / 7},
        {"BlackmanHarris4T", BlackmanHarris4T, 8, 0, 0.00006},
        {"BlackmanHarris4T", BlackmanHarris4T, 8, 4, 1.0},
        {"BlackmanHarris4T", BlackmanHarris4T, 8, 2, 0.35875 - 0.14128},
        {"Rosenfeld", Rosenfeld, 8, 0, 0.0},
        {"Rosenfeld", Rosenfeld, 8, 4, 1.9},
        {"Rosenfeld", Rosenfeld, 8, 2, 0.498},
    };
    for (const auto& c : cases) {
        std::vector<double> w(static_cast<size_t>(c.n));
        c.fn(c.n, w.data());
        EXPECT_NEAR(w[static_cast<size_t>(c.i)], c.value, 1e-12) << c.name << " n " << c.n << " i " << c.i;
    }
}

}  // namespace
}  // namespace ondrel
