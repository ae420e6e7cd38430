#pragma once
#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>

namespace ondrel {

// One short MIDI message (note on and off, program change...), and how many frames of
// output must pass before it takes effect (0: at once).
struct MidiEvent {
    std::array<uint8_t, 3> bytes{};
    uint8_t size = 0;
    uint32_t delay_frames = 0;
};

// Bounded, lock-free, any number of producers and one consumer: the sequencer on the audio
// thread, the MIDI input's thread and the window all send to the same output, and the
// output's own thread (or the audio thread, for the synthesiser) takes the events in order.
class MidiEventQueue {
public:
    static constexpr size_t kCapacity = 1024;

    MidiEventQueue() {
        for (size_t i = 0; i < kCapacity; ++i) cells_[i].sequence.store(i, std::memory_order_relaxed);
    }

    // False when full: the event is dropped rather than waited for.
    bool push(const MidiEvent& event) {
        size_t pos = head_.load(std::memory_order_relaxed);
        for (;;) {
            Cell& cell = cells_[pos % kCapacity];
            const size_t seq = cell.sequence.load(std::memory_order_acquire);
            const auto diff = static_cast<std::ptrdiff_t>(seq) - static_cast<std::ptrdiff_t>(pos);
            if (diff == 0) {
                if (head_.compare_exchange_weak(pos, pos + 1, std::memory_order_relaxed)) {
                    cell.event = event;
                    cell.sequence.store(pos + 1, std::memory_order_release);
                    return true;
                }
            } else if (diff < 0) {
                return false;
            } else {
                pos = head_.load(std::memory_order_relaxed);
            }
        }
    }

    // Consumer side only.
    bool pop(MidiEvent& event) {
        Cell& cell = cells_[tail_ % kCapacity];
        if (cell.sequence.load(std::memory_order_acquire) != tail_ + 1) return false;
        event = cell.event;
        cell.sequence.store(tail_ + kCapacity, std::memory_order_release);
        ++tail_;
        return true;
    }

private:
    struct Cell {
        std::atomic<size_t> sequence{0};
        MidiEvent event;
    };
    std::array<Cell, kCapacity> cells_{};
    std::atomic<size_t> head_{0};
    size_t tail_ = 0;
};

}  // namespace ondrel
