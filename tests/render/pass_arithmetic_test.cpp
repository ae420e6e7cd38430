// The shortcuts from one pass to the next against the plain expressions they replace, on
// values where a product and a quotient round apart, on exact quotients, and on offsets
// on either side of an end.
#include "render/pass_arithmetic.h"

#include <gtest/gtest.h>

#include <random>
#include <vector>

namespace ondrel {
namespace {

TEST(PassArithmetic, FramesBeforeAnEndAreTheQuotientsWholePart) {
    struct Case {
        double span, f, step;
    };
    std::vector<Case> cases = {
        {0.3, 0.0, 0.1},      // 0.3 x (1 / 0.1) is 3, 0.3 / 0.1 just under 3
        {16.0, 0.5, 0.25},    // exactly 62
        {16.0, 0.0, 0.3127},  // a loop played low
        {64.0, 0.999, 1.0},   // one frame a step
        {3.0, 0.7, 7.3},      // less than a frame
        {4096.0, 0.125, 1e-3},
    };
    std::mt19937 gen(11);
    std::uniform_real_distribution<double> fraction(0.0, 1.0), step(1e-3, 4.0);
    for (int i = 0; i < 20000; ++i)
        cases.push_back({static_cast<double>(1 + static_cast<int>(gen() % 512)), fraction(gen), step(gen)});
    for (const Case& c : cases) {
        const PassArithmetic passes(c.step);
        ASSERT_EQ(passes.frames_before(c.span, c.f), static_cast<int64_t>((c.span - c.f) / c.step))
            << c.span << " " << c.f << " " << c.step;
    }
}

TEST(PassArithmetic, AnOffsetSplitsAsItsFloor) {
    const struct {
        double x;
        int64_t end;
    } cases[] = {{15.7, 16},         {15.0, 16}, {16.0, 16}, {15.999999999999998, 16}, {16.5, 16},
                 {3.25, 16},         {0.0, 16},  {0.5, 1},   {0.0, 0},                 {1e6 + 0.75, 1000001},
                 {1e6 + 0.75, 1000}, {7.0, 3}};
    for (const auto& c : cases) {
        const int64_t whole = static_cast<int64_t>(c.x);
        const OffsetParts parts = split_offset(c.x, c.end);
        EXPECT_EQ(parts.whole, whole) << c.x << " " << c.end;
        EXPECT_EQ(parts.fraction, c.x - static_cast<double>(whole)) << c.x << " " << c.end;
    }
}

}  // namespace
}  // namespace ondrel
