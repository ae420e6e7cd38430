// Finding cells: the next match of a mask in reading order, and the instruments no cell uses.
#include <array>
#include <tuple>

#include "edit/pattern_edits.h"
#include "edit/pattern_shape.h"

namespace ondrel {

namespace {

// A part of the search in reading order: a pattern's cells, with the position it is
// played at in a song search.
struct SearchArea {
    int position;
    CellBlock block;
};

std::vector<SearchArea> search_areas(const SongTransaction& t, const EditRange& range) {
    std::vector<SearchArea> areas;
    if (range.kind != EditRange::Kind::Song) {
        for (const CellBlock& b : range_blocks(t, range)) areas.push_back({-1, b});
        return areas;
    }
    const TMOD& m = t.view_record();
    for (int pos = 0; pos < m.nbpos; ++pos) {
        const int pattern = m.sequence[pos];
        if (!t.view_pattern(pattern)) continue;
        if (auto b = clip_to_pattern(t, {pattern, 0, 0, kTracks, kMaxRows})) areas.push_back({pos, *b});
    }
    return areas;
}

// Where `after` falls in the order of the areas: (area, row, track); before all when it
// lies in none of them.
std::tuple<int, int, int> key_of(const std::vector<SearchArea>& areas, const CellPlace& after, bool song) {
    for (size_t i = 0; i < areas.size(); ++i) {
        const SearchArea& a = areas[i];
        if (song ? a.position == after.position : a.block.pattern == after.pattern)
            return {int(i), after.row, after.track};
        // A song position without a pattern: the search goes on from the next one.
        if (song && a.position > after.position) return {int(i), -1, -1};
    }
    // Past every position of a song search; outside the range of another search.
    return {song ? int(areas.size()) : -1, 0, 0};
}

}  // namespace

std::optional<CellPlace> find_next(const SongTransaction& t, const EditRange& range, const CellMask& find,
                                   const CellPlace& after) {
    if (!find.any_field()) return std::nullopt;
    const bool song = range.kind == EditRange::Kind::Song;
    const auto areas = search_areas(t, range);
    const auto start = key_of(areas, after, song);
    std::optional<CellPlace> first;  // the first match of all, where the search wraps to
    for (size_t i = 0; i < areas.size(); ++i) {
        const auto& [position, b] = areas[i];
        const Pattern* view = t.view_pattern(b.pattern);
        for (int row = b.first_row; row <= b.last_row; ++row)
            for (int track = b.first_track; track <= b.last_track; ++track) {
                if (!find.matches(read_cell(view, track, row))) continue;
                const CellPlace place{position, b.pattern, track, row};
                if (std::tuple{int(i), row, track} > start) return place;
                if (!first) first = place;
            }
    }
    return first;
}

std::vector<int> unused_instruments(const SongTransaction& t) {
    std::array<bool, 256> used{};
    for (const CellBlock& b : range_blocks(t, EditRange::whole_song())) {
        const Pattern* view = t.view_pattern(b.pattern);
        for (int track = b.first_track; track <= b.last_track; ++track)
            for (int row = b.first_row; row <= b.last_row; ++row)
                used[read_cell(view, track, row).instrument] = true;
    }
    std::vector<int> unused;
    for (int i = 1; i < kSamplesPerSong; ++i)
        if (!used[size_t(i)]) unused.push_back(i);
    return unused;
}

}  // namespace ondrel
