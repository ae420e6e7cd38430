#include "export/wav_writer.h"

#include <gtest/gtest.h>

#include <cstring>

#include "support/temp_dir.h"

namespace ondrel {
namespace {

uint32_t le32(const std::vector<uint8_t>& b, size_t at) {
    return b[at] | b[at + 1] << 8 | b[at + 2] << 16 | uint32_t{b[at + 3]} << 24;
}
uint16_t le16(const std::vector<uint8_t>& b, size_t at) {
    return static_cast<uint16_t>(b[at] | b[at + 1] << 8);
}

TEST(WavWriter, Pcm16HeaderAndSamples) {
    test::TempDir dir;
    const std::string path = dir.file("a.wav");
    WavWriter w;
    std::string why;
    ASSERT_TRUE(w.open(path, 2, 44100, WavSampleFormat::Pcm16, why)) << why;
    const float frames[] = {0.0f, 1.0f, -1.0f, 0.5f, 2.0f, -3.0f};
    ASSERT_TRUE(w.write(frames, 3));
    ASSERT_TRUE(w.finish(why)) << why;
    const auto b = test::read_all(path);
    ASSERT_EQ(b.size(), 44u + 12);
    EXPECT_EQ(std::string(b.begin(), b.begin() + 4), "RIFF");
    EXPECT_EQ(le32(b, 4), b.size() - 8);
    EXPECT_EQ(std::string(b.begin() + 8, b.begin() + 16), "WAVEfmt ");
    EXPECT_EQ(le16(b, 20), 1);  // PCM
    EXPECT_EQ(le16(b, 22), 2);
    EXPECT_EQ(le32(b, 24), 44100u);
    EXPECT_EQ(le32(b, 28), 44100u * 4);
    EXPECT_EQ(le16(b, 32), 4);
    EXPECT_EQ(le16(b, 34), 16);
    EXPECT_EQ(le32(b, 40), 12u);
    const int16_t want[] = {0, 32767, -32767, 16383, 32767, -32767};  // clipped, truncated
    for (int i = 0; i < 6; ++i) EXPECT_EQ(static_cast<int16_t>(le16(b, 44 + 2 * i)), want[i]) << i;
}

TEST(WavWriter, FloatFilesCarryAFactChunk) {
    test::TempDir dir;
    const std::string path = dir.file("f.wav");
    WavWriter w;
    std::string why;
    ASSERT_TRUE(w.open(path, 2, 44100, WavSampleFormat::Float32, why));
    const float frames[] = {0.25f, -0.75f};
    w.write(frames, 1);
    ASSERT_TRUE(w.finish(why));
    const auto b = test::read_all(path);
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
    size_t files = 0;
    for (const auto& e : std::filesystem::directory_iterator(dir.path())) files += e.is_regular_file();
    EXPECT_EQ(files, 1u);
    WavWriter w;
    std::string why;
    EXPECT_FALSE(w.open(dir.file("missing/x.wav"), 2, 44100, WavSampleFormat::Pcm16, why));
    EXPECT_FALSE(why.empty());
}

TEST(WavWriter, OddDataIsPadded) {
    test::TempDir dir;
    const std::string path = dir.file("odd.wav");
    WavWriter w;
    std::string why;
    ASSERT_TRUE(w.open(path, 1, 8000, WavSampleFormat::Pcm8, why));
    const float f[] = {0.0f, 1.0f, -1.0f};
    w.write(f, 3);
    ASSERT_TRUE(w.finish(why));
    const auto b = test::read_all(path);
    EXPECT_EQ(b.size(), 44u + 4);
    EXPECT_EQ(le32(b, 40), 3u);
    EXPECT_EQ(b[44], 128);
    EXPECT_EQ(b[45], 255);
    EXPECT_EQ(b[46], 1);
}

}  // namespace
}  // namespace ondrel
