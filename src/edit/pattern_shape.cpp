#include "edit/pattern_shape.h"

namespace ondrel {

int song_tracks(const TMOD& m) {
    return std::clamp<int>(m.nbtrack, 1, kTracks);
}

int pattern_rows(const SongTransaction& t, int pattern) {
    if (pattern < 0 || pattern >= kPatternsPerSong) return 0;
    const int rows = std::clamp<int>(t.view_record().rows[pattern], 1, kMaxRows);
    const Pattern* p = t.view_pattern(pattern);
    return p ? std::min(rows, p->nrows) : rows;
}

std::optional<CellBlock> clip_to_pattern(const SongTransaction& t, CellBlock block) {
    if (block.first_track > block.last_track) std::swap(block.first_track, block.last_track);
    if (block.first_row > block.last_row) std::swap(block.first_row, block.last_row);
    const int rows = pattern_rows(t, block.pattern);
    const int tracks = song_tracks(t.view_record());
    block.first_track = std::max(block.first_track, 0);
    block.first_row = std::max(block.first_row, 0);
    block.last_track = std::min(block.last_track, tracks - 1);
    block.last_row = std::min(block.last_row, rows - 1);
    if (block.first_track > block.last_track || block.first_row > block.last_row) return std::nullopt;
    return block;
}

std::vector<CellBlock> range_blocks(const SongTransaction& t, const EditRange& range) {
    std::vector<CellBlock> blocks;
    const auto add = [&](CellBlock b) {
        if (!t.view_pattern(b.pattern)) return;
        if (auto clipped = clip_to_pattern(t, b)) blocks.push_back(*clipped);
    };
    const CellBlock& b = range.block;
    switch (range.kind) {
        case EditRange::Kind::Block: add(b); break;
        case EditRange::Kind::Track: add({b.pattern, b.first_track, 0, b.first_track, kMaxRows}); break;
        case EditRange::Kind::Pattern: add({b.pattern, 0, 0, kTracks, kMaxRows}); break;
        case EditRange::Kind::Song:
            for (int p = 0; p < kPatternsPerSong; ++p) add({p, 0, 0, kTracks, kMaxRows});
            break;
    }
    return blocks;
}

Pattern* pattern_to_write(SongTransaction& t, int pattern) {
    if (pattern < 0 || pattern >= kPatternsPerSong) return nullptr;
    const int tracks = song_tracks(t.view_record());
    Pattern* p = t.pattern(pattern);
    if (!p) {
        t.set_pattern(pattern, make_pattern(tracks, pattern_rows(t, pattern)));
        return t.pattern(pattern);
    }
    p->allocate(tracks);
    return p;
}

}  // namespace ondrel
