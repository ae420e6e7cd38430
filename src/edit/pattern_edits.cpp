// Cells, rows of a track and blocks of one pattern.
#include "edit/pattern_edits.h"

#include <cstdint>

#include "edit/pattern_shape.h"

namespace ondrel {

namespace {

std::optional<CellBlock> one_cell(const SongTransaction& t, int pattern, int track, int row) {
    // Cut to the pattern, a single cell is either itself or nothing.
    return clip_to_pattern(t, {pattern, track, row, track, row});
}

// Rewrites one cell of the pattern; true when it changed.
template <class Rewrite>
bool rewrite_cell(SongTransaction& t, int pattern, int track, int row, Rewrite&& rewrite) {
    const auto cell = one_cell(t, pattern, track, row);
    return cell && change_cells(t, *cell, [&](TNOTE& c, int, int) {
                       const TNOTE before = c;
                       rewrite(c);
                       return !(c == before);
                   }) > 0;
}

void clear_part(TNOTE& c, CellPart part) {
    switch (part) {
        case CellPart::Note: c.note = 0; break;
        case CellPart::Instrument: c.instrument = 0; break;
        case CellPart::Volume: c.volume = 0; break;
        case CellPart::Effect: c.command = c.parameter = 0; break;
        case CellPart::All: c = TNOTE{}; break;
    }
}

// Moves the cells of a track from row to the pattern's end by one row: down (an empty
// cell comes in at row) or up (an empty cell comes in at the end).
bool shift_track(SongTransaction& t, int pattern, int track, int row, bool down) {
    const auto start = one_cell(t, pattern, track, row);
    if (!start) return false;
    CellBlock area = *start;
    area.last_row = pattern_rows(t, pattern) - 1;
    std::vector<TNOTE> before(size_t(area.rows()));
    const Pattern* view = t.view_pattern(pattern);
    for (int r = area.first_row; r <= area.last_row; ++r) before[size_t(r - row)] = read_cell(view, track, r);
    return change_cells(t, area, [&](TNOTE& c, int, int r) {
               const int from = down ? r - row - 1 : r - row + 1;
               const TNOTE moved = from >= 0 && from < area.rows() ? before[size_t(from)] : TNOTE{};
               if (c == moved) return false;
               c = moved;
               return true;
           }) > 0;
}

}  // namespace

bool write_cell(SongTransaction& t, int pattern, int track, int row, const TNOTE& cell) {
    return rewrite_cell(t, pattern, track, row, [&](TNOTE& c) { c = cell; });
}

bool clear_cell_part(SongTransaction& t, int pattern, int track, int row, CellPart part) {
    return rewrite_cell(t, pattern, track, row, [&](TNOTE& c) { clear_part(c, part); });
}

bool insert_row(SongTransaction& t, int pattern, int track, int row) {
    return shift_track(t, pattern, track, row, true);
}

bool delete_row(SongTransaction& t, int pattern, int track, int row) {
    return shift_track(t, pattern, track, row, false);
}

CellClip copy_block(const SongTransaction& t, const CellBlock& block) {
    CellClip clip;
    const Pattern* view = t.view_pattern(block.pattern);
    const auto area = clip_to_pattern(t, block);
    if (!view || !area) return clip;
    clip.tracks = area->tracks();
    clip.rows = area->rows();
    clip.cells.resize(size_t(clip.tracks) * size_t(clip.rows));
    for (int tr = 0; tr < clip.tracks; ++tr)
        for (int r = 0; r < clip.rows; ++r)
            clip.cells[size_t(tr) * size_t(clip.rows) + size_t(r)] =
                read_cell(view, area->first_track + tr, area->first_row + r);
    return clip;
}

int clear_block(SongTransaction& t, const CellBlock& block) {
    const auto area = clip_to_pattern(t, block);
    if (!area) return 0;
    return change_cells(t, *area, [](TNOTE& c, int, int) {
        if (c.empty()) return false;
        c = TNOTE{};
        return true;
    });
}

int paste_block(SongTransaction& t, int pattern, int track, int row, const CellClip& clip, PasteMode mode) {
    if (clip.empty() || clip.tracks <= 0 || clip.rows <= 0 ||
        clip.cells.size() != size_t(clip.tracks) * size_t(clip.rows))
        return 0;
    // Corners held in 64 bits first: a far-off paste point must not overflow.
    const auto corner = [](int at, int size) {
        return int(std::clamp<int64_t>(int64_t{at} + size - 1, -1, kMaxRows + kTracks));
    };
    const int first_track = int(std::clamp<int64_t>(track, -1, kMaxRows + kTracks));
    const int first_row = int(std::clamp<int64_t>(row, -1, kMaxRows + kTracks));
    const auto area = clip_to_pattern(
        t, {pattern, first_track, first_row, corner(track, clip.tracks), corner(row, clip.rows)});
    if (!area) return 0;
    return change_cells(t, *area, [&](TNOTE& c, int tr, int r) {
        const TNOTE& from = clip.at(tr - track, r - row);
        if (mode == PasteMode::Mix ? !c.empty() || from.empty() : c == from) return false;
        c = from;
        return true;
    });
}

CellBlock whole_pattern(const SongTransaction& t, int pattern) {
    return {pattern, 0, 0, song_tracks(t.view_record()) - 1, pattern_rows(t, pattern) - 1};
}

CellBlock whole_track(const SongTransaction& t, int pattern, int track) {
    return {pattern, track, 0, track, pattern_rows(t, pattern) - 1};
}

}  // namespace ondrel
