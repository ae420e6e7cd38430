#pragma once
#include <cstdint>
#include <cstdio>
#include <string>

#include "export/atomic_file.h"

namespace ondrel {

enum class WavSampleFormat { Pcm8, Pcm16, Float32 };

// Writes a standard RIFF WAVE file as frames arrive. The data go to a temporary file
// beside the target, which replaces the target only when finish() succeeds.
class WavWriter {
public:
    WavWriter() = default;
    ~WavWriter() = default;
    WavWriter(const WavWriter&) = delete;
    WavWriter& operator=(const WavWriter&) = delete;

    bool open(const std::string& path, int channels, int rate, WavSampleFormat format, std::string& why);
    // Interleaved float frames in [-1, 1]; converted to the file's format.
    bool write(const float* samples, size_t frames);
    // Patches the header and renames the file into place.
    bool finish(std::string& why);
    // Drops the temporary file; the target is left as it was.
    void abandon();

    uint64_t frames_written() const { return frames_; }

private:
    bool put(const void* data, size_t bytes);
    bool write_header(uint32_t data_bytes);

    ReplacingFile file_;
    int channels_ = 2, rate_ = 44100;
    WavSampleFormat format_ = WavSampleFormat::Pcm16;
    uint64_t frames_ = 0;
    bool failed_ = false;
};

// Bytes per sample of a format.
int wav_sample_bytes(WavSampleFormat format);

}  // namespace ondrel
