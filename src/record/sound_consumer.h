#pragma once
#include <atomic>
#include <cstdint>
#include <memory>
#include <string>
#include <thread>

#include "record/capture_hooks.h"
#include "record/capture_source.h"
#include "record/control_port.h"
#include "record/media_format.h"

namespace ondrel {

// Errors of the media framework, beside errno values.
inline constexpr int32_t kErrorBadDestination = -1001;
inline constexpr int32_t kErrorBadFormat = -1002;

// The capture node: receives the buffers of one audio input and hands each to a record
// hook, with a notify hook told of connections, time-outs and the end of its service. Every
// callback and both hooks run on its service thread; the commands below may be sent from
// any thread and are carried out there between buffers.
class SoundConsumer final : public CaptureSink {
public:
    static constexpr int32_t kDestination = 1;  // the node's one input
    static constexpr int64_t kReplyTimeoutUs = 6000000;

    explicit SoundConsumer(const char* name = "SoundConsumer", RecordHook record = nullptr,
                           NotifyHook notify = nullptr, void* cookie = nullptr,
                           std::unique_ptr<ControlPort> port = nullptr,
                           int64_t reply_timeout_us = kReplyTimeoutUs);
    ~SoundConsumer() override;
    SoundConsumer(const SoundConsumer&) = delete;
    SoundConsumer& operator=(const SoundConsumer&) = delete;

    // Replaces the hooks: at once on the service thread; from another thread through the
    // control port, waiting for the reply ("SetHooks reply") up to the reply time-out.
    // 0, ETIMEDOUT, or the port's error.
    int32_t SetHooks(RecordHook record, NotifyHook notify, void* cookie);

    // The node interface, as commands: 0 or an error.
    int32_t Connect(int32_t source, int32_t destination, const MediaFormat& format,
                    const std::string& input_name);
    int32_t Disconnect(int32_t source, int32_t destination);
    int32_t SetTimeSource(const CaptureClock* clock);
    int32_t Start(int64_t performance_time);
    int32_t Stop();

    // The input's thread.
    void deliver(const int16_t* frames, size_t bytes, int64_t start_us) override;

    // Format negotiation: 0, or an error with format changed to what the node would take.
    int32_t AcceptFormat(int32_t destination, MediaFormat& format) const;
    static MediaFormat preferred_format();
    // The service loop's next time-out: below one second it becomes one second, then doubles.
    static int64_t Timeout(int64_t current);

    bool serving() const { return serving_.load(std::memory_order_acquire); }
    const char* name() const { return name_; }

private:
    void ServiceThread();
    int32_t command(PortMessage m);
    void install_hooks(const PortMessage& m);
    int32_t HandleMessage(PortMessage& m);
    int32_t Connected(const PortMessage& m);
    int32_t Disconnected(const PortMessage& m);
    void BufferReceived(const PortMessage& m);
    void tell(int32_t code, const NotifyArgs& args) { notify_(cookie_, code, args); }

    const char* name_;
    std::unique_ptr<ControlPort> port_;
    int64_t reply_timeout_us_;
    std::atomic<bool> serving_{true};
    std::thread service_;
    std::atomic<std::thread::id> service_id_{};

    // The service thread's own.
    RecordHook record_;
    NotifyHook notify_;
    void* cookie_;
    int64_t timeout_ = 0;
    int32_t source_ = 0;  // 0: not connected
    MediaFormat format_;
    char input_name_[64] = {};
    const CaptureClock* time_source_ = nullptr;
    bool running_ = false;
    bool awaiting_first_ = false;
    int64_t start_time_ = 0;
    int64_t time_offset_ = 0;
};

// Text of an error code, errno or the media framework's.
std::string error_text(int32_t error);

}  // namespace ondrel
