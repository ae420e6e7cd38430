#pragma once
#include <atomic>
#include <cstdint>
#include <string>
#include <vector>

#include "record/capture_source.h"

namespace ondrel {

inline constexpr const char* kDefaultInputName = "Default Input";

// A capture device of SDL2, read at 44100 Hz in stereo 16-bit; its buffers go to the
// capture node on SDL's own thread. Its clock counts the frames delivered.
class SdlCapture final : public CaptureSource {
public:
    // device: a name from capture_device_names(), or empty for the default input.
    explicit SdlCapture(std::string device = "", int buffer_frames = 1024);
    ~SdlCapture() override;
    SdlCapture(const SdlCapture&) = delete;
    SdlCapture& operator=(const SdlCapture&) = delete;

    const std::string& name() const override { return name_; }
    bool open(CaptureSink& sink, std::string& why) override;
    void close() override;
    bool is_open() const override { return device_id_ != 0; }
    int64_t now_us() const override;

private:
    static void callback(void* self, uint8_t* stream, int len);

    std::string device_;
    std::string name_;
    int buffer_frames_;
    uint32_t device_id_ = 0;
    CaptureSink* sink_ = nullptr;
    std::atomic<int64_t> frames_{0};
};

// The machine's capture devices by name; empty when it has none (recording from the input
// is then not offered; recording the song's own output still is). why says what SDL said.
std::vector<std::string> capture_device_names(std::string* why = nullptr);

}  // namespace ondrel
