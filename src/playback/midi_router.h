#pragma once
#include <atomic>
#include <cstdint>

#include "playback/midi_event_queue.h"
#include "playback/midi_out.h"

namespace ondrel {

// The MIDI output the sequencer sees (`papi`): it hands every message to the outputs that
// are open, the internal synthesiser and an external port, each through its own queue, so
// that no sender ever waits on an output.
class MidiRouter final : public MidiOut {
public:
    enum Output { Synth = 0, Port = 1, kOutputs };

    // Opened or closed outputs: null detaches. The queue must outlive its attachment (the
    // caller detaches it, then waits for the senders to be out, before freeing it).
    void attach(Output output, MidiEventQueue* queue) { queues_[output].store(queue, std::memory_order_release); }
    bool any_attached() const;

    // Channels 1 to 16, as tracks hold them.
    void NoteOn(uint8_t channel, uint8_t note, uint8_t velocity, uint64_t time_ms) override;
    void NoteOff(uint8_t channel, uint8_t note, uint8_t velocity, uint64_t time_ms) override;
    void ProgramChange(uint8_t channel, uint8_t program, uint64_t time_ms) override;

    // A message as it came in from a MIDI input (passed through to the outputs).
    void send(const MidiEvent& event);
    // Messages dropped because an output's queue was full.
    uint32_t dropped() const { return dropped_.load(std::memory_order_relaxed); }

private:
    void channel_message(uint8_t status, uint8_t channel, uint8_t data1, uint8_t data2, uint8_t size);
    std::atomic<MidiEventQueue*> queues_[kOutputs]{};
    std::atomic<uint32_t> dropped_{0};
};

}  // namespace ondrel
