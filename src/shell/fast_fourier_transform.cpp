#include "shell/fast_fourier_transform.h"

#include <algorithm>
#include <bit>
#include <cmath>
#include <utility>

namespace ondrel {

namespace {
int log2_of(int x) {
    return x > 1 ? std::bit_width(static_cast<unsigned>(x)) - 1 : 0;
}
}  // namespace

CFastFourierTransform::CFastFourierTransform(int n)
    : n_(std::max(2, static_cast<int>(std::bit_floor(static_cast<unsigned>(std::max(n, 2)))))),
      nw_(n_ / 4),
      nc_(n_ / 4),
      w_(static_cast<size_t>(std::max(n_ / 2, 2))),
      table_bits_((log2_of(n_ / 2) + 1) / 2),
      reversed_(size_t{1} << table_bits_) {
    for (size_t i = 0; i < reversed_.size(); ++i) {
        int r = 0;
        for (int b = 0; b < table_bits_; ++b)
            if (i & (size_t{1} << b)) r |= 1 << (table_bits_ - 1 - b);
        reversed_[i] = r;
    }
    make_twiddles();
    make_real_table();
}

void CFastFourierTransform::make_twiddles() {
    double* w = w_.data();
    w[0] = 1;
    w[1] = 0;
    if (nw_ <= 2) return;
    const int nwh = nw_ / 2;
    const double delta = std::atan(1.0) / nwh;
    w[nwh] = std::cos(delta * nwh);
    w[nwh + 1] = w[nwh];
    for (int j = 2; j < nwh; j += 2) {
        const double x = std::cos(delta * j);
        const double y = std::sin(delta * j);
        w[j] = x;
        w[j + 1] = y;
        w[nw_ - j] = y;
        w[nw_ - j + 1] = x;
    }
    bit_reverse(w, nw_ / 2);
}

void CFastFourierTransform::make_real_table() {
    if (nc_ <= 1) return;
    double* c = w_.data() + nw_;
    const int nch = nc_ / 2;
    const double delta = std::atan(1.0) / nch;
    c[0] = std::cos(delta * nch);
    c[nch] = 0.5 * c[0];
    for (int j = 1; j < nch; ++j) {
        c[j] = 0.5 * std::cos(delta * j);
        c[nc_ - j] = 0.5 * std::sin(delta * j);
    }
}

bool CFastFourierTransform::SetWindow(int length, void (*fn)(int, double*)) {
    if (window_length_ > n_) return false;
    window_.reset();
    if (!fn || length <= 0) {
        window_length_ = 0;
        return true;
    }
    window_ = std::make_unique<double[]>(static_cast<size_t>(length));
    fn(length, window_.get());
    window_length_ = length;
    return true;
}

int CFastFourierTransform::reversed(int index, int bits) const {
    // The index is a high half of hb bits over a low half of lb bits; reversed, the low half
    // (reversed) goes on top of the high half (reversed).
    const int lb = bits / 2;
    const int hb = bits - lb;
    const auto half = [this](int x, int b) { return reversed_[static_cast<size_t>(x)] >> (table_bits_ - b); };
    return half(index & ((1 << lb) - 1), lb) << hb | half(index >> lb, hb);
}

void CFastFourierTransform::bit_reverse(double* a, int count) const {
    const int bits = log2_of(count);
    for (int i = 0; i < count; ++i) {
        const int r = reversed(i, bits);
        if (r > i) {
            std::swap(a[2 * i], a[2 * r]);
            std::swap(a[2 * i + 1], a[2 * r + 1]);
        }
    }
}

void CFastFourierTransform::twiddle(int t, double& wr, double& wi) const {
    // The table holds the first quarter turn; the second is the first turned by 90 degrees.
    const int quarter = n_ / 8;
    const bool turned = quarter > 0 && t >= quarter;
    if (turned) t -= quarter;
    double c = 1, s = 0;
    if (t > 0) {
        const int p = reversed(t, log2_of(quarter));
        c = w_[static_cast<size_t>(2 * p)];
        s = w_[static_cast<size_t>(2 * p + 1)];
    }
    wr = turned ? -s : c;
    wi = turned ? c : s;
}

void CFastFourierTransform::complex_transform(double* a) const {
    // The n/2 pairs as complex values, sums with exp(+2 pi i jk / (n/2)): in bit-reversed
    // order, then butterflies of growing span.
    const int pairs = n_ / 2;
    bit_reverse(a, pairs);
    for (int span = 2; span <= pairs; span <<= 1) {
        const int half = span / 2;
        const int stride = pairs / span;
        for (int j = 0; j < half; ++j) {
            double wr, wi;
            twiddle(j * stride, wr, wi);
            for (int k = j; k < pairs; k += span) {
                double* x = a + 2 * k;
                double* y = a + 2 * (k + half);
                const double tr = wr * y[0] - wi * y[1];
                const double ti = wr * y[1] + wi * y[0];
                y[0] = x[0] - tr;
                y[1] = x[1] - ti;
                x[0] += tr;
                x[1] += ti;
            }
        }
    }
}

void CFastFourierTransform::real_last_step(double* a) const {
    // Pair k and pair n/2 - k of the complex result give bins k and n/2 - k of the real
    // input's transform; the coefficients come from the second table.
    const double* c = w_.data() + nw_;
    for (int k = n_ / 4 - 1; k >= 1; --k) {
        const int j = 2 * k;
        const int m = n_ - j;
        const double wkr = 0.5 - c[nc_ - k];
        const double wki = c[k];
        const double xr = a[j] - a[m];
        const double xi = a[j + 1] + a[m + 1];
        const double yr = wkr * xr - wki * xi;
        const double yi = wkr * xi + wki * xr;
        a[j] -= yr;
        a[j + 1] -= yi;
        a[m] += yr;
        a[m + 1] -= yi;
    }
}

void CFastFourierTransform::DirectFFT(double* a) const {
    const int windowed = std::min(window_length_, n_);
    for (int i = 0; i < windowed; ++i) a[i] *= window_[static_cast<size_t>(i)];
    if (n_ >= 4) {
        complex_transform(a);
        real_last_step(a);
    }
    const double a0 = a[0];
    a[0] = a0 + a[1];
    a[1] = a0 - a[1];
}

}  // namespace ondrel
