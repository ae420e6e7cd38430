#include "playback/midi_router.h"

namespace ondrel {

bool MidiRouter::any_attached() const {
    for (const auto& q : queues_)
        if (q.load(std::memory_order_acquire)) return true;
    return false;
}

void MidiRouter::send(const MidiEvent& event) {
    for (auto& q : queues_)
        if (MidiEventQueue* queue = q.load(std::memory_order_acquire))
            if (!queue->push(event)) dropped_.fetch_add(1, std::memory_order_relaxed);
}

void MidiRouter::channel_message(uint8_t status, uint8_t channel, uint8_t data1, uint8_t data2, uint8_t size) {
    MidiEvent e;
    e.bytes = {static_cast<uint8_t>(status | ((channel - 1) & 0x0F)), static_cast<uint8_t>(data1 & 0x7F),
               static_cast<uint8_t>(data2 & 0x7F)};
    e.size = size;
    send(e);
}

// The stamps say when the sequencer sent; every output plays a message as it arrives.
void MidiRouter::NoteOn(uint8_t channel, uint8_t note, uint8_t velocity, uint64_t) {
    channel_message(0x90, channel, note, velocity, 3);
}

void MidiRouter::NoteOff(uint8_t channel, uint8_t note, uint8_t velocity, uint64_t) {
    channel_message(0x80, channel, note, velocity, 3);
}

void MidiRouter::ProgramChange(uint8_t channel, uint8_t program, uint64_t) {
    channel_message(0xC0, channel, program, 0, 2);
}

}  // namespace ondrel
