// The hook on its own thread, the writer on its own, stops at any moment.
#include <atomic>
#include <random>
#include <thread>

#include "record/d2d_header.h"
#include "record/frame_convert.h"
#include "record/record_format.h"
#include "recorder_fixture.h"

namespace ondrel::test {
namespace {

TEST_F(RecorderFixture, StopsAtAnyMomentWhileTheHookRunsOnAnotherThread) {
    engine.mixer.frecmusic = 1;
    std::atomic<bool> quit{false};
    std::atomic<uint32_t> fed{0};  // frames handed to the hook so far
    // About four times real time, in the mixer's buffer size.
    std::thread audio([&] {
        uint32_t frame = 0;
        while (!quit.load()) {
            const auto buffer = ramp_frames(1024, frame);
            recorder.RecordFile(buffer.data(), buffer.size() * 2, AudioFormat{});
            frame += 1024;
            fed.store(frame);
            std::this_thread::sleep_for(std::chrono::microseconds(5000));
        }
    });
    std::mt19937 random(7);
    const int lengths_ms[] = {0, 1, 30, 250, 1100, 2300};
    for (int take = 0; take < 6; ++take) {
        const int mode = take % 4;
        const std::string name = "take" + std::to_string(take) + ".wav";
        start_disk(mode, name);
        const uint32_t started_at = fed.load();
        std::this_thread::sleep_for(std::chrono::milliseconds(lengths_ms[take] + random() % 7));
        const RecordingResult r = recorder.StopRecording();
        ASSERT_TRUE(r.stopped);
        EXPECT_EQ(r.error, 0);
        EXPECT_EQ(r.bytes_lost, 0u);
        const auto file = read_all(dir.file(name));
        const size_t align = record_format(mode).block_align;
        const size_t n = file.size() - kD2dHeaderBytes;
        SCOPED_TRACE(name + ", " + std::to_string(n) + " bytes");
        EXPECT_EQ(n, recorder.bytes_recorded());
        EXPECT_EQ(n % align, 0u);
        EXPECT_EQ(le32_at(file, kRiffSizeAt), n + 8);
        EXPECT_EQ(le32_at(file, kDataSizeAt), n + 46);
        // Whole buffers in a row from one of those fed about when the recording began:
        // none dropped, doubled or moved.
        bool found = false;
        for (int k = -1; k < 64 && !found && n > 0; ++k) {
            const auto in = ramp_frames(n / align, started_at + static_cast<uint32_t>(1024 * k));
            std::vector<uint8_t> want(n);
            convert_frames(mode, true, 1.0, in.data(), n / align, want.data());
            found = std::equal(file.begin() + kD2dHeaderBytes, file.end(), want.begin());
        }
        EXPECT_TRUE(found || n == 0);
    }
    quit = true;
    audio.join();
}

}  // namespace
}  // namespace ondrel::test
