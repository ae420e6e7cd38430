#pragma once
#include <cstdint>
#include <string>
#include <vector>

namespace ondrel {

inline constexpr uint8_t kMidiNoteOff = 0x80;
inline constexpr uint8_t kMidiNoteOn = 0x90;
inline constexpr uint8_t kMidiProgramChange = 0xC0;

// A channel message at a tick of the file.
struct MidiMessage {
    uint32_t tick = 0;
    uint8_t kind = kMidiNoteOn;  // kMidiNoteOff, kMidiNoteOn or kMidiProgramChange
    uint8_t channel = 1;         // 1..16, as tracks hold them
    uint8_t data1 = 0;           // note or program
    uint8_t data2 = 0;           // velocity; unused by a program change
};

struct MidiTempo {
    uint32_t tick = 0;
    uint32_t us_per_quarter = 500000;
};

struct MidiTrack {
    std::string name;
    std::vector<MidiMessage> messages;  // in tick order
};

// What a Standard MIDI File of format 1 holds: a tempo track named after the song, then
// the tracks in order. Every track ends at end_tick (or at its last message, if later).
struct MidiSong {
    uint16_t division = 960;        // ticks per quarter note
    std::string name;               // the tempo track's name
    std::vector<MidiTempo> tempo;   // in tick order
    std::vector<MidiTrack> tracks;  // after the tempo track
    uint32_t end_tick = 0;
};

std::vector<uint8_t> midi_file_bytes(const MidiSong& song);
bool save_midi_file(const std::string& path, const MidiSong& song, std::string& why);

}  // namespace ondrel
