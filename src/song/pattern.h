#pragma once
#include <array>
#include <memory>

#include "song/tmod.h"
#include "song/tnote.h"

namespace ondrel {

// A pattern: one column pointer per track; a column holds the pattern's rows cells.
struct Pattern {
    std::array<std::unique_ptr<TNOTE[]>, kTracks> col;
    int nrows = 0;  // cells in each column, whatever the song's row table says later

    TNOTE* column(int track) const { return col[track].get(); }
    int allocated_tracks() const;
    // Allocates and zero-fills missing columns below tracks.
    void allocate(int tracks);
    // Cell of a column, or null when the column or the row does not exist.
    const TNOTE* cell(int track, int row) const {
        if (track < 0 || track >= kTracks || row < 0 || row >= nrows || !col[track]) return nullptr;
        return &col[track][row];
    }
};
using PatternRef = std::unique_ptr<Pattern>;

PatternRef make_pattern(int tracks, int rows);
// A pattern of its own with the same columns and cells.
PatternRef copy_pattern(const Pattern& pattern);

}  // namespace ondrel
