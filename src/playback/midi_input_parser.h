#pragma once
#include <cstddef>
#include <cstdint>
#include <optional>

#include "playback/midi_event_queue.h"

namespace ondrel {

// Turns what a MIDI input delivers into whole channel messages: data bytes that follow
// without a status byte reuse the last one (running status), system messages are left
// out and clear the running status as the MIDI rules say (real-time bytes do not).
class MidiInputParser {
public:
    // Feeds bytes; calls on_message for each complete channel message.
    template <class F>
    void feed(const uint8_t* bytes, size_t size, F&& on_message) {
        for (size_t i = 0; i < size; ++i)
            if (auto m = take(bytes[i])) on_message(*m);
    }

    // A note-on with a velocity: the notes the editor enters (a note-on at velocity 0 is a
    // note-off).
    static bool is_note_played(const MidiEvent& m) { return (m.bytes[0] & 0xF0) == 0x90 && m.bytes[2] != 0; }

private:
    std::optional<MidiEvent> take(uint8_t byte);
    uint8_t status_ = 0;
    uint8_t data_[2]{};
    int have_ = 0;
};

}  // namespace ondrel
