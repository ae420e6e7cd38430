#pragma once
#include <optional>

#include "shell/editor_state.h"
#include "shell/keys.h"

namespace ondrel {

inline constexpr int kLowestOctave = 0;
inline constexpr int kHighestOctave = 6;

// The note a key plays on the computer keyboard's piano, for a base octave (0..6, as the
// note names count octaves: base octave 3 puts C 3, note 60, on the first key). None for
// keys outside the piano.
std::optional<int> piano_note(KeyboardLayout layout, int32_t key, int octave);
// The key that enters a note-off.
bool is_note_off_key(int32_t key);

// A digit typed into a field: the cell with that digit written in, or none when the key
// is no digit of that field (volume and instrument are decimal, the instrument's tens
// also A to C for 100 to 127; the command is 0-9 or A-Z; the parameter hexadecimal).
std::optional<TNOTE> type_digit(const TNOTE& cell, int field, int32_t key);

}  // namespace ondrel
