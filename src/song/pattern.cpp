#include "song/pattern.h"

#include <cstring>

namespace ondrel {

int Pattern::allocated_tracks() const {
    int n = 0;
    for (const auto& c : col) n += c != nullptr;
    return n;
}

void Pattern::allocate(int tracks) {
    for (int t = 0; t < tracks && t < kTracks; ++t)
        if (!col[t]) col[t] = std::make_unique<TNOTE[]>(static_cast<size_t>(nrows));
}

PatternRef make_pattern(int tracks, int rows) {
    auto p = std::make_unique<Pattern>();
    p->nrows = rows > 0 ? rows : 1;
    p->allocate(tracks);
    return p;
}

PatternRef copy_pattern(const Pattern& pattern) {
    auto copy = std::make_unique<Pattern>();
    copy->nrows = pattern.nrows;
    for (int t = 0; t < kTracks; ++t) {
        if (!pattern.col[t]) continue;
        copy->col[t] = std::make_unique_for_overwrite<TNOTE[]>(static_cast<size_t>(pattern.nrows));
        std::memcpy(copy->col[t].get(), pattern.col[t].get(), sizeof(TNOTE) * size_t(pattern.nrows));
    }
    return copy;
}

}  // namespace ondrel
