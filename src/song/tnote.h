#pragma once
#include <cstdint>

namespace ondrel {

// One pattern cell, 6 bytes as stored in memory and in the native format.
struct TNOTE {
    uint8_t note = 0;    // 0 = none; bit 7 = note-off
    uint8_t volume = 0;  // 0 = none
    uint8_t spare = 0;
    uint8_t instrument = 0;  // 0 = none, else 1..127
    uint8_t command = 0;
    uint8_t parameter = 0;

    bool empty() const { return (note | volume | spare | instrument | command | parameter) == 0; }
    friend bool operator==(const TNOTE&, const TNOTE&) = default;
};
static_assert(sizeof(TNOTE) == 6, "a cell is 6 bytes");

}  // namespace ondrel
