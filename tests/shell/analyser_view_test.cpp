#include "shell/analyser_view.h"

#include <gtest/gtest.h>

#include <cmath>
#include <numbers>
#include <vector>

namespace ondrel {
namespace {

uint32_t rgb(int r, int g, int b) {
    return static_cast<uint32_t>(r << 16 | g << 8 | b);
}

TEST(AnalyserPixels, RadarColours) {
    struct Case {
        double x;
        uint32_t pixel;
        const char* why;
    };
    const Case cases[] = {
        {0.0, 0, "silence is black"},
        {0.5, rgb(32, 64, 64), "0.25 of the scale"},
        {-0.5, rgb(32, 64, 64), "the sign does not count"},
        {0.75, rgb(71, 142, 143), "green above 127 borrows from red: 72 and 143 become 71, 142, 143"},
        {1.0, rgb(127, 254, 255), "full scale wraps: red 128 and green 255 as signed bytes"},
        {4.0, rgb(127, 254, 255), "clamped to 1"},
        {-4.0, rgb(127, 254, 255), "clamped to -1"},
    };
    for (const auto& c : cases) EXPECT_EQ(radar_pixel(c.x), c.pixel) << c.x << ": " << c.why;
}

TEST(AnalyserPixels, ClassicBars) {
    const std::pair<double, int> heights[] = {{0.0, 0},   {1.0, 8},    {-1.0, 8},    {2.0, 32},
                                              {4.0, 128}, {-4.0, 128}, {100.0, 128}, {0.1, 0}};
    for (const auto& [x, height] : heights) EXPECT_EQ(classic_bar_height(x), height) << x;

    std::vector<double> x(512, 0.0);
    x[3] = 1.0;
    x[511] = -4.0;
    AnalyserPixels px;
    px.fill(0x123456);
    draw_classic(x.data(), px);
    const auto at = [&](int column, int row) {
        return px[static_cast<size_t>(row * kAnalyserWidth + column)];
    };
    for (int u = 0; u < 128; ++u) {
        EXPECT_EQ(at(3, u), u >= 120 ? rgb(2 * u, 2 * u, u) : 0u) << "row " << u;
        EXPECT_EQ(at(511, u), rgb(2 * u, 2 * u, u)) << "row " << u;
        EXPECT_EQ(at(0, u), 0u) << "cleared first";
    }
}

TEST(AnalyserView, SilenceAndTheRadarRows) {
    AnalyserView view;
    const std::vector<double> silence(512, 0.0);
    view.Draw(silence.data());
    for (uint32_t p : view.pixels()) ASSERT_EQ(p, 0u) << "an empty classic view";

    // A sine an eighth of the way up: its bins light up, the rest of the row stays black.
    std::vector<double> sine(512);
    for (int i = 0; i < 512; ++i)
        sine[static_cast<size_t>(i)] = 0.5 * std::sin(2 * std::numbers::pi * 32 * i / 512);
    view.set_view(kViewRadar);
    for (int k = 0; k < 127; ++k) view.Draw(silence.data());
    EXPECT_EQ(view.radar_row(), 127);
    view.Draw(sine.data());
    EXPECT_EQ(view.radar_row(), 0) << "wraps after the 128th row";
    const uint32_t* last = view.pixels().data() + 127 * kAnalyserWidth;
    EXPECT_NE(last[2 * 32 + 1], 0u) << "bin 32's imaginary part";
    EXPECT_EQ(last[2 * 100], 0u);
    for (int c = 0; c < kAnalyserWidth; ++c) EXPECT_EQ(view.pixels()[static_cast<size_t>(c)], 0u);
    view.Draw(silence.data());
    EXPECT_EQ(view.radar_row(), 1);

    view.reset();
    EXPECT_EQ(view.view(), kViewClassic);
    EXPECT_EQ(view.radar_row(), 0);
}

}  // namespace
}  // namespace ondrel
