#pragma once
#include <cstdint>
#include <optional>
#include <vector>

#include "song/tnote.h"

namespace ondrel {

// A rectangle of cells in one pattern (its local number), corners inclusive.
struct CellBlock {
    int pattern = 0;
    int first_track = 0, first_row = 0;
    int last_track = 0, last_row = 0;
    int tracks() const { return last_track - first_track + 1; }
    int rows() const { return last_row - first_row + 1; }
};

// Cells taken out of a pattern: tracks x rows, track-major (cells[track * rows + row]).
struct CellClip {
    int tracks = 0;
    int rows = 0;
    std::vector<TNOTE> cells;
    bool empty() const { return cells.empty(); }
    const TNOTE& at(int track, int row) const { return cells[size_t(track) * size_t(rows) + size_t(row)]; }
};

// Where an operation acts: a block, one track of a pattern, a whole pattern, or every
// pattern of the song.
struct EditRange {
    enum class Kind : uint8_t { Block, Track, Pattern, Song };
    Kind kind = Kind::Pattern;
    CellBlock block;  // Block: the rectangle; Track: pattern and first_track; Pattern: pattern
    static EditRange of_block(const CellBlock& b) { return {Kind::Block, b}; }
    static EditRange of_track(int pattern, int track) { return {Kind::Track, {pattern, track, 0, track, 0}}; }
    static EditRange of_pattern(int pattern) { return {Kind::Pattern, {pattern, 0, 0, 0, 0}}; }
    static EditRange whole_song() { return {Kind::Song, {}}; }
};

// Which fields a search looks at, each a value or "any"; a replacement writes the fields
// it holds and leaves the others. Fields start "any", so CellMask{.instrument = 3} names one.
struct CellMask {
    std::optional<uint8_t> note = std::nullopt, volume = std::nullopt, instrument = std::nullopt,
                           command = std::nullopt, parameter = std::nullopt;
    bool matches(const TNOTE& cell) const;
    void apply_to(TNOTE& cell) const;
    bool any_field() const { return note || volume || instrument || command || parameter; }
};

// A cell of the song found by a search: the position it was found at (-1 outside a song
// search), its pattern, track and row.
struct CellPlace {
    int position = -1;
    int pattern = 0;
    int track = 0;
    int row = 0;
};

}  // namespace ondrel
