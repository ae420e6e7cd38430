#pragma once
#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>

#include "render/audio_format.h"

namespace ondrel {

// Where the mixer hands a 16-bit copy of its output while the song is recorded.
class OutputRecorder {
public:
    virtual ~OutputRecorder() = default;
    // Called on the audio thread: must not block, allocate or do I/O.
    virtual void RecordFile(const int16_t* samples, size_t bytes, const AudioFormat& format) = 0;
};

// A synthesiser played by the song's MIDI tracks, rendered with the song: the mixer asks
// it for each piece right after the sequencer step that may have sent it notes.
class SynthSource {
public:
    virtual ~SynthSource() = default;
    // Audio thread: adds frames of stereo output into out; false when it added nothing.
    virtual bool render_add(float* out, int frames) = 0;
};

// The monitored input: a ring of 16384 bytes of 16-bit stereo frames filled by the capture
// side and read by the mixer at its own pace.
struct MonitorRing {
    static constexpr size_t kBytes = 16384;
    std::array<std::atomic<int16_t>, kBytes / 2> ring{};
    // In 16-bit values; the mixer's, except that starting to monitor sets where it reads.
    std::atomic<size_t> read{0};
};

}  // namespace ondrel
