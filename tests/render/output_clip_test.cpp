// The output stage's headroom, clip and peak meters over lengths that reach every part of
// the vector loops (whole blocks, single vectors, the masked or scalar rest).
#include "render/output_clip.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <random>
#include <vector>

namespace ondrel {
namespace {

// Loud buffers need the clip, quiet ones only the quarter; a NaN anywhere goes out as -1.
// Every set of loops this CPU runs gives the same.
TEST(OutputClip, QuartersClipsAndMetersEachChannel) {
    std::mt19937 gen(7);
    for (const LoopSet set : {LoopSet::Best, LoopSet::Avx2, LoopSet::Portable})
    for (int frames : {1, 3, 4, 7, 8, 9, 15, 16, 17, 31, 33, 1024, 1031})
    for (const float loudest : {6.0f, 3.95f, 0.0f}) {
        if (!cpu_runs(set)) continue;
        SCOPED_TRACE(testing::Message() << "set " << static_cast<int>(set) << ", " << frames << " frames up to "
                                        << loudest);
        std::uniform_real_distribution<float> value(-loudest, loudest);
        std::vector<float> out(2 * frames + 2, 0.0f);
        for (int i = 0; i < 2 * frames; ++i) out[i] = loudest > 0 ? value(gen) : std::nanf("");
        out[2 * frames] = out[2 * frames + 1] = 42.0f;  // past the frames: left alone
        // A lone loud value in the last frame's right channel: only the right meter sees it.
        out[2 * frames - 1] = 3.9f;
        out[2 * frames - 2] = 0.0f;
        const std::vector<float> in = out;

        const Peaks p = headroom_and_clip(out.data(), frames, set);
        float left = 0, right = 0;
        for (int i = 0; i < 2 * frames; ++i) {
            const float expected = std::isnan(in[i]) ? -1.0f : std::clamp(in[i] * 0.25f, -1.0f, 1.0f);
            ASSERT_EQ(out[i], expected) << i;
            (i % 2 ? right : left) = std::max(i % 2 ? right : left, std::fabs(expected));
        }
        EXPECT_EQ(p.left, left);
        EXPECT_EQ(p.right, right);
        EXPECT_GE(p.right, 0.975f);
        EXPECT_EQ(out[2 * frames], 42.0f);
        EXPECT_EQ(out[2 * frames + 1], 42.0f);
    }
}

}  // namespace
}  // namespace ondrel
