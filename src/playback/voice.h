#pragma once
#include <cstdint>

namespace ondrel {

inline constexpr int kVoices = 256;

// One entry of the voice list nlist. The sequencer fills it; the mixer reads it and keeps
// its read position, fraction and fade clock in it.
struct Voice {
    int32_t active = 0;    // 1: the mixer plays it
    float period = 0;      // after vibrato and arpeggio
    float baseperiod = 0;  // after slides
    float noteperiod = 0;  // the cell's note without finetune; 0 when none this row
    uint16_t note = 0;
    uint16_t instrument = 0;  // 1..127
    int16_t volume = 0;       // 0..128
    uint16_t keyoff = 0;      // released: the fade envelope runs
    uint32_t position = 0;    // read position in frames
    uint32_t count1 = 0;      // fade clock: frames since release
    uint32_t count2 = 0;
    uint32_t endpos = 0;  // block end in frames; 0 = the sample's end
    float portatarget = 0;
    uint8_t portaspeed = 0;
    uint8_t portaflag = 0;
    int8_t vibpos = 0;
    uint8_t vibparam = 0;
    uint16_t finetune = 0;
    uint16_t block = 0;
    float fraction = 0;  // fractional read position, in [0, 1)
};

}  // namespace ondrel
