#pragma once
#include <cstdint>

namespace ondrel {

inline constexpr int kVoices = 256;  // voices 0..63 are the tracks' own, the rest serve polyphony

// One entry of the voice list nlist. The sequencer fills it when a note starts and
// changes it every tick (periods, volume); the mixer reads it and keeps its read position,
// fraction and fade clock in it. Only the audio thread touches it while a song plays.
struct Voice {
    int32_t active = 0;       // 1: the mixer plays it; set by a note trigger, cleared at the sample's end
    float period = 0;         // period played now, after vibrato and arpeggio (larger = lower)
    float baseperiod = 0;     // period after slides and portamento, around which vibrato moves
    float noteperiod = 0;     // the cell's note period without finetune; 0 when no note this row
    uint16_t note = 0;        // note number 1..127 last triggered (arpeggio counts from it)
    uint16_t instrument = 0;  // sound number in the song, 1..127; 0 before any
    int16_t volume = 0;       // 0..128 (command 12 may put it above)
    uint16_t keyoff = 0;      // 1 after a note-off: the fade envelope runs
    uint32_t position = 0;    // read position in frames of the sample (sample offset, block start)
    uint32_t count1 = 0;      // fade clock: frames played since the note-off
    uint32_t count2 = 0;      // a second counter, reset with the first at every trigger
    uint32_t endpos = 0;      // frame the voice stops at (a block's end); 0 = the sample's end
    float portatarget = 0;    // period a tone portamento slides to; 0 = none
    uint8_t portaspeed = 0;   // tone portamento speed in period units per tick, kept between rows
    uint8_t portaflag = 0;    // 1 while a tone portamento row is in force
    int8_t vibpos = 0;        // vibrato phase, advanced by 4 x speed each tick
    uint8_t vibparam = 0;     // vibrato speed (high nibble) and depth (low nibble), kept between rows
    uint16_t finetune = 0;    // 0..15, from the sound or command E5x (see finetune_factor)
    uint16_t block = 0;       // 0 = the whole sample; 1..8 = block n of its marks (command 30)
    float fraction = 0;       // fractional read position, in [0, 1), kept by the mixer
};

}  // namespace ondrel
