#pragma once
#include <optional>
#include <vector>

#include "edit/cell_block.h"
#include "edit/song_transaction.h"

namespace ondrel {

// Edits of cells, tracks and blocks of one pattern. Every function works on the
// transaction's copies and never writes outside the pattern: what would fall outside is
// dropped (a paste is clipped at the pattern's edges). The pattern is the song's tracks
// (nbtrack) by its `rows` entry. A pattern that does not exist yet is created with the
// song's tracks and rows when an edit writes into it. Results say how many cells changed
// (0: nothing happened, the caller says so); a pattern is copied only when a cell changes.
// Block corners may come in either order.

// The part of a cell a key or Delete acts on.
enum class CellPart : uint8_t { Note, Instrument, Volume, Effect, All };

bool write_cell(SongTransaction& t, int pattern, int track, int row, const TNOTE& cell);
bool clear_cell_part(SongTransaction& t, int pattern, int track, int row, CellPart part);
// Insert: the rows from row down move one down, the last one is lost, row becomes empty.
// Delete: the rows below move one up, the last row becomes empty.
bool insert_row(SongTransaction& t, int pattern, int track, int row);
bool delete_row(SongTransaction& t, int pattern, int track, int row);

// The block as it is, cut to the pattern (rows and tracks that exist); empty when the
// pattern does not exist or the block lies outside it.
CellClip copy_block(const SongTransaction& t, const CellBlock& block);
int clear_block(SongTransaction& t, const CellBlock& block);
// Writes clip with its top-left cell at (track, row), clipped at the pattern's edges.
// Mix writes only into empty cells.
enum class PasteMode : uint8_t { Replace, Mix };
int paste_block(SongTransaction& t, int pattern, int track, int row, const CellClip& clip, PasteMode mode);

// Whole patterns and tracks, for the menu's pattern and track commands.
CellBlock whole_pattern(const SongTransaction& t, int pattern);
CellBlock whole_track(const SongTransaction& t, int pattern, int track);

// Transposes the notes in range by semitones (+-1, +-12), only those of instrument when
// it is not 0. A note that would leave 1..127 stays and is counted; note-offs stay.
struct TransposeResult {
    int moved = 0;
    int out_of_range = 0;
};
TransposeResult transpose(SongTransaction& t, const EditRange& range, int semitones, int instrument);

// Searching: the first match after `after` in reading order (rows top to bottom, tracks
// left to right; a song search goes through the positions in order), wrapping around once,
// so `after` itself comes last; none when nothing matches. An `after` in another pattern
// (position -1 in a song search) starts from the range's beginning. Replacing writes every match in range and
// counts the cells it changed. A find mask without a field matches nothing; a replacement without one changes
// nothing. Only patterns that exist are searched, replaced or transposed; over the song, transpose and
// replace take each of them once, played or not.
std::optional<CellPlace> find_next(const SongTransaction& t, const EditRange& range, const CellMask& find,
                                   const CellPlace& after);
int replace_all(SongTransaction& t, const EditRange& range, const CellMask& find, const CellMask& with);

// Instruments: the numbers (1..127) no cell of the song's patterns uses. The places that
// use one are found with find_next and a mask on the instrument.
std::vector<int> unused_instruments(const SongTransaction& t);

}  // namespace ondrel
