#include "record/frame_convert.h"

#include <gtest/gtest.h>

#include <vector>

namespace ondrel {
namespace {

struct ConvertCase {
    const char* what;
    int mode;
    bool disk;
    int vrvol;
    std::vector<int16_t> in;  // stereo frames
    std::vector<uint8_t> out;
};

TEST(FrameConvert, EachFormatGainAndDestination) {
    // clang-format off
    const ConvertCase cases[] = {
        {"mono 16 takes the left channel, low bit cleared", 0, true, 128, {0x1235, 0x7777, -3, 100},
         {0x34, 0x12, 0xfc, 0xff}},
        {"stereo 16 keeps both, odd values too", 1, true, 128, {0x1235, -1}, {0x35, 0x12, 0xff, 0xff}},
        {"mono 8: the left high byte, unsigned on disk", 2, true, 128, {0x1234, 0x7f00, -256, 0},
         {0x12 ^ 0x80, 0xff ^ 0x80}},
        {"mono 8 stays signed in memory", 2, false, 128, {0x1234, 0x7f00, -256, 0}, {0x12, 0xff}},
        {"stereo 8: both high bytes", 3, true, 128, {0x1234, -0x1234}, {0x12 ^ 0x80, 0xed ^ 0x80}},
        {"stereo 8 in memory", 3, false, 128, {0x1234, -0x1234}, {0x12, 0xed}},
        {"gain 256 wraps a full-scale value instead of clipping", 1, true, 256, {32767, -32768},
         {0xfe, 0xff, 0x00, 0x00}},
        {"gain 256 in 8 bits wraps the byte", 2, false, 256, {0x7f00, 0}, {0xfe}},
        {"half gain rounds (3 x 0.5 = 1.5 -> 2, -3 x 0.5 -> -2)", 1, true, 64, {3, -3}, {2, 0, 0xfe, 0xff}},
        {"gain 0 is silence", 1, true, 0, {1000, -1000}, {0, 0, 0, 0}},
        {"mono clears the low bit before the gain", 0, true, 192, {3, 0}, {3, 0}},
    };
    // clang-format on
    for (const auto& c : cases) {
        std::vector<uint8_t> out(c.in.size() * 2 + 8, 0xaa);
        const size_t n =
            convert_frames(c.mode, c.disk, record_gain(c.vrvol), c.in.data(), c.in.size() / 2, out.data());
        out.resize(n);
        EXPECT_EQ(out, c.out) << c.what;
    }
}

}  // namespace
}  // namespace ondrel
