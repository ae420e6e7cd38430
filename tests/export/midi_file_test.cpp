#include "export/midi_file.h"

#include <gtest/gtest.h>

namespace ondrel {
namespace {

// Delta times as the standard's table writes them, each in the whole chunk of a track
// holding one program change (channel 6, program 7: two bytes), after the chunks before.
// clang-format off
TEST(MidiFile, DeltaTimesAreVariableLengthQuantities) {
    const std::pair<uint32_t, std::vector<uint8_t>> cases[] = {
        {0x7F, {0x7F}}, {0x80, {0x81, 0x00}}, {0x3FFF, {0xFF, 0x7F}}, {0x4000, {0x81, 0x80, 0x00}},
        {0x200000, {0x81, 0x80, 0x80, 0x00}}, {0x0FFFFFFF, {0xFF, 0xFF, 0xFF, 0x7F}},
    };
    for (const auto& [delta, quantity] : cases) {
        MidiSong song;
        song.tracks.push_back({"", {{delta, kMidiProgramChange, 6, 7, 99}}});
        std::vector<uint8_t> expected = {'M', 'T', 'h', 'd', 0, 0, 0, 6, 0, 1, 0, 2, 3, 0xC0,
                                         'M', 'T', 'r', 'k', 0, 0, 0, 8, 0, 0xFF, 3, 0, 0, 0xFF, 0x2F, 0,
                                         'M', 'T', 'r', 'k', 0, 0, 0, uint8_t(10 + quantity.size()), 0, 0xFF, 3, 0};
        expected.insert(expected.end(), quantity.begin(), quantity.end());
        expected.insert(expected.end(), {0xC5, 0x07, 0x00, 0xFF, 0x2F, 0x00});
        EXPECT_EQ(midi_file_bytes(song), expected) << delta;
    }
}
// clang-format on

}  // namespace
}  // namespace ondrel
