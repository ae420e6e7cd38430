#pragma once
#include <memory>
#include <vector>

namespace ondrel {

// The analyser's real-input transform of length n (a power of two, at least 2), with an
// optional analysis window. Its output stays packed: a[2k] and a[2k + 1] are the real and
// imaginary parts of bin k, sums of a[j] cos(2 pi jk/n) and a[j] sin(2 pi jk/n); a[0] is
// the DC term and a[1] the Nyquist term.
class CFastFourierTransform {
public:
    explicit CFastFourierTransform(int n);
    CFastFourierTransform(const CFastFourierTransform&) = delete;
    CFastFourierTransform& operator=(const CFastFourierTransform&) = delete;

    // Sets the window: fn fills length values; no fn, no window. Refused (false, nothing
    // changed) while the window already set is longer than n: it is that window, not the new
    // length, that is looked at.
    bool SetWindow(int length, void (*fn)(int, double*));
    // In place over the n values of a, without allocating.
    void DirectFFT(double* a) const;

    int n() const { return n_; }
    int window_length() const { return window_length_; }
    // The tables: nw cosine/sine values in bit-reversed order, then nc values for the real
    // transform's last step.
    const std::vector<double>& tables() const { return w_; }
    int nw() const { return nw_; }
    int nc() const { return nc_; }

private:
    void make_twiddles();
    void make_real_table();
    int reversed(int index, int bits) const;
    // Reverses the order of count complex pairs of a by the bits of their index.
    void bit_reverse(double* a, int count) const;
    void twiddle(int t, double& wr, double& wi) const;
    void complex_transform(double* a) const;
    void real_last_step(double* a) const;

    int n_;
    int window_length_ = 0;
    int nw_;
    int nc_;
    std::unique_ptr<double[]> window_;
    std::vector<double> w_;  // nw twiddles, then nc real-transform values
    // The work table: every index of half the bits, reversed; a pair's index reversed is
    // put together from its two halves.
    int table_bits_;
    std::vector<int> reversed_;
};

}  // namespace ondrel
