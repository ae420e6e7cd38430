#pragma once
#include "edit/song_transaction.h"

namespace ondrel {

// Edits of the sequence, the patterns and the song's shape. Positions are 0 ..
// nbpos - 1; the sequence always keeps at least one position. Each returns false (or -1)
// and changes nothing when its arguments are out of range or there is nothing to do.
inline constexpr int kMaxPositions = 255;  // nbpos is one byte
inline constexpr int kMaxEditRows = 256;

// The pattern number for a new pattern: the first that neither exists nor is played.
int first_free_pattern(const SongTransaction& t);
// Creates pattern (empty, with the song's tracks and rows rows); false when it exists.
bool create_pattern(SongTransaction& t, int pattern, int rows);

// The repeat position follows the position it names when others are inserted, deleted or
// moved before it; a position inserted at the repeat position takes its place.
bool insert_position(SongTransaction& t, int at, int pattern);  // at 0..nbpos; shifts the rest down
bool delete_position(SongTransaction& t, int at);
bool set_position_pattern(SongTransaction& t, int at, int pattern);
bool move_position(SongTransaction& t, int from, int to);
bool set_repeat_position(SongTransaction& t, int position);

// "New Pattern": a new empty pattern played at position. "Next position & New Pattern":
// a position inserted after position, playing a new pattern. The new pattern gets the
// rows of the pattern position played. Both return the new pattern's number, -1 when all
// 128 are used (or the sequence is full).
int new_pattern_at(SongTransaction& t, int position);
int new_position_with_new_pattern(SongTransaction& t, int position);
// "Remove Pattern": frees the pattern and drops the positions that played it; when every
// position played it, the first stays (its pattern is made again by the next write).
bool remove_pattern(SongTransaction& t, int pattern);

// "Remove Sounds": frees every sample. "Remove Sequence": frees every pattern and leaves
// one position playing an empty pattern 0. "Remove All": both. The record's other
// settings stay. False when there is nothing to remove.
bool remove_sounds(SongTransaction& t);
bool remove_sequence(SongTransaction& t);
bool remove_all(SongTransaction& t);

// The row count of a pattern (1 to 256): rows beyond the new count are dropped, new rows
// are empty.
bool set_pattern_rows(SongTransaction& t, int pattern, int rows);
// The song's track count (1 to 64); new tracks get their columns in every pattern. Tracks
// beyond a lowered count keep their cells, unplayed and out of the editor's reach.
bool set_track_count(SongTransaction& t, int tracks);

}  // namespace ondrel
