#pragma once
#include <algorithm>
#include <optional>
#include <vector>

#include "edit/cell_block.h"
#include "edit/song_transaction.h"

namespace ondrel {

// What an edit can reach of a song's patterns: the song's tracks, and in each pattern the
// rows its `rows` entry gives that are also allocated (a file may leave the two apart).

int song_tracks(const TMOD& m);
// Rows of pattern as the editor sees it; for a pattern not made yet, the rows it would
// get. 0 for a number outside the song.
int pattern_rows(const SongTransaction& t, int pattern);
// The block with its corners put in order and cut to the pattern; none when nothing of
// it is inside.
std::optional<CellBlock> clip_to_pattern(const SongTransaction& t, CellBlock block);
// The whole of every pattern a range covers that exists, cut to the pattern; a song range
// lists the patterns by number.
std::vector<CellBlock> range_blocks(const SongTransaction& t, const EditRange& range);
// The pattern's copy to write into, made (with the song's tracks and rows) when the song
// has none there, with a column for each of the song's tracks. Null for a bad number.
Pattern* pattern_to_write(SongTransaction& t, int pattern);

inline TNOTE read_cell(const Pattern* pattern, int track, int row) {
    const TNOTE* cell = pattern ? pattern->cell(track, row) : nullptr;
    return cell ? *cell : TNOTE{};
}

// Offers every cell of area (already cut to the pattern) to change(cell, track, row),
// which rewrites its copy and says whether it changed it. The pattern is copied only once
// a cell really changes, so an edit that changes nothing leaves no trace. Returns the
// number of cells changed.
template <class Change>
int change_cells(SongTransaction& t, const CellBlock& area, Change&& change) {
    const Pattern* view = t.view_pattern(area.pattern);
    Pattern* out = nullptr;
    int changed = 0;
    for (int track = area.first_track; track <= area.last_track; ++track)
        for (int row = area.first_row; row <= area.last_row; ++row) {
            TNOTE cell = out ? out->col[track][row] : read_cell(view, track, row);
            if (!change(cell, track, row)) continue;
            if (!out && !(out = pattern_to_write(t, area.pattern))) return changed;
            out->col[track][row] = cell;
            ++changed;
        }
    return changed;
}

}  // namespace ondrel
