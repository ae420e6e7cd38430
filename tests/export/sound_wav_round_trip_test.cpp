// "Save Sound": a WAV file of the sound's own bits and channels, which the sound reader
// takes back to the same data, format and rate.
#include <gtest/gtest.h>

#include "export/sound_wav_writer.h"
#include "import/sound_reader.h"
#include "support/temp_dir.h"

namespace ondrel {
namespace {

TEST(SaveSound, EveryFormatReadsBackIdentically) {
    // bits, stereo, rate, data bytes: an odd count for 8-bit mono pads the data chunk.
    const std::tuple<int, bool, uint32_t, uint32_t> cases[] = {
        {8, false, 8363, 301}, {8, true, 22050, 300}, {16, false, 44100, 600}, {16, true, 65535, 800}};
    test::TempDir dir;
    for (const auto& [bits, stereo, rate, bytes] : cases) {
        SampleRef s = make_sample(bytes);
        s->bits = static_cast<int16_t>(bits);
        s->stereo = stereo;
        s->framecode = frame_code(bits, stereo);
        s->rate = rate;
        for (uint32_t i = 0; i < bytes; ++i) s->data[i] = static_cast<uint8_t>(i * 37 + (i >> 3));
        s->data[0] = 0x80;  // the most negative 8-bit value, and a 16-bit one's high byte
        const std::string path = dir.file("sound.wav");
        std::string why;
        ASSERT_TRUE(save_sound_wav(path, *s, why)) << why;
        SampleRef back;
        ASSERT_TRUE(read_sound_file(path, "audio/x-wav", back, why)) << why;
        EXPECT_EQ(std::make_tuple(int(back->bits), int(back->stereo), back->framecode, back->rate),
                  std::make_tuple(bits, stereo ? 1 : 0, s->framecode, rate));
        EXPECT_EQ(std::vector<uint8_t>(back->data, back->data + back->length),
                  std::vector<uint8_t>(s->data, s->data + s->length))
            << bits << (stereo ? " stereo" : " mono");
    }
}

}  // namespace
}  // namespace ondrel
