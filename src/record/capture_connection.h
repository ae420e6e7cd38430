#pragma once
#include <cstdint>
#include <cstdio>

#include "record/capture_source.h"
#include "record/record_input.h"
#include "record/sound_consumer.h"

namespace ondrel {

// The recorder node and the chosen input (none when the machine has no capture device).
class CaptureConnection final : public RecordInput {
public:
    CaptureConnection(SoundConsumer& node, CaptureSource* input, std::FILE* diagnostics = stdout)
        : node_(node), input_(input), diagnostics_(diagnostics) {}
    ~CaptureConnection() override { BreakRecordConnection(); }
    CaptureConnection(const CaptureConnection&) = delete;
    CaptureConnection& operator=(const CaptureConnection&) = delete;

    // The input chosen in the panel; only while not connected.
    void set_input(CaptureSource* input) { input_ = input; }
    CaptureSource* input() const { return input_; }
    bool connected() const { return destination_ != 0; }

    int32_t MakeRecordConnection(RecordHook record, NotifyHook notify, void* cookie) override;
    int32_t start(int64_t delay_us) override;
    void BreakRecordConnection() override;
    void clear_hooks() override;

private:
    int32_t fail(const char* step, int32_t error);

    SoundConsumer& node_;
    CaptureSource* input_;
    std::FILE* diagnostics_;
    int32_t source_ = 0;
    int32_t destination_ = 0;
};

}  // namespace ondrel
