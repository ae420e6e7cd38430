// Sound files into sample records: files built byte by byte for the exact cases, and the
// corpus sounds made by other programs.
#include "import/sound_reader.h"

#include <gtest/gtest.h>

#include <filesystem>

#include "support/chunk_builder.h"
#include "support/temp_dir.h"

namespace ondrel {
namespace {

using test::Bytes;

SampleRef read(const std::vector<uint8_t>& bytes, SoundKind kind, const std::string& leaf = "sound.x") {
    ByteReader r(bytes);
    SampleRef s;
    std::string why;
    EXPECT_TRUE(read_sound(r, kind, "/music/" + leaf, leaf, s, why)) << why;
    return s;
}

std::vector<uint8_t> wav(int channels, int rate, int bits, const std::vector<uint8_t>& data,
                         const std::string& first_chunk = "fmt ") {
    Bytes b;
    b.text("RIFF", 4).le32(static_cast<uint32_t>(36 + data.size())).text("WAVE", 4);
    b.text(first_chunk, 4).le32(16).le16(1).le16(channels).le32(static_cast<uint32_t>(rate));
    b.le32(static_cast<uint32_t>(rate * channels * bits / 8)).le16(channels * bits / 8).le16(bits);
    b.text("LIST", 4).le32(3).bytes({1, 2, 3});  // odd, and no pad byte follows
    b.text("data", 4).le32(static_cast<uint32_t>(data.size())).raw(data);
    return b.v;
}

// An AIFF file whose COMM says rate by its exponent and mantissa.
std::vector<uint8_t> aiff(int channels, int bits, int exponent, int mantissa_top,
                          const std::vector<uint8_t>& data) {
    const uint32_t frames = static_cast<uint32_t>(data.size() / static_cast<size_t>(channels * (bits / 8)));
    Bytes b;
    b.text("FORM", 4).be32(static_cast<uint32_t>(4 + 26 + 16 + data.size())).text("AIFF", 4);
    b.text("COMM", 4)
        .be32(18)
        .be16(channels)
        .be32(frames)
        .be16(bits)
        .be16(exponent)
        .be16(mantissa_top)
        .zeros(6);
    b.text("SSND", 4).be32(static_cast<uint32_t>(8 + data.size())).zeros(8).raw(data);
    return b.v;
}

std::vector<uint8_t> avr(int bits, bool stereo, uint32_t loop_start, uint32_t loop_end,
                         const std::vector<uint8_t>& data, const std::string& name = "") {
    Bytes b;
    b.text("2BIT", 4).text(name, 8).be16(stereo ? 0xffff : 0).be16(bits).be16(0xffff).be16(0xffff);
    b.be16(0x00ff)
        .be16(0)
        .be16(22050)
        .be32(static_cast<uint32_t>(data.size()))
        .be32(loop_start)
        .be32(loop_end);
    b.zeros(128 - b.size()).raw(data);
    return b.v;
}

TEST(SoundReader, WavSixteenBitIsKeptAndEightBitMadeSigned) {
    const auto s16 = read(wav(1, 44100, 16, {0x34, 0x12, 0xff, 0x7f}), SoundKind::Wav, "kick.wav");
    EXPECT_STREQ(s16->name, "kick");
    EXPECT_EQ(s16->bits, 16);
    EXPECT_EQ(s16->framecode, 1);
    EXPECT_EQ(s16->data[0], 0x34);
    EXPECT_EQ(s16->data[1], 0x12);
    EXPECT_EQ(s16->length, 4u);
    EXPECT_EQ(s16->loopon, 0);
    EXPECT_EQ(s16->loopstart, 4u);  // as the format stores it
    EXPECT_EQ(s16->loopend, 0u);
    EXPECT_EQ(s16->source_offset, 4u);
    EXPECT_EQ(s16->volume, 128);
    EXPECT_EQ(s16->refnote, 72);
    EXPECT_EQ(s16->halfrate, 22050u);
    EXPECT_STREQ(s16->source_path, "/music/kick.wav");
    EXPECT_EQ(s16->default_words[1], 127);
    EXPECT_EQ(s16->default_words[2], 128);
    const auto s8 = read(wav(2, 8000, 8, {0x80, 0x00, 0xff, 0x7f}), SoundKind::Wav);
    EXPECT_EQ(static_cast<int8_t>(s8->data[0]), 0);
    EXPECT_EQ(static_cast<int8_t>(s8->data[1]), -128);
    EXPECT_EQ(s8->stereo, 1);
    EXPECT_EQ(s8->framecode, 1);
}

TEST(SoundReader, WavRateKeepsOnlySixteenBits) {
    EXPECT_EQ(read(wav(1, 96000, 16, {0, 0}), SoundKind::Wav)->rate, 30464u);
}

TEST(SoundReader, WavWhoseFirstChunkIsNotFormatIsMisreadButBounded) {
    // The first chunk is taken as the format chunk whatever its id: here it still is one.
    const auto s = read(wav(1, 22050, 8, {1, 2, 3}, "junk"), SoundKind::Wav);
    EXPECT_EQ(s->rate, 22050u);
    EXPECT_EQ(s->length, 3u);
}

TEST(SoundReader, WavWithoutDataOrWithTooManyBitsIsRefused) {
    auto no_data = wav(1, 8000, 8, {});
    no_data.resize(no_data.size() - 8);  // drop the data chunk header
    ByteReader r(no_data);
    SampleRef s;
    std::string why;
    EXPECT_FALSE(read_sound(r, SoundKind::Wav, "x.wav", "x.wav", s, why));
    EXPECT_NE(why.find("data"), std::string::npos);
    const auto wav24 = wav(1, 8000, 24, {0, 0, 0});
    ByteReader r24(wav24);
    EXPECT_FALSE(read_sound(r24, SoundKind::Wav, "x.wav", "x.wav", s, why));
    EXPECT_EQ(s, nullptr);
}

TEST(SoundReader, AiffIsSwappedAndItsRateReadFromTheMantissa) {
    const auto s = read(aiff(1, 16, 0x400E, 0xAC44, {0x12, 0x34, 0x80, 0x00}), SoundKind::Aiff, "pad.aiff");
    EXPECT_EQ(s->rate, 44100u);
    EXPECT_EQ(s->data[0], 0x34);
    EXPECT_EQ(s->data[1], 0x12);
    EXPECT_EQ(s->length, 4u);
    EXPECT_EQ(s->loopstart, 4u);
    EXPECT_EQ(s->loopend, 4u);
    EXPECT_EQ(s->source_offset, 12u + 8 + 18);
    // The exponent is not applied: 22050 Hz reads as 44100, 8000 Hz as 64000.
    EXPECT_EQ(read(aiff(1, 8, 0x400D, 0xAC44, {1}), SoundKind::Aiff)->rate, 44100u);
    EXPECT_EQ(read(aiff(1, 8, 0x400B, 0xFA00, {1}), SoundKind::Aiff)->rate, 64000u);
    const auto s8 = read(aiff(2, 8, 0x400E, 0xAC44, {0x80, 0x7f}), SoundKind::Aiff);
    EXPECT_EQ(s8->data[0], 0x80);  // 8-bit AIFF kept as it is
    EXPECT_EQ(s8->stereo, 1);
}

TEST(SoundReader, AiffWithoutFormOrSoundDataIsRefused) {
    auto bytes = aiff(1, 8, 0x400E, 0xAC44, {1, 2});
    SampleRef s;
    std::string why;
    bytes[0] = 'X';
    ByteReader r(bytes);
    EXPECT_FALSE(read_sound(r, SoundKind::Aiff, "a.aiff", "a.aiff", s, why));
    auto comm_only = aiff(1, 8, 0x400E, 0xAC44, {});
    comm_only.resize(12 + 26);
    ByteReader c(comm_only);
    EXPECT_FALSE(read_sound(c, SoundKind::Aiff, "a.aiff", "a.aiff", s, why));
}

TEST(SoundReader, AvrSwapsSixteenBitsAndAddsTheLoopPoints) {
    std::vector<uint8_t> data(100);
    for (size_t i = 0; i < data.size(); ++i) data[i] = static_cast<uint8_t>(i);
    const auto s = read(avr(16, false, 20, 30, data, "AVRNAME1"), SoundKind::Avr);
    EXPECT_STREQ(s->name, "AVRNAME1");
    EXPECT_EQ(s->data[0], 1);
    EXPECT_EQ(s->data[1], 0);
    EXPECT_EQ(s->length, 100u);
    EXPECT_EQ(s->rate, 22050u);
    EXPECT_NE(s->loopon, 0);
    EXPECT_EQ(s->loopstart, 20u);
    EXPECT_EQ(s->loopend, 50u);  // the file's end plus its start
    EXPECT_EQ(s->refnote, 72);
    EXPECT_EQ(s->source_offset, 128u);
    const auto s8 = read(avr(8, true, 21, 31, data), SoundKind::Avr, "buzz.avr");
    EXPECT_STREQ(s8->name, "buzz");
    EXPECT_EQ(s8->data[5], 5);      // 8-bit data kept
    EXPECT_EQ(s8->loopstart, 20u);  // low bit cleared
    EXPECT_EQ(s8->framecode, 1);
}

TEST(SoundReader, AvrLoopNearTheEndIsSwitchedOff) {
    const auto s = read(avr(8, false, 96, 99, std::vector<uint8_t>(100, 0)), SoundKind::Avr);
    EXPECT_EQ(s->loopon, 0);
    EXPECT_EQ(s->loopend, 100u);
    const auto on = read(avr(8, false, 94, 2, std::vector<uint8_t>(100, 0)), SoundKind::Avr);
    EXPECT_NE(on->loopon, 0);
}

TEST(SoundReader, FixedHeaderTypeSkipsItsExtraBlock) {
    Bytes b;
    b.zeros(20).le16(2).zeros(6).le16(16).zeros(2).le16(11025).zeros(14).le32(6).zeros(2);
    b.bytes({9, 9, 9, 9, 9, 9});  // extra block
    b.bytes({1, 2, 3, 4, 5, 6, 7, 8});
    const auto s = read(b.v, SoundKind::FixedHeader, "song.aif");
    EXPECT_STREQ(s->name, "song");
    EXPECT_EQ(s->length, 8u);
    EXPECT_EQ(s->data[0], 1);
    EXPECT_EQ(s->stereo, 1);
    EXPECT_EQ(s->bits, 16);
    EXPECT_EQ(s->framecode, 2);
    EXPECT_EQ(s->rate, 11025u);
    EXPECT_EQ(s->loopstart, 6u);
    EXPECT_EQ(s->loopend, 2u);
    EXPECT_EQ(s->source_offset, 60u);
    Bytes hostile = b;
    hostile.v[48] = 0xff;
    hostile.v[51] = 0x7f;
    ByteReader r(hostile.v);
    SampleRef t;
    std::string why;
    EXPECT_FALSE(read_sound(r, SoundKind::FixedHeader, "x.aif", "x.aif", t, why));
}

TEST(SoundReader, NamesFromLeavesKeepADotAtTheStart) {
    EXPECT_STREQ(read(wav(1, 8000, 8, {1}), SoundKind::Wav, ".wav")->name, ".wav");
    EXPECT_STREQ(read(wav(1, 8000, 8, {1}), SoundKind::Wav, "a.b.wav")->name, "a.b");
    EXPECT_STREQ(read(wav(1, 8000, 8, {1}), SoundKind::Wav, "noext")->name, "noext");
    const std::string long_leaf(50, 'n');
    EXPECT_EQ(std::string(read(wav(1, 8000, 8, {1}), SoundKind::Wav, long_leaf + ".wav")->name).size(), 31u);
}

TEST(SoundReader, FilesAreSortedByExtensionAndContentType) {
    EXPECT_EQ(returntype("a/kick.WAV", "application/octet-stream"), kSoundFile);
    EXPECT_EQ(returntype("x.avr", ""), kSoundFile);
    EXPECT_EQ(returntype("noextension", "audio/x-wav"), kSoundFile);
    EXPECT_EQ(returntype("song.otm", ""), kModuleFile);
    EXPECT_EQ(returntype("tune.xm", ""), kModuleFile);
    EXPECT_EQ(returntype("tune", "audio/x-mod"), kModuleFile);
    EXPECT_EQ(returntype("notes.txt", "text/plain"), kOtherFile);
    EXPECT_EQ(returntype("dir.v2/file", "text/plain"), kOtherFile);
    // A WAV named .mod is a module: the later test wins.
    EXPECT_EQ(returntype("weird.mod", "audio/x-wav"), kModuleFile);
    EXPECT_EQ(extension_of("a.b/c"), ".b/c");
    EXPECT_EQ(extension_of("plain"), "");

    EXPECT_EQ(sound_kind("song.aif", "application/octet-stream"), SoundKind::FixedHeader);
    EXPECT_EQ(sound_kind("song.aif", "audio/x-aiff"), SoundKind::Aiff);
    EXPECT_EQ(sound_kind("song.aiff", "application/octet-stream"), SoundKind::Aiff);
    EXPECT_EQ(sound_kind("x", "audio/x-wav"), SoundKind::None);  // the content type alone is not enough
    EXPECT_EQ(sound_kind("x.Wav", ""), SoundKind::Wav);
}

TEST(SoundReader, SmallUtilities) {
    const char be[] = {0x12, 0x34, 0x56, 0x78};
    EXPECT_EQ(read32(be), 0x12345678u);
    EXPECT_EQ(read16(be + 2), 0x5678);
    char text[] = "key=value\nnext line\n";
    char* found = findstr(text, "key=", static_cast<long>(sizeof text - 1));
    ASSERT_NE(found, nullptr);
    EXPECT_STREQ(found, "value");
    EXPECT_EQ(findstr(text, "absent", static_cast<long>(sizeof text - 1)), nullptr);
}

TEST(LoadSound, ReplacesTheSlotOrLeavesItUntouched) {
    SongBank bank;
    test::TempDir dir;
    const auto good = dir.write("blip.wav", wav(1, 8000, 8, {1, 2, 3}));
    bank.t_sound[3] = make_sample(7);
    p_s* before = bank.t_sound[3].get();
    const LoadResult bad = loadsnd(dir.write("bad.wav", {'R', 'I', 'F', 'F'}), "audio/x-wav", bank, 3);
    EXPECT_FALSE(bad.ok);
    EXPECT_EQ(bank.song_sample(3), before);
    const LoadResult ok = loadsnd(good, "audio/x-wav", bank, 3);
    ASSERT_TRUE(ok.ok) << ok.error;
    ASSERT_NE(bank.song_sample(3), nullptr);
    EXPECT_STREQ(bank.song_sample(3)->name, "blip");
    EXPECT_EQ(bank.loadininst.load(), 65535);
    EXPECT_FALSE(loadsnd(good, "", bank, 128).ok);
    EXPECT_FALSE(loadsnd(dir.file("missing.wav"), "", bank, 0).ok);
}

struct CorpusSound {
    const char* file;
    SoundKind kind;
    uint32_t rate;
    int bits;
    uint32_t length;
    bool loop;
};

class CorpusSounds : public ::testing::TestWithParam<CorpusSound> {};

TEST_P(CorpusSounds, ReadAsTheirMakersWroteThem) {
    const CorpusSound& c = GetParam();
    const std::filesystem::path path = std::filesystem::path("../shared/corpus/sound") / c.file;
    if (!std::filesystem::exists(path)) GTEST_SKIP() << path << " is not here";
    const auto bytes = test::read_all(path.string());
    ByteReader r(bytes);
    SampleRef s;
    std::string why;
    ASSERT_TRUE(read_sound(r, c.kind, path.string(), c.file, s, why)) << why;
    EXPECT_EQ(s->rate, c.rate);
    EXPECT_EQ(s->bits, c.bits);
    EXPECT_EQ(s->length, c.length);
    EXPECT_EQ(s->loopon != 0, c.loop);
    EXPECT_EQ(s->stereo, 0);
    int peak = 0;
    for (uint32_t i = 0; i + 1 < s->length; i += (c.bits == 16 ? 2 : 1)) {
        const int v = c.bits == 16 ? static_cast<int16_t>(s->data[i] | s->data[i + 1] << 8)
                                   : static_cast<int8_t>(s->data[i]) * 256;
        peak = std::max(peak, std::abs(v));
    }
    // Read in the right byte order and sign, a sound made by another program peaks well
    // inside full scale rather than at the noise of swapped bytes.
    EXPECT_GT(peak, 1000);
    const int first = c.bits == 16 ? static_cast<int16_t>(s->data[0] | s->data[1] << 8)
                                   : static_cast<int8_t>(s->data[0]) * 256;
    EXPECT_LT(std::abs(first), 4000) << "sounds start near silence";
}

INSTANTIATE_TEST_SUITE_P(Corpus, CorpusSounds,
                         ::testing::Values(CorpusSound{"blip.wav", SoundKind::Wav, 16000, 16, 7600, false},
                                           CorpusSound{"blip8.wav", SoundKind::Wav, 16000, 8, 3800, false},
                                           CorpusSound{"buzz.wav", SoundKind::Wav, 22050, 16, 15930, false},
                                           CorpusSound{"blip.aiff", SoundKind::Aiff, 64000, 16, 7600, false},
                                           CorpusSound{"buzz44.aiff", SoundKind::Aiff, 44100, 16, 31860,
                                                       false},
                                           CorpusSound{"buzz8.avr", SoundKind::Avr, 22050, 8, 7965, true}));

}  // namespace
}  // namespace ondrel
