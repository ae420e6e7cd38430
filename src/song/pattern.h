#pragma once
#include <array>
#include <memory>

#include "song/tmod.h"
#include "song/tnote.h"

namespace ondrel {



// A pattern: one column pointer per track; a column holds the pattern's rows cells.
struct Pattern {
    std::array<std::unique_ptr<TNOTE[]>, kTracks> col;

    TNOTE* column(int track) const { return col[track].get(); }
    int allocated_tracks() const;
    // Allocates and zero-fills missing columns below tracks.
    void allocate(int tracks, int rows);
};
using PatternRef = std::unique_ptr<Pattern>;

PatternRef make_pattern(int tracks, int rows);

}  // namespace ondrel
