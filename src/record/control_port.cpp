#include "record/control_port.h"

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <cstring>

namespace ondrel {

void ReplyPort::reply(int32_t status) {
    status_.store(status, std::memory_order_relaxed);
    ready_.release();
}

int32_t ReplyPort::wait(int64_t timeout_us) {
    if (!ready_.try_acquire_for(std::chrono::microseconds(timeout_us))) return ETIMEDOUT;
    return status_.load(std::memory_order_relaxed);
}

ControlPort::Read LocalPort::read(PortMessage& m, int64_t timeout_us, int32_t& error) {
    if (!pending_.try_acquire_for(std::chrono::microseconds(timeout_us))) return Read::TimedOut;
    if (closed_.load(std::memory_order_acquire)) {
        pending_.release();  // every later read fails at once too
        error = EBADF;
        return Read::Failed;
    }
    const size_t tail = tail_.load(std::memory_order_relaxed);
    const bool buffer = tail != head_.load(std::memory_order_acquire);
    const Slot& slot = (*slots_)[tail % kSlots];
    {
        std::lock_guard<std::mutex> guard(mutex_);
        if (!commands_.empty() && (!buffer || commands_.front().first < slot.order)) {
            m = std::move(commands_.front().second);
            commands_.pop_front();
            return Read::Ok;
        }
    }
    if (!buffer) {
        error = EIO;  // a count without a message: cannot happen while posts count right
        return Read::Failed;
    }
    m = PortMessage{};
    m.code = kPortBuffer;
    m.data = slot.data.data();
    m.bytes = slot.bytes;
    m.time = slot.time;
    return Read::Ok;
}

int32_t LocalPort::write(PortMessage m) {
    {
        std::lock_guard<std::mutex> guard(mutex_);
        if (closed_.load(std::memory_order_relaxed)) return EBADF;
        commands_.emplace_back(order_.fetch_add(1, std::memory_order_relaxed), std::move(m));
    }
    pending_.release();
    return 0;
}

bool LocalPort::post_buffer(const int16_t* data, size_t bytes, int64_t time) {
    // Larger buffers take several slots, each with its own start time.
    while (bytes > 0) {
        const size_t part = std::min(bytes, kSlotBytes) & ~size_t{3};
        if (part == 0) return true;
        const size_t head = head_.load(std::memory_order_relaxed);
        if (closed_.load(std::memory_order_relaxed) || head - tail_.load(std::memory_order_acquire) >= kSlots)
            return false;
        Slot& slot = (*slots_)[head % kSlots];
        std::memcpy(slot.data.data(), data, part);
        slot.bytes = part;
        slot.time = time;
        slot.order = order_.fetch_add(1, std::memory_order_relaxed);
        head_.store(head + 1, std::memory_order_release);
        pending_.release();
        data += part / 2;
        bytes -= part;
        time += static_cast<int64_t>(part / 4) * 1000000 / 44100;
    }
    return true;
}

void LocalPort::recycle(const PortMessage& m) {
    if (m.code == kPortBuffer) tail_.fetch_add(1, std::memory_order_release);
}

void LocalPort::close() {
    {
        std::lock_guard<std::mutex> guard(mutex_);
        closed_.store(true, std::memory_order_release);
    }
    pending_.release();
}

}  // namespace ondrel
