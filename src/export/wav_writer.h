#pragma once
#include <cstdint>
#include <string>
#include <vector>

#include "export/output_file.h"

namespace ondrel {

enum class WavSampleFormat { Pcm8, Pcm16, Float32 };

// Writes a standard RIFF WAVE file as frames arrive, by the rules of OutputFile: a file
// replaces its target only when finish() succeeds; a pipe or device gets the frames as they
// come, under a header whose sizes say "unknown, read to the end" (0xFFFFFFFF), since it
// cannot be rewound to write the real ones.
class WavWriter {
public:
    WavWriter() = default;
    ~WavWriter() = default;
    WavWriter(const WavWriter&) = delete;
    WavWriter& operator=(const WavWriter&) = delete;

    bool open(const std::string& path, int channels, int rate, WavSampleFormat format, std::string& why);
    // Interleaved float frames in [-1, 1]; converted to the file's format.
    bool write(const float* samples, size_t frames);
    // Writes the real sizes where the file can be rewound, and puts the file in place.
    bool finish(std::string& why);
    // Drops the temporary file; the target is left as it was.
    void abandon();

    uint64_t frames_written() const { return frames_; }
    // The first write failure, as one line.
    const std::string& error() const { return file_.error(); }

private:
    std::vector<uint8_t> header(uint32_t data_bytes, uint32_t frames) const;

    OutputFile file_;
    int channels_ = 2, rate_ = 44100;
    WavSampleFormat format_ = WavSampleFormat::Pcm16;
    uint64_t frames_ = 0;
};

// Bytes per sample of a format.
int wav_sample_bytes(WavSampleFormat format);

}  // namespace ondrel
