#pragma once
#include <cstdint>

namespace ondrel {

// The MIDI output the sequencer sends tracks to: three operations, millisecond stamps.
class MidiOut {
public:
    virtual ~MidiOut() = default;
    virtual void NoteOn(uint8_t channel, uint8_t note, uint8_t velocity, uint64_t time_ms) = 0;
    virtual void NoteOff(uint8_t channel, uint8_t note, uint8_t velocity, uint64_t time_ms) = 0;
    virtual void ProgramChange(uint8_t channel, uint8_t program, uint64_t time_ms) = 0;
};

}  // namespace ondrel
