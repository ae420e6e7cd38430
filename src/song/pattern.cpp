#include "song/pattern.h"

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

}  // namespace ondrel
