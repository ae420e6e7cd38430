#include "record/capture_connection.h"

#include <cerrno>
#include <string>

namespace ondrel {

namespace {
constexpr int32_t kInputOutput = 1;  // the input's one raw-audio output
}

int32_t CaptureConnection::fail(const char* step, int32_t error) {
    std::fprintf(diagnostics_, "CaptureWindow::MakeRecordConnection(): %s\n", step);
    std::fflush(diagnostics_);
    if (input_ && input_->is_open()) input_->close();
    return error;
}

int32_t CaptureConnection::MakeRecordConnection(RecordHook record, NotifyHook notify, void* cookie) {
    if (!input_) return fail("no free outputs from audio input node", ENODEV);
    if (input_->is_open()) return fail("no free outputs from audio input node", EBUSY);
    std::string why;
    if (!input_->open(node_, why)) return fail("couldn't get free outputs from audio input node", EIO);
    if (!node_.serving()) return fail("couldn't get free inputs for sound recorder", EBADF);
    if (destination_ != 0) return fail("no free inputs for sound recorder", EBUSY);
    if (const int32_t e = node_.SetTimeSource(input_))
        return fail("couldn't set the sound recorder's time source", e);
    if (const int32_t e = node_.SetHooks(record, notify, cookie))
        return fail("couldn't set the sound recorder's hook functions", e);
    const MediaFormat output{MediaType::RawAudio, 44100.0f, 2, kFormatShort};
    if (const int32_t e = node_.Connect(kInputOutput, SoundConsumer::kDestination, output, input_->name()))
        return fail("failed to connect sound recorder to audio input node.", e);
    source_ = kInputOutput;
    destination_ = SoundConsumer::kDestination;
    return 0;
}

int32_t CaptureConnection::start(int64_t delay_us) {
    if (!connected() || !input_) return ENOTCONN;
    return node_.Start(input_->now_us() + delay_us);
}

void CaptureConnection::BreakRecordConnection() {
    if (!connected()) return;
    node_.Stop();
    node_.Disconnect(source_, destination_);
    if (input_) input_->close();
    source_ = 0;
    destination_ = 0;
}

void CaptureConnection::clear_hooks() {
    node_.SetHooks(nullptr, nullptr, nullptr);
}

}  // namespace ondrel
