// Disk recordings fed through the hook: what the file holds after N bytes, whatever N.
#include <sys/resource.h>

#include <csignal>
#include <filesystem>

#include "record/d2d_header.h"
#include "record/frame_convert.h"
#include "record/record_format.h"
#include "recorder_fixture.h"
#include "support/wait_until.h"

namespace ondrel::test {
namespace {

class DiskRecordingTest : public RecorderFixture {
protected:
    void SetUp() override { engine.mixer.frecmusic = 1; }  // the song's output: no input to connect

    // The bytes the ramp from frame start gives in mode.
    static std::vector<uint8_t> expected_data(int mode, uint32_t start, size_t frames) {
        const auto in = ramp_frames(frames, start);
        std::vector<uint8_t> out(frames * kMaxBytesPerFrame);
        out.resize(convert_frames(mode, true, 1.0, in.data(), frames, out.data()));
        return out;
    }
};

struct LengthCase {
    int mode;
    size_t frames;
    size_t per_buffer;
    const char* what;
};

TEST_F(DiskRecordingTest, FileSizesAndDataAfterNBytes) {
    const LengthCase cases[] = {
        {1, 0, 1024, "stopped at once"},
        {1, 1, 1024, "one frame"},
        {1, kRingHalf / 4, 1024, "exactly half the ring"},
        {1, kRingHalf / 4 + 1, 1024, "one frame into the second half"},
        {1, kRecordLimit / 4, 1200, "exactly the ring: the second half is still in memory"},
        {1, kRecordLimit / 4 + 700, 1000, "stopped just after a wrap, the overflow moved to the start"},
        {0, 3 * kRecordLimit / 2 + 333, 4096, "mono 16 over one and a half rings"},
        {2, 2 * kRecordLimit + kRingHalf + 5, 4096, "mono 8 over two and a half rings"},
        {3, kRecordLimit + 1, 777, "stereo 8, odd buffers"},
    };
    int take = 0;
    for (const auto& c : cases) {
        SCOPED_TRACE(c.what);
        const std::string name = "take" + std::to_string(++take) + ".wav";
        start_disk(c.mode, name);
        ASSERT_TRUE(recorder.isRecording());
        const uint32_t first = next_frame;
        feed(c.frames, c.per_buffer);
        const RecordingResult r = recorder.StopRecording();
        EXPECT_TRUE(r.stopped);
        EXPECT_EQ(r.error, 0);
        EXPECT_EQ(r.bytes_lost, 0u);
        const auto file = read_all(dir.file(name));
        const RecordFormat& f = record_format(c.mode);
        const size_t n = c.frames * f.block_align;
        ASSERT_EQ(file.size(), kD2dHeaderBytes + n);
        EXPECT_EQ(r.file_bytes, file.size());
        EXPECT_EQ(le32_at(file, kRiffSizeAt), n + 8);
        EXPECT_EQ(le32_at(file, kDataSizeAt), n + 46);
        const auto field = [&](size_t at, size_t bytes) {
            return bytes == 4 ? le32_at(file, at) : uint32_t{file[at]} | uint32_t{file[at + 1]} << 8;
        };
        const uint32_t format_fields[][3] = {{16, 4, 18},          {20, 2, 1},
                                             {22, 2, f.channels},  {24, 4, 44100},
                                             {28, 4, f.byte_rate}, {32, 2, f.block_align},
                                             {34, 2, f.bits},      {36, 2, 0}};
        for (const auto& [at, bytes, value] : format_fields)
            EXPECT_EQ(field(at, bytes), value) << "at " << at;
        const auto text = [&](size_t at) { return std::string(file.begin() + at, file.begin() + at + 4); };
        EXPECT_EQ(text(0) + text(8) + text(12) + text(38), "RIFFWAVEfmt data");
        EXPECT_TRUE(std::equal(file.begin() + kD2dHeaderBytes, file.end(),
                               expected_data(c.mode, first, c.frames).begin()))
            << "the data differ from what was fed";
    }
    const std::string text = printed();
    EXPECT_NE(text.find("ecrit entete d2D !!! \n"), std::string::npos);
    EXPECT_NE(text.find("stoppe enreigstre\nstoppe enreigstre BREAK !!! \nstoppe enreigstre 2 !!! \n"),
              std::string::npos);
    EXPECT_NE(text.find("retour  "), std::string::npos) << "the wraps are told";
}

TEST_F(DiskRecordingTest, ANewRecordingClearsOnlyTheFirstByteOfTheOldSizes) {
    start_disk(1, "first.wav");
    feed(100000);
    recorder.StopRecording();
    const auto first = read_all(dir.file("first.wav"));
    start_disk(1, "second.wav");
    feed(kRingHalf / 4 + 10);
    ASSERT_TRUE(wait_until([&] { return recorder.bytes_written() > 0; }));
    // While it runs the file sits beside its final name, its header as written at the start.
    std::vector<uint8_t> running;
    for (const auto& e : std::filesystem::directory_iterator(dir.path()))
        if (e.path().filename().string().rfind(".second.wav.", 0) == 0) running = read_all(e.path().string());
    ASSERT_GE(running.size(), kD2dHeaderBytes);
    EXPECT_EQ(le32_at(running, kRiffSizeAt), le32_at(first, kRiffSizeAt) & 0xffffff00u);
    EXPECT_EQ(le32_at(running, kDataSizeAt), le32_at(first, kDataSizeAt) & 0xffffff00u);
    EXPECT_NE(le32_at(first, kDataSizeAt) & 0xffffff00u, 0u);
    recorder.StopRecording();
    EXPECT_EQ(le32_at(read_all(dir.file("second.wav")), kDataSizeAt), 46u + kRingHalf + 40u);
}

TEST_F(DiskRecordingTest, AFileThatCannotBeCreatedIsAnAlertAndNoRecording) {
    start_disk(1, "missing/take.wav");
    EXPECT_FALSE(recorder.isRecording());
    ASSERT_EQ(engine.alert_log.shown.size(), 1u);
    EXPECT_EQ(engine.alert_log.shown[0].text,
              "Cannot create the recording file: No such file or directory.\n[2]");
    EXPECT_EQ(engine.alert_log.shown[0].buttons, std::vector<std::string>{"Stop"});
}

TEST_F(DiskRecordingTest, AFullDiskStopsTheRecordingAndKeepsAWholeFile) {
    // A file size limit stands in for a full disk.
    std::signal(SIGXFSZ, SIG_IGN);
    rlimit old{};
    getrlimit(RLIMIT_FSIZE, &old);
    rlimit small = old;
    small.rlim_cur = 500001;
    ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &small), 0);
    start_disk(1);
    Message m;
    bool asked = false;
    for (int i = 0; i < 400 && !asked; ++i) {
        feed(4096);
        std::this_thread::sleep_for(std::chrono::milliseconds(5));
        asked = recorder.poll(m) && m.code == kMsgStre;
    }
    setrlimit(RLIMIT_FSIZE, &old);
    ASSERT_TRUE(asked) << "the failed write asks the window to stop";
    const RecordingResult r = recorder.StopRecording();
    EXPECT_EQ(r.error, EFBIG);
    const auto file = read_all(dir.file("take.wav"));
    EXPECT_EQ(file.size(), 46u + (500001u - 46u) / 4 * 4) << "cut back to whole frames";
    EXPECT_EQ(le32_at(file, kDataSizeAt), file.size());
    EXPECT_EQ(le32_at(file, kRiffSizeAt), file.size() - 38);
    EXPECT_TRUE(std::equal(file.begin() + kD2dHeaderBytes, file.end(), expected_data(1, 0, 200000).begin()));
    ASSERT_EQ(engine.alert_log.shown.size(), 1u);
    EXPECT_EQ(engine.alert_log.shown[0].text, "Cannot write the recording file: File too large.\n[1b]");
}

}  // namespace
}  // namespace ondrel::test
