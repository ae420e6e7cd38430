// How files are sorted into sounds and modules, and a sound into its slot. What each
// reader makes of a file is in the expected JSON of the cli tests and in the regression
// replay.
#include "import/sound_reader.h"

#include <gtest/gtest.h>

#include "support/temp_dir.h"

namespace ondrel {
namespace {

TEST(SoundReader, FilesAreSortedByExtensionAndContentType) {
    struct Case {
        const char* path;
        const char* mime;
        int type;
        SoundKind kind;
    };
    const Case cases[] = {
        {"a/kick.WAV", "application/octet-stream", kSoundFile, SoundKind::Wav},
        {"x.avr", "", kSoundFile, SoundKind::Avr},
        {"noextension", "audio/x-wav", kSoundFile, SoundKind::None},  // the content type alone reads nothing
        {"song.aif", "application/octet-stream", kSoundFile, SoundKind::FixedHeader},
        {"song.aif", "audio/x-aiff", kSoundFile, SoundKind::Aiff},
        {"song.aiff", "application/octet-stream", kSoundFile, SoundKind::Aiff},
        {"song.otm", "", kModuleFile, SoundKind::None},
        {"tune.xm", "", kModuleFile, SoundKind::None},
        {"tune", "audio/x-mod", kModuleFile, SoundKind::None},
        {"weird.mod", "audio/x-wav", kModuleFile, SoundKind::None},  // the later test wins
        {"notes.txt", "text/plain", kOtherFile, SoundKind::None},
        {"dir.v2/file", "text/plain", kOtherFile, SoundKind::None},
    };
    for (const Case& c : cases) {
        EXPECT_EQ(returntype(c.path, c.mime), c.type) << c.path << " " << c.mime;
        EXPECT_EQ(sound_kind(c.path, c.mime), c.kind) << c.path << " " << c.mime;
    }
    EXPECT_EQ(extension_of("a.b/c"), ".b/c");
    EXPECT_EQ(extension_of("plain"), "");
}

TEST(SoundReader, NamesComeFromTheLeafWithoutItsExtension) {
    const std::pair<std::string, std::string> cases[] = {
        {".wav", ".wav"},
        {"a.b.wav", "a.b"},
        {"noext", "noext"},
        {std::string(50, 'n') + ".wav", std::string(31, 'n')}};
    const std::vector<uint8_t> bytes = test::read_all("tests/import/cases/wav-8bit-stereo.wav");
    for (const auto& [leaf, name] : cases) {
        ByteReader r(bytes);
        SampleRef s;
        std::string why;
        ASSERT_TRUE(read_sound(r, SoundKind::Wav, "/music/" + leaf, leaf, s, why)) << why;
        EXPECT_EQ(s->name, name);
        EXPECT_STREQ(s->source_path, ("/music/" + leaf).c_str());
    }
}

TEST(LoadSound, ReplacesTheSlotOrLeavesItUntouched) {
    SongBank bank;
    test::TempDir dir;
    const auto good = dir.write("blip.wav", test::read_all("tests/import/cases/wav-8bit-stereo.wav"));
    bank.t_sound[3] = make_sample(7);
    p_s* before = bank.t_sound[3].get();
    EXPECT_FALSE(loadsnd(dir.write("bad.wav", {'R', 'I', 'F', 'F'}), "audio/x-wav", bank, 3).ok);
    EXPECT_FALSE(loadsnd(dir.write("bad.txt", {'R', 'I', 'F', 'F'}), "", bank, 3).ok);
    EXPECT_FALSE(loadsnd(dir.file("missing.wav"), "", bank, 3).ok);
    EXPECT_FALSE(loadsnd(good, "", bank, 128).ok);
    EXPECT_EQ(bank.song_sample(3), before);
    const LoadResult ok = loadsnd(good, "audio/x-wav", bank, 3);
    ASSERT_TRUE(ok.ok) << ok.error;
    EXPECT_STREQ(bank.song_sample(3)->name, "blip");
    EXPECT_EQ(bank.loadininst.load(), 65535);
}

TEST(SoundReader, SmallUtilities) {
    const char be[] = {0x12, 0x34, 0x56, 0x78};
    EXPECT_EQ(read32(be), 0x12345678u);
    EXPECT_EQ(read16(be + 2), 0x5678);
    char text[] = "key=value\nnext line\n";
    EXPECT_STREQ(findstr(text, "key=", static_cast<long>(sizeof text - 1)), "value");
    EXPECT_EQ(findstr(text, "absent", static_cast<long>(sizeof text - 1)), nullptr);
}

}  // namespace
}  // namespace ondrel
