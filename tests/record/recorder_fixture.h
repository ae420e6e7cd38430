#pragma once
// A recorder on a fresh engine, fed by hand, with its printed diagnostics kept.
#include <gtest/gtest.h>

#include <chrono>
#include <cstdio>
#include <memory>
#include <string>
#include <thread>
#include <vector>

#include "engine/engine.h"
#include "record/frame_convert.h"
#include "record/recorder.h"
#include "support/temp_dir.h"

namespace ondrel::test {

// Stereo 16-bit frames whose values never repeat within a run: left counts up from start,
// right counts down.
inline std::vector<int16_t> ramp_frames(size_t frames, uint32_t start = 0) {
    std::vector<int16_t> v(2 * frames);
    for (size_t i = 0; i < frames; ++i) {
        v[2 * i] = static_cast<int16_t>(start + i);
        v[2 * i + 1] = static_cast<int16_t>(~(start + i));
    }
    return v;
}

inline uint32_t le32_at(const std::vector<uint8_t>& b, size_t at) {
    return b[at] | b[at + 1] << 8 | b[at + 2] << 16 | uint32_t{b[at + 3]} << 24;
}

class RecorderFixture : public ::testing::Test {
protected:
    TempDir dir;
    // Closed after the recorder, which may still print as it goes.
    std::unique_ptr<std::FILE, int (*)(std::FILE*)> notes{std::tmpfile(), std::fclose};
    std::FILE* diagnostics = notes.get();
    Engine engine;
    Recorder recorder{engine.mixer, &engine.alert_log, nullptr, diagnostics};
    uint32_t next_frame = 0;

    std::string printed() {
        std::fflush(diagnostics);
        std::rewind(diagnostics);
        std::string text;
        for (int c; (c = std::fgetc(diagnostics)) != EOF;) text.push_back(static_cast<char>(c));
        return text;
    }

    void start_disk(int mode, const std::string& name = "take.wav") {
        recorder.samplermode = static_cast<uint16_t>(mode);
        recorder.soundrecoutput = 1;
        recorder.set_d2dref(dir.file(name));
        recorder.Record(kMsgReco);
    }

    // Feeds frames of the ramp in buffers, as the song's output would, giving a disk
    // recording's writer thread the time it needs so that nothing is lost.
    void feed(size_t frames, size_t per_buffer = 1024) {
        while (frames > 0) {
            const size_t n = std::min(frames, per_buffer);
            const auto buffer = ramp_frames(n, next_frame);
            const uint64_t end = recorder.bytes_recorded() + n * kMaxBytesPerFrame;
            const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(10);
            while (recorder.soundrecoutput == 1 && end > recorder.bytes_written() + kRecordLimit &&
                   std::chrono::steady_clock::now() < deadline)
                std::this_thread::sleep_for(std::chrono::milliseconds(1));
            recorder.RecordFile(buffer.data(), buffer.size() * 2, AudioFormat{});
            next_frame += static_cast<uint32_t>(n);
            frames -= n;
        }
    }
};

}  // namespace ondrel::test
