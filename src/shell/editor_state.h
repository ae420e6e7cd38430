#pragma once
#include <array>
#include <cstdint>
#include <string>
#include <vector>

#include "edit/cell_block.h"
#include "edit/sound_edits.h"

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

// Notes of a chord being typed ("Accord Edit"): the row it goes to, its first track, and
// the note keys still held.
struct ChordEntry {
    int row = 0;
    int first_track = 0;
    int notes = 0;
    int keys_down = 0;
};

// What a search looks for and what a replacement writes, kept between searches.
struct SearchState {
    CellMask find;
    CellMask replace;
    EditRange::Kind scope = EditRange::Kind::Pattern;
};

// Where the editor stands beyond what the sequencer reads (the cursor row, column and
// track, the current sound and the jump step live in the player's EditCursor).
struct EditorState {
    bool edit_mode = false;  // Space toggles; notes are written only while it is on
    int octave = 3;          // base octave of the computer keyboard's piano
    // The five octaves around the last note from a MIDI keyboard (setnoteg), as shown.
    std::array<char, 5> midi_range_low{}, midi_range_high{};
    KeyboardLayout layout = KeyboardLayout::Amiga;
    int16_t view_top = 0;  // first row shown ("on_y")
    int16_t oftrack = 0;   // first track shown
    BlockMarks block;
    int16_t block_anchor_track = 0, block_anchor_row = 0;  // where Shift+arrows started
    bool follow_song = true;                               // the pattern view follows the play position
    ChordEntry chord;
    // One clipboard for each kind of copy: pattern, track and block.
    CellClip pattern_clip, track_clip, block_clip;
    SearchState search;
    bool transpose_current_instrument_only = false;
    EditRange::Kind transpose_scope = EditRange::Kind::Pattern;
    std::vector<int> unused_instruments;  // marked by "Find instruments not used in the music"

    // The sample editor: its selection (frames; empty for none), its clipboard, the
    // envelope the envelope editor shows ('co00' .. 'co04'), the effect slot the effect
    // panel shows.
    FrameRange sound_selection;
    SoundClip sound_clip;
    int envelope_kind = 0;
    int shown_effect = 0;
};

}  // namespace ondrel
