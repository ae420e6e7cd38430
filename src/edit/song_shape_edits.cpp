// The song's shape and its wholesale removals: row and track counts, "Remove Sounds",
// "Remove Sequence", "Remove All".
#include <algorithm>
#include <cstring>

#include "edit/pattern_shape.h"
#include "edit/song_edits.h"

namespace ondrel {

namespace {

bool has_notes(const Pattern& p) {
    for (const auto& column : p.col)
        if (column &&
            std::any_of(column.get(), column.get() + p.nrows, [](const TNOTE& c) { return !c.empty(); }))
            return true;
    return false;
}

// The sequence is one position playing pattern 0, and no pattern holds anything.
bool sequence_is_bare(const SongTransaction& t) {
    const TMOD& m = t.view_record();
    if (m.nbpos != 1 || m.repeat != 0 ||
        std::any_of(m.sequence, m.sequence + kPositions, [](uint8_t p) { return p; }))
        return false;
    const Pattern* first = t.view_pattern(0);
    if (first && has_notes(*first)) return false;
    for (int p = 1; p < kPatternsPerSong; ++p)
        if (t.view_pattern(p)) return false;
    return true;
}

}  // namespace

bool remove_sounds(SongTransaction& t) {
    bool removed = false;
    for (int s = 0; s < kSamplesPerSong; ++s)
        if (t.view_sample(s)) {
            t.set_sample(s, nullptr);
            removed = true;
        }
    return removed;
}

bool remove_sequence(SongTransaction& t) {
    if (sequence_is_bare(t)) return false;
    TMOD& m = t.record();
    std::memset(m.sequence, 0, sizeof m.sequence);
    m.nbpos = 1;
    m.repeat = 0;
    for (int p = 1; p < kPatternsPerSong; ++p)
        if (t.view_pattern(p)) t.set_pattern(p, nullptr);
    // One empty pattern to write into, as a new song has.
    t.set_pattern(0, make_pattern(song_tracks(m), std::clamp<int>(m.rows[0], 1, kMaxRows)));
    return true;
}

bool remove_all(SongTransaction& t) {
    const bool sequence = remove_sequence(t);
    const bool sounds = remove_sounds(t);
    return sequence || sounds;
}

bool set_pattern_rows(SongTransaction& t, int pattern, int rows) {
    if (pattern < 0 || pattern >= kPatternsPerSong || rows < 1 || rows > kMaxEditRows) return false;
    const Pattern* old = t.view_pattern(pattern);
    if (t.view_record().rows[pattern] == rows && (!old || old->nrows == rows)) return false;
    if (old) {
        // Rows past the old count are empty even where the allocation held more.
        const int kept = std::min(pattern_rows(t, pattern), rows);
        auto resized = std::make_unique<Pattern>();
        resized->nrows = rows;
        for (int track = 0; track < kTracks; ++track)
            if (const TNOTE* from = old->column(track)) {
                resized->col[track] = std::make_unique<TNOTE[]>(size_t(rows));
                std::copy(from, from + kept, resized->col[track].get());
            }
        t.set_pattern(pattern, std::move(resized));
    }
    t.record().rows[pattern] = static_cast<int16_t>(rows);
    return true;
}

bool set_track_count(SongTransaction& t, int tracks) {
    if (tracks < 1 || tracks > kTracks || t.view_record().nbtrack == tracks) return false;
    t.record().nbtrack = static_cast<uint8_t>(tracks);
    // What updatenbvoice does, on copies: every pattern gets the columns it lacks.
    for (int p = 0; p < kPatternsPerSong; ++p)
        if (const Pattern* view = t.view_pattern(p))
            for (int track = 0; track < tracks; ++track)
                if (!view->column(track)) {
                    t.pattern(p)->allocate(tracks);
                    break;
                }
    return true;
}

}  // namespace ondrel
