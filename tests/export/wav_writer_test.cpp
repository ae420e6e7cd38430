#include "export/wav_writer.h"

#include <gtest/gtest.h>

#include <cstring>
#include <filesystem>

#include "support/temp_dir.h"

namespace ondrel {
namespace {

uint32_t le32(const std::vector<uint8_t>& b, size_t at) {
    return b[at] | b[at + 1] << 8 | b[at + 2] << 16 | uint32_t{b[at + 3]} << 24;
}
uint16_t le16(const std::vector<uint8_t>& b, size_t at) {
    return static_cast<uint16_t>(b[at] | b[at + 1] << 8);
}

std::vector<uint8_t> written(const test::TempDir& dir, int channels, WavSampleFormat format,
                             const std::vector<float>& samples) {
    const std::string path = dir.file("out.wav");
    WavWriter w;
    std::string why;
    EXPECT_TRUE(w.open(path, channels, 44100, format, why)) << why;
    EXPECT_TRUE(w.write(samples.data(), samples.size() / static_cast<size_t>(channels)));
    EXPECT_TRUE(w.finish(why)) << why;
    return test::read_all(path);
}

TEST(WavWriter, HeadersAndSamplesOfEachFormat) {
    test::TempDir dir;
    const std::vector<float> in = {0.0f, 1.0f, -1.0f, 0.5f, 2.0f, -3.0f};  // beyond 1: clipped
    auto b = written(dir, 2, WavSampleFormat::Pcm16, in);
    ASSERT_EQ(b.size(), 44u + 12);
    EXPECT_EQ(std::string(b.begin(), b.begin() + 4), "RIFF");
    EXPECT_EQ(le32(b, 4), b.size() - 8);
    EXPECT_EQ(std::string(b.begin() + 8, b.begin() + 16), "WAVEfmt ");
    EXPECT_EQ(le32(b, 16), 16u);
    EXPECT_EQ(le16(b, 20), 1);  // PCM
    EXPECT_EQ(le16(b, 22), 2);
    EXPECT_EQ(le32(b, 24), 44100u);
    EXPECT_EQ(le32(b, 28), 44100u * 4);
    EXPECT_EQ(le16(b, 32), 4);
    EXPECT_EQ(le16(b, 34), 16);
    EXPECT_EQ(le32(b, 40), 12u);
    const int16_t pcm16[] = {0, 32767, -32767, 16383, 32767, -32767};  // truncated
    for (int i = 0; i < 6; ++i) EXPECT_EQ(static_cast<int16_t>(le16(b, 44 + 2 * i)), pcm16[i]) << i;

    b = written(dir, 1, WavSampleFormat::Pcm8, {0.0f, 1.0f, -1.0f});
    ASSERT_EQ(b.size(), 44u + 4);  // odd data is padded
    EXPECT_EQ(le32(b, 4), b.size() - 8);
    EXPECT_EQ(le32(b, 40), 3u);
    EXPECT_EQ(std::vector<uint8_t>(b.begin() + 44, b.end()), (std::vector<uint8_t>{128, 255, 1, 0}));

    b = written(dir, 2, WavSampleFormat::Float32, {0.25f, -0.75f});
    EXPECT_EQ(le32(b, 4), b.size() - 8);
    EXPECT_EQ(le16(b, 20), 3);
    EXPECT_EQ(le16(b, 34), 32);
    EXPECT_EQ(std::string(b.begin() + 38, b.begin() + 42), "fact");
    EXPECT_EQ(le32(b, 46), 1u);
    EXPECT_EQ(std::string(b.begin() + 50, b.begin() + 54), "data");
    float x;
    std::memcpy(&x, &b[62], 4);
    EXPECT_EQ(x, -0.75f);
}

TEST(WavWriter, AnAbandonedOrFailedFileLeavesTheTargetAsItWas) {
    test::TempDir dir;
    const std::string path = dir.write("keep.wav", {'o', 'l', 'd'});
    {
        WavWriter w;
        std::string why;
        ASSERT_TRUE(w.open(path, 1, 8000, WavSampleFormat::Pcm8, why));
        const float f[] = {0.1f};
        w.write(f, 1);
    }  // never finished
    EXPECT_EQ(test::read_all(path), (std::vector<uint8_t>{'o', 'l', 'd'}));
    EXPECT_EQ(std::distance(std::filesystem::directory_iterator(dir.path()), {}), 1);
    WavWriter w;
    std::string why;
    EXPECT_FALSE(w.open(dir.file("missing/x.wav"), 2, 44100, WavSampleFormat::Pcm16, why));
    EXPECT_FALSE(why.empty());
}

}  // namespace
}  // namespace ondrel
