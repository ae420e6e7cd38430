// The sequence: positions, the repeat position, new and removed patterns.
#include <algorithm>
#include <array>

#include "edit/pattern_shape.h"
#include "edit/song_edits.h"

namespace ondrel {

namespace {

bool valid_pattern(int pattern) {
    return pattern >= 0 && pattern < kPatternsPerSong;
}

bool valid_position(const SongTransaction& t, int at) {
    return at >= 0 && at < t.view_record().nbpos;
}

void remove_position_from(TMOD& m, int at) {
    std::copy(m.sequence + at + 1, m.sequence + m.nbpos, m.sequence + at);
    m.sequence[m.nbpos - 1] = 0;
    --m.nbpos;
    // The repeat position follows the position it names.
    if (at < m.repeat) --m.repeat;
    m.repeat = static_cast<uint8_t>(std::min<int>(m.repeat, m.nbpos - 1));
}

// Rows for a new pattern made for position: those of the pattern it plays now (a new
// song's 64 when the position names no pattern a song can have).
int rows_for_new_pattern(const SongTransaction& t, int position) {
    const int rows = pattern_rows(t, t.view_record().sequence[position]);
    return rows > 0 ? std::min(rows, kMaxEditRows) : 64;
}

}  // namespace

int first_free_pattern(const SongTransaction& t) {
    const TMOD& m = t.view_record();
    std::array<bool, 256> played{};
    for (int pos = 0; pos < m.nbpos; ++pos) played[m.sequence[pos]] = true;
    for (int p = 0; p < kPatternsPerSong; ++p)
        if (!played[size_t(p)] && !t.view_pattern(p)) return p;
    return -1;
}

bool create_pattern(SongTransaction& t, int pattern, int rows) {
    if (!valid_pattern(pattern) || rows < 1 || rows > kMaxEditRows || t.view_pattern(pattern)) return false;
    t.record().rows[pattern] = static_cast<int16_t>(rows);
    t.set_pattern(pattern, make_pattern(song_tracks(t.view_record()), rows));
    return true;
}

bool insert_position(SongTransaction& t, int at, int pattern) {
    const TMOD& v = t.view_record();
    if (!valid_pattern(pattern) || at < 0 || at > v.nbpos || v.nbpos >= kMaxPositions) return false;
    TMOD& m = t.record();
    std::copy_backward(m.sequence + at, m.sequence + m.nbpos, m.sequence + m.nbpos + 1);
    m.sequence[at] = static_cast<uint8_t>(pattern);
    ++m.nbpos;
    if (at < m.repeat) ++m.repeat;
    return true;
}

bool delete_position(SongTransaction& t, int at) {
    if (!valid_position(t, at) || t.view_record().nbpos <= 1) return false;
    remove_position_from(t.record(), at);
    return true;
}

bool set_position_pattern(SongTransaction& t, int at, int pattern) {
    if (!valid_position(t, at) || !valid_pattern(pattern) || t.view_record().sequence[at] == pattern)
        return false;
    t.record().sequence[at] = static_cast<uint8_t>(pattern);
    return true;
}

bool move_position(SongTransaction& t, int from, int to) {
    if (!valid_position(t, from) || !valid_position(t, to) || from == to) return false;
    const TMOD& v = t.view_record();
    std::array<uint8_t, kPositions> sequence;
    std::copy(v.sequence, v.sequence + kPositions, sequence.begin());
    if (from < to)
        std::rotate(sequence.begin() + from, sequence.begin() + from + 1, sequence.begin() + to + 1);
    else
        std::rotate(sequence.begin() + to, sequence.begin() + from, sequence.begin() + from + 1);
    // The repeat position follows the position it names.
    int repeat = v.repeat;
    if (repeat == from)
        repeat = to;
    else if (from < repeat && repeat <= to)
        --repeat;
    else if (to <= repeat && repeat < from)
        ++repeat;
    // Positions playing the same pattern may swap places and change nothing.
    if (repeat == v.repeat && std::equal(sequence.begin(), sequence.end(), v.sequence)) return false;
    TMOD& m = t.record();
    std::copy(sequence.begin(), sequence.end(), m.sequence);
    m.repeat = static_cast<uint8_t>(repeat);
    return true;
}

bool set_repeat_position(SongTransaction& t, int position) {
    if (!valid_position(t, position) || t.view_record().repeat == position) return false;
    t.record().repeat = static_cast<uint8_t>(position);
    return true;
}

int new_pattern_at(SongTransaction& t, int position) {
    if (!valid_position(t, position)) return -1;
    const int pattern = first_free_pattern(t);
    if (pattern < 0) return -1;
    create_pattern(t, pattern, rows_for_new_pattern(t, position));
    t.record().sequence[position] = static_cast<uint8_t>(pattern);
    return pattern;
}

int new_position_with_new_pattern(SongTransaction& t, int position) {
    if (!valid_position(t, position) || t.view_record().nbpos >= kMaxPositions) return -1;
    const int pattern = first_free_pattern(t);
    if (pattern < 0) return -1;
    create_pattern(t, pattern, rows_for_new_pattern(t, position));
    insert_position(t, position + 1, pattern);
    return pattern;
}

bool remove_pattern(SongTransaction& t, int pattern) {
    if (!valid_pattern(pattern)) return false;
    const TMOD& v = t.view_record();
    const bool played = std::find(v.sequence, v.sequence + v.nbpos, pattern) != v.sequence + v.nbpos;
    const bool exists = t.view_pattern(pattern) != nullptr;
    if (exists) t.set_pattern(pattern, nullptr);
    bool dropped = false;
    if (played) {
        TMOD& m = t.record();
        for (int pos = m.nbpos - 1; pos >= 0 && m.nbpos > 1; --pos)
            if (m.sequence[pos] == pattern) {
                remove_position_from(m, pos);
                dropped = true;
            }
    }
    return exists || dropped;
}

}  // namespace ondrel
