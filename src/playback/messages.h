#pragma once
#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>

namespace ondrel {

// A four-character command code, as the menus, windows and threads exchange them.
constexpr uint32_t fourcc(const char (&s)[5]) {
    return uint32_t(uint8_t(s[0])) << 24 | uint32_t(uint8_t(s[1])) << 16 | uint32_t(uint8_t(s[2])) << 8 |
           uint32_t(uint8_t(s[3]));
}

struct Message {
    uint32_t code = 0;
    int32_t a = 0;  // named fields of the few messages that carry any ("note", "vel")
    int32_t b = 0;
};

// Single producer, single consumer, lock-free: how the audio thread tells the window
// thread things ('stop') without calling into it.
template <size_t N>
class SpscQueue {
    static_assert((N & (N - 1)) == 0, "N must be a power of two");

public:
    // Producer side. False when full (the message is dropped).
    bool push(const Message& m) {
        const size_t head = head_.load(std::memory_order_relaxed);
        if (head - tail_.load(std::memory_order_acquire) >= N) return false;
        ring_[head & (N - 1)] = m;
        head_.store(head + 1, std::memory_order_release);
        return true;
    }
    // Consumer side.
    bool pop(Message& m) {
        const size_t tail = tail_.load(std::memory_order_relaxed);
        if (tail == head_.load(std::memory_order_acquire)) return false;
        m = ring_[tail & (N - 1)];
        tail_.store(tail + 1, std::memory_order_release);
        return true;
    }

private:
    std::array<Message, N> ring_{};
    std::atomic<size_t> head_{0};
    std::atomic<size_t> tail_{0};
};

}  // namespace ondrel
