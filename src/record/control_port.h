#pragma once
#include <array>
#include <atomic>
#include <cstdint>
#include <deque>
#include <memory>
#include <mutex>
#include <semaphore>
#include <string>

#include "record/capture_hooks.h"
#include "record/media_format.h"

namespace ondrel {

class CaptureClock;

// One answer to a command, awaited with a time-out ("SetHooks reply").
class ReplyPort {
public:
    explicit ReplyPort(const char* name) : name_(name) {}
    const char* name() const { return name_; }
    void reply(int32_t status);
    // The status replied, or ETIMEDOUT when none came within timeout_us.
    int32_t wait(int64_t timeout_us);

private:
    const char* name_;
    std::binary_semaphore ready_{0};
    std::atomic<int32_t> status_{0};
};

// Command codes of the node's control port.
inline constexpr int32_t kPortQuit = 0x60000000;
inline constexpr int32_t kPortSetHooks = 0x60000001;
// The media framework's messages, handled by the node between the others.
inline constexpr int32_t kPortBuffer = 0x40000001;
inline constexpr int32_t kPortConnect = 0x40000002;
inline constexpr int32_t kPortDisconnect = 0x40000003;
inline constexpr int32_t kPortStart = 0x40000004;
inline constexpr int32_t kPortStop = 0x40000005;
inline constexpr int32_t kPortSetTimeSource = 0x40000006;

struct PortMessage {
    int32_t code = 0;
    std::shared_ptr<ReplyPort> reply;
    // kPortSetHooks
    RecordHook record = nullptr;
    NotifyHook notify = nullptr;
    void* cookie = nullptr;
    // kPortBuffer: valid until the port recycles it
    const int16_t* data = nullptr;
    size_t bytes = 0;
    int64_t time = 0;  // kPortStart: the performance time to start at
    // kPortConnect, kPortDisconnect, kPortSetTimeSource
    int32_t source = 0;
    int32_t destination = 0;
    MediaFormat format;
    std::string name;
    const CaptureClock* clock = nullptr;
};

// The node's control port: commands from any thread, buffers from the capture device's
// thread. Tests put their own in to make it time out or fail.
class ControlPort {
public:
    enum class Read { Ok, TimedOut, Failed };
    virtual ~ControlPort() = default;
    // Waits up to timeout_us for the next message; Failed sets error.
    virtual Read read(PortMessage& m, int64_t timeout_us, int32_t& error) = 0;
    // A command; 0 or the error (EBADF once closed).
    virtual int32_t write(PortMessage m) = 0;
    // From the capture device's thread: copies the buffer in without waiting or allocating;
    // false (the buffer is lost) when the port is full or closed.
    virtual bool post_buffer(const int16_t* data, size_t bytes, int64_t time) = 0;
    // Gives back the space of a buffer message once it has been handled.
    virtual void recycle(const PortMessage& m) = 0;
    // Later writes fail; a reader is woken and fails.
    virtual void close() = 0;
};

// The port used in the program: a queue of commands and a ring of buffer slots, read in the
// order they were written.
class LocalPort final : public ControlPort {
public:
    static constexpr size_t kSlots = 32;
    static constexpr size_t kSlotBytes = 16384;

    Read read(PortMessage& m, int64_t timeout_us, int32_t& error) override;
    int32_t write(PortMessage m) override;
    bool post_buffer(const int16_t* data, size_t bytes, int64_t time) override;
    void recycle(const PortMessage& m) override;
    void close() override;

private:
    struct Slot {
        std::array<int16_t, kSlotBytes / 2> data;
        size_t bytes;
        int64_t time;
        uint64_t order;
    };
    std::counting_semaphore<> pending_{0};
    std::atomic<uint64_t> order_{0};  // of every message written
    std::mutex mutex_;
    std::deque<std::pair<uint64_t, PortMessage>> commands_;
    std::atomic<bool> closed_{false};
    std::unique_ptr<std::array<Slot, kSlots>> slots_ = std::make_unique<std::array<Slot, kSlots>>();
    std::atomic<size_t> head_{0};  // capture thread
    std::atomic<size_t> tail_{0};  // service thread
};

}  // namespace ondrel
