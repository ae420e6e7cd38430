#pragma once
// An audio input fed by hand: each buffer played reaches the sink at once, stamped with the
// input's clock, which then moves on by the buffer's length.
#include <string>
#include <vector>

#include "record/capture_source.h"

namespace ondrel::test {

class FakeInput final : public CaptureSource {
public:
    explicit FakeInput(std::string name = "Line In") : name_(std::move(name)) {}
    bool refuse = false;
    CaptureSink* sink = nullptr;
    int64_t clock = 1000000;
    const std::string& name() const override { return name_; }
    bool open(CaptureSink& s, std::string&) override {
        sink = refuse ? nullptr : &s;
        return !refuse;
    }
    void close() override { sink = nullptr; }
    bool is_open() const override { return sink != nullptr; }
    int64_t now_us() const override { return clock; }
    // A buffer at the input's clock, which then moves on.
    void play(const std::vector<int16_t>& frames) {
        sink->deliver(frames.data(), frames.size() * 2, clock);
        clock += static_cast<int64_t>(frames.size() / 2) * 1000000 / 44100;
    }

private:
    std::string name_;
};

}  // namespace ondrel::test
