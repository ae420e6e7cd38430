#pragma once
#include <cstdint>
#include <string>

namespace ondrel {

// The fields of a track's cell the cursor can stand on, left to right as drawn.
enum CellField : int16_t {
    kFieldNote = 0,
    kFieldInstrument0,
    kFieldInstrument1,
    kFieldVolume0,
    kFieldVolume1,
    kFieldVolume2,
    kFieldCommand,
    kFieldParameter0,
    kFieldParameter1,
    kFieldsPerTrack
};

// The computer keyboard's piano: "Amiga" (QWERTY letters, the default) or "Atari" (the
// same piano on a QWERTZ keyboard, where Y and Z change places).
enum class KeyboardLayout : uint8_t { Amiga = 0, Atari = 1 };

// A rectangle of cells, corners inclusive, in tracks and rows of the current pattern.
struct BlockMarks {
    bool active = false;
    int16_t first_track = 0, first_row = 0, last_track = 0, last_row = 0;
};

// Where the editor stands beyond what the sequencer reads (the cursor row, column and
// track, the current sound and the jump step live in the player's EditCursor).
struct EditorState {
    bool edit_mode = false;  // Space toggles; notes are written only while it is on
    int octave = 3;          // base octave of the computer keyboard's piano
    KeyboardLayout layout = KeyboardLayout::Amiga;
    int16_t view_top = 0;  // first row shown ("on_y")
    int16_t oftrack = 0;   // first track shown
    BlockMarks block;
    bool follow_song = true;  // the pattern view follows the play position
};

}  // namespace ondrel
