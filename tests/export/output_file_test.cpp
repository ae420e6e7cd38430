#include "export/output_file.h"

#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>

#include <csignal>
#include <filesystem>
#include <thread>

#include "export/wav_writer.h"
#include "support/temp_dir.h"

namespace ondrel {
namespace {

namespace fs = std::filesystem;
const std::vector<uint8_t> kOld{'o', 'l', 'd'}, kNew{'n', 'e', 'w', '!'};

size_t entries(const test::TempDir& dir) {
    return static_cast<size_t>(std::distance(fs::directory_iterator(dir.path()), fs::directory_iterator()));
}

// Where the user points, what is written there, and what is left in the folder.
TEST(OutputFile, RegularFilesAndLinksAreReplacedWholeAndKeepWhatTheyWere) {
    struct Case {
        const char* name;
        const char* link;  // a symbolic link to the target given as the path, or null
        bool exists;
    };
    for (const Case& c : {Case{"new file", nullptr, false}, Case{"existing file", nullptr, true},
                          Case{"link to a file", "target", true}, Case{"dangling link", "target", false}}) {
        test::TempDir dir;
        const std::string target = dir.file("target");
        if (c.exists) {
            dir.write("target", kOld);
            fs::permissions(target, fs::perms(0640));
        }
        std::string path = target, why;
        if (c.link) fs::create_symlink(c.link, path = dir.file("link"));
        ASSERT_TRUE(write_output_file(path, kNew, why)) << c.name << ": " << why;
        EXPECT_EQ(test::read_all(target), kNew) << c.name;
        if (c.link) {
            EXPECT_EQ(fs::read_symlink(path), c.link) << c.name;
        }
        if (c.exists) {
            EXPECT_EQ(static_cast<int>(fs::status(target).permissions()), 0640) << c.name;
        }
        EXPECT_EQ(entries(dir), c.link ? 2u : 1u) << c.name << ": a temporary file was left";
    }
}

// A read-only target is refused; a write error midway (a file size limit standing in
// for a full disk) leaves the previous file too.
TEST(OutputFile, AFailedWriteSaysWhyAndLeavesThePreviousFileAndNoTemporary) {
    for (const bool read_only : {true, false}) {
        SCOPED_TRACE(read_only ? "read-only" : "write error");
        test::TempDir dir;
        const std::string path = dir.write("take.wav", kOld);
        if (read_only) fs::permissions(path, fs::perms(0444));
        rlimit before{};
        getrlimit(RLIMIT_FSIZE, &before);
        auto* const xfsz = std::signal(SIGXFSZ, SIG_IGN);
        rlimit small = before;
        small.rlim_cur = read_only ? before.rlim_cur : 1000;  // a write past it fails with EFBIG
        setrlimit(RLIMIT_FSIZE, &small);
        std::string why;
        const bool written = write_output_file(path, std::vector<uint8_t>(200000, 7), why);
        setrlimit(RLIMIT_FSIZE, &before);
        std::signal(SIGXFSZ, xfsz);
        EXPECT_FALSE(written);
        EXPECT_NE(why.find("take.wav"), std::string::npos) << why;
        EXPECT_EQ(test::read_all(path), kOld);
        EXPECT_EQ(entries(dir), 1u);
    }
}

TEST(OutputFile, AFullDeviceGivesOneLineAndStaysADevice) {
    if (!fs::is_character_file("/dev/full")) GTEST_SKIP() << "no /dev/full here";
    std::string why;
    EXPECT_FALSE(write_output_file("/dev/full", kNew, why));
    EXPECT_EQ(why, "cannot write /dev/full: No space left on device");
    EXPECT_TRUE(fs::is_character_file("/dev/full"));
}

// A pipe is streamed into and stays a pipe; the WAV sizes it cannot be rewound for say
// "unknown" and the frames follow the header.
TEST(OutputFile, AFifoIsStreamedIntoAndItsWavSizesSayUnknown) {
    test::TempDir dir;
    const std::string fifo = dir.file("pipe");
    ASSERT_EQ(mkfifo(fifo.c_str(), 0600), 0);
    std::vector<uint8_t> got;
    std::thread reader([&] { got = test::read_all(fifo); });
    WavWriter wav;
    std::string why;
    ASSERT_TRUE(wav.open(fifo, 1, 8000, WavSampleFormat::Pcm8, why)) << why;
    const std::vector<float> frames(100000, 1.0f);  // more than a pipe holds
    EXPECT_TRUE(wav.write(frames.data(), frames.size()));
    EXPECT_TRUE(wav.finish(why)) << why;
    reader.join();
    EXPECT_TRUE(fs::is_fifo(fifo));
    ASSERT_EQ(got.size(), 44 + frames.size());
    for (size_t at : {4, 40}) EXPECT_EQ(got[at] & got[at + 1] & got[at + 2] & got[at + 3], 0xFF) << at;
    EXPECT_EQ(got.back(), 255);
}

TEST(OutputFile, AReaderThatLeavesGivesABrokenPipeNotADeadProgram) {
    test::TempDir dir;
    const std::string fifo = dir.file("pipe");
    ASSERT_EQ(mkfifo(fifo.c_str(), 0600), 0);
    std::thread reader([&] { std::ifstream opened_and_closed(fifo); });
    OutputFile out;
    std::string why;
    ASSERT_TRUE(out.open(fifo, why)) << why;
    EXPECT_FALSE(out.seekable());
    reader.join();
    const std::vector<uint8_t> block(1 << 20);
    EXPECT_FALSE(out.write(block.data(), block.size()) && out.commit(why));
    EXPECT_EQ(out.error(), "cannot write " + fifo + ": Broken pipe");
}

}  // namespace
}  // namespace ondrel
