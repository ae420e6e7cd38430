#pragma once
#include <cstdint>

namespace ondrel {

// One pattern cell, 6 bytes as stored in memory and in the native format. Written by the
// module readers and the pattern editor; read by the sequencer once per row and track.
struct TNOTE {
    uint8_t note = 0;    // 0 = none; 1..127 a note (index of floatnote, MOD notes 36..71); bit 7 = note-off
    uint8_t volume = 0;  // 0 = none; else the note's volume, 128 = full (S3M: 2 x column + 1)
    uint8_t spare = 0;   // unused, kept as stored (0 from every reader)
    uint8_t instrument = 0;  // 0 = none; else the song's sound number, 1..127
    uint8_t command = 0;     // effect command code, 0..255: the classic 0..15, then the program's own
    uint8_t parameter = 0;   // the command's parameter, shown as two hexadecimal digits

    bool empty() const { return (note | volume | spare | instrument | command | parameter) == 0; }
    friend bool operator==(const TNOTE&, const TNOTE&) = default;
};
static_assert(sizeof(TNOTE) == 6, "a cell is 6 bytes");

}  // namespace ondrel
