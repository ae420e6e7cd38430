#pragma once
#include <cstddef>
#include <cstdint>
#include <string>

namespace ondrel {

// A time source: microseconds of sound an input has delivered since it opened.
class CaptureClock {
public:
    virtual ~CaptureClock() = default;
    virtual int64_t now_us() const = 0;
};

// Where an input delivers its buffers, on the input's own thread: must not wait.
class CaptureSink {
public:
    virtual ~CaptureSink() = default;
    // Interleaved stereo 16-bit frames; start_us on the input's clock.
    virtual void deliver(const int16_t* frames, size_t bytes, int64_t start_us) = 0;
};

// An audio input (a capture device) with its one raw-audio output.
class CaptureSource : public CaptureClock {
public:
    virtual const std::string& name() const = 0;
    // Opens the device and delivers every buffer to sink until closed; false with why set
    // when the device cannot be opened.
    virtual bool open(CaptureSink& sink, std::string& why) = 0;
    virtual void close() = 0;
    virtual bool is_open() const = 0;
};

}  // namespace ondrel
