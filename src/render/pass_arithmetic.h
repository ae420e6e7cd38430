#pragma once
// The arithmetic from one pass over a sample to the next. A voice on a short loop makes
// a pass every few dozen frames, each starting from the last one's fraction: a chain of
// dependent steps that a division and integer round trips would lengthen. Both functions
// give exactly what the plain expressions in their comments give.
#include <cstdint>

namespace ondrel {

class PassArithmetic {
public:
    explicit PassArithmetic(double step) : step_(step), inverse_(1.0 / step) {}

    // (int64_t)((span - f) / step): the frames before an end span frames away (step > 0).
    int64_t frames_before(double span, double f) const {
        const double left = span - f;
        const int64_t n = static_cast<int64_t>(left * inverse_);
        // The quotient only checks the product's rounding, behind a branch that is predicted,
        // so the division stays off the chain. Compared as it is, past the branch the two
        // would be known equal and the compiler would use the quotient: hide that.
        const int64_t exact = static_cast<int64_t>(left / step_);
        if (opaque(n) != exact) [[unlikely]]
            return quotient(left, step_);  // a call, so that no conditional move waits on the division
        return n;
    }

private:
    [[gnu::noinline, gnu::cold]] static int64_t quotient(double left, double step) {
        return static_cast<int64_t>(left / step);
    }
    static int64_t opaque(int64_t v) {
        asm("" : "+r"(v));
        return v;
    }

    double step_, inverse_;
};

// (int64_t)x and the rest, for x >= 0. A pass that reaches an end stops within a frame of
// it: there the whole part is known without the round trip through an integer register.
struct OffsetParts {
    int64_t whole;
    double fraction;
};
inline OffsetParts split_offset(double x, int64_t end) {
    const double below = static_cast<double>(end - 1);
    if (x >= below && x < below + 1.0) [[likely]]
        return {end - 1, x - below};
    const int64_t whole = static_cast<int64_t>(x);
    return {whole, x - static_cast<double>(whole)};
}

}  // namespace ondrel
