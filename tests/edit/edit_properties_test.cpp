// Random songs under random edits with edge arguments: each edit changes only cells it
// selected, in the way it should, and reports exactly how much it changed; an edit that
// does nothing leaves no step; undoing every step gives back each earlier song byte for
// byte, and redoing gives back each later one.
#include <gtest/gtest.h>

#include <functional>
#include <map>
#include <random>
#include <string_view>

#include "edit/edit_history.h"
#include "edit/pattern_edits.h"
#include "edit/song_edits.h"
#include "edit/song_fixture.h"

namespace ondrel {
namespace {

struct Dice {
    std::mt19937 rng;
    int in(int lo, int hi) { return std::uniform_int_distribution<int>(lo, hi)(rng); }
    bool chance(int percent) { return in(0, 99) < percent; }
    // 0..size-1, with the edges and one step past them often.
    int near_edges(int size) {
        const int pick = in(0, 11);
        return pick < 4 ? std::array{-1, 0, size - 1, size}[size_t(pick)] : in(0, std::max(size - 1, 0));
    }
    uint8_t note() {
        return std::array<uint8_t, 12>{
            0, 1, 2, 11, 12, 60, 115, 116, 126, 127, 0x80, 0xff}[size_t(in(0, 11))];
    }
    TNOTE cell() {
        if (chance(25)) return {};
        return {note(), uint8_t(in(0, 2) * 32), 0, uint8_t(in(0, 4)), uint8_t(in(0, 2)), uint8_t(in(0, 3))};
    }
    std::optional<uint8_t> field(int hi) {
        return chance(60) ? std::nullopt : std::optional<uint8_t>(in(0, hi));
    }
    CellMask mask() {
        return {chance(50) ? std::optional(note()) : std::nullopt, field(1), field(4), field(2), field(3)};
    }
};

// A few patterns: some not made yet, some allocated with more or fewer rows than their
// entry gives, some missing a column.
void install_random_song(Engine& engine, Dice& d) {
    SongData data;
    TMOD& m = *data.mod;
    m.nbtrack = uint8_t(d.in(1, 10));
    m.nbpos = uint8_t(d.in(1, 8));
    for (int i = 0; i < m.nbpos; ++i) m.sequence[i] = uint8_t(d.in(0, 7));
    m.repeat = uint8_t(d.in(0, m.nbpos - 1));
    for (size_t p = 0; p < 8; ++p) {
        m.rows[p] = int16_t(d.in(1, 40));
        if (d.chance(10)) continue;
        PatternRef pat = make_pattern(m.nbtrack + d.in(0, 2), std::max(1, m.rows[p] + d.in(-4, 6)));
        if (d.chance(50)) pat->col[size_t(d.in(0, m.nbtrack - 1))].reset();
        for (auto& column : pat->col)
            for (int r = 0; column && r < pat->nrows; ++r) column[r] = d.cell();
        data.patterns[p] = std::move(pat);
    }
    for (size_t s = 0; s < 4; ++s)
        if (d.chance(50)) data.samples[s] = make_sample(uint32_t(d.in(1, 32)));
    engine.bank.install(engine.bank.noimod, std::move(data));
}

// Every column of the song's patterns, by pattern * kTracks + track.
using Columns = std::map<int, std::vector<TNOTE>>;
Columns columns_of(const SongBank& bank) {
    Columns out;
    for (int p = 0; p < kPatternsPerSong; ++p)
        for (int t = 0; t < kTracks; ++t)
            if (const Pattern* pat = bank.song_pattern(p); pat && pat->column(t))
                out[p * kTracks + t].assign(pat->column(t), pat->column(t) + pat->nrows);
    return out;
}

size_t hash_of(const std::vector<uint8_t>& bytes) {
    return std::hash<std::string_view>{}({reinterpret_cast<const char*>(bytes.data()), bytes.size()});
}

bool inside(const CellBlock& b, int pattern, int track, int row) {
    return b.pattern == pattern && track >= b.first_track && track <= b.last_track && row >= b.first_row &&
           row <= b.last_row;
}

// The block with its corners in order, cut to what the editor shows of its pattern.
CellBlock shown(const SongTransaction& t, const CellBlock& b) {
    const CellBlock all = whole_pattern(t, b.pattern);
    return {b.pattern, std::max(std::min(b.first_track, b.last_track), 0),
            std::max(std::min(b.first_row, b.last_row), 0),
            std::min(std::max(b.first_track, b.last_track), all.last_track),
            std::min(std::max(b.first_row, b.last_row), all.last_row)};
}

std::vector<CellBlock> reach_of(const SongTransaction& t, const EditRange& r) {
    const CellBlock& b = r.block;
    switch (r.kind) {
        case EditRange::Kind::Block: return {shown(t, b)};
        case EditRange::Kind::Track: return {shown(t, whole_track(t, b.pattern, b.first_track))};
        case EditRange::Kind::Pattern: return {whole_pattern(t, b.pattern)};
        case EditRange::Kind::Song: break;
    }
    std::vector<CellBlock> all;
    for (int p = 0; p < kPatternsPerSong; ++p) all.push_back(whole_pattern(t, p));
    return all;
}

// What an edit did: its result, whether that is the number of cells changed, where cells
// may change (inside reach, or anywhere) and what each changed cell must satisfy.
using Rule = std::function<bool(const TNOTE& before, const TNOTE& after, int track, int row)>;
struct Outcome {
    int result = 0;
    bool counted = false;
    std::vector<CellBlock> reach = {};
    Rule rule = nullptr;
    bool anywhere = false;
};
const Rule kEmptied = [](const TNOTE&, const TNOTE& after, int, int) { return after.empty(); };

struct Picker {
    Dice& d;
    const SongTransaction& t;
    const TMOD& m() const { return t.view_record(); }
    int pattern() {
        // Now and then a bad number or one the song has not made.
        const int pick = d.in(0, 9);
        return pick == 0   ? -1
               : pick == 1 ? kPatternsPerSong
               : pick == 2 ? d.in(8, kPatternsPerSong - 1)
                           : m().sequence[d.in(0, m().nbpos - 1)];
    }
    int position() { return d.near_edges(m().nbpos); }
    CellBlock block(int p) {
        const CellBlock all = whole_pattern(t, p);
        return {p, d.near_edges(all.tracks()), d.near_edges(all.rows()), d.near_edges(all.tracks()),
                d.near_edges(all.rows())};
    }
    CellBlock cell(int p) {
        const CellBlock b = block(p);
        return {p, b.first_track, b.first_row, b.first_track, b.first_row};
    }
    EditRange range(int p) {
        switch (d.in(0, 3)) {
            case 0: return EditRange::of_block(block(p));
            case 1: return EditRange::of_track(p, d.near_edges(m().nbtrack));
            case 2: return EditRange::of_pattern(p);
            default: return EditRange::whole_song();
        }
    }
    template <size_t N>
    int one_of(const std::array<int, N>& values) {
        return values[size_t(d.in(0, N - 1))];
    }
};

// Cell edits first, then position edits, then the edits that make, remove or reshape
// patterns (rarer, or the songs would soon be empty).
constexpr int kCellEdits = 7, kPositionEdits = 5;
using Edit = std::function<Outcome(SongTransaction&, Picker&)>;
const std::vector<Edit> kEdits = {
    [](SongTransaction& t, Picker& k) {
        const CellBlock c = k.cell(k.pattern());
        const TNOTE cell = k.d.cell();
        return Outcome{write_cell(t, c.pattern, c.first_track, c.first_row, cell), true, {shown(t, c)}};
    },
    [](SongTransaction& t, Picker& k) {
        const CellBlock c = k.cell(k.pattern());
        const CellPart part = CellPart(k.d.in(0, 4));
        return Outcome{clear_cell_part(t, c.pattern, c.first_track, c.first_row, part), true, {shown(t, c)}};
    },
    [](SongTransaction& t, Picker& k) {
        CellBlock c = k.cell(k.pattern());
        const bool done = k.d.chance(50) ? insert_row(t, c.pattern, c.first_track, c.first_row)
                                         : delete_row(t, c.pattern, c.first_track, c.first_row);
        c.last_row = kMaxRows;
        return Outcome{done, false, {shown(t, c)}};
    },
    [](SongTransaction& t, Picker& k) {
        const CellBlock b = k.block(k.pattern());
        return Outcome{clear_block(t, b), true, {shown(t, b)}, kEmptied};
    },
    [](SongTransaction& t, Picker& k) {
        const CellClip clip = copy_block(t, k.block(k.pattern()));
        const CellBlock at = k.cell(k.pattern());
        const PasteMode mode = k.d.chance(50) ? PasteMode::Mix : PasteMode::Replace;
        const CellBlock target{at.pattern, at.first_track, at.first_row, at.first_track + clip.tracks - 1,
                               at.first_row + clip.rows - 1};
        // Each changed cell now holds the clip's cell over it; a mix only fills empty cells.
        const Rule rule = [=](const TNOTE& before, const TNOTE& after, int track, int row) {
            return after == clip.at(track - at.first_track, row - at.first_row) &&
                   (mode == PasteMode::Replace || before.empty());
        };
        const int changed = paste_block(t, at.pattern, at.first_track, at.first_row, clip, mode);
        return Outcome{changed, true, {shown(t, target)}, rule};
    },
    [](SongTransaction& t, Picker& k) {
        const EditRange r = k.range(k.pattern());
        const int semitones = k.one_of(std::array{-12, -1, 1, 12});
        const int instrument = k.d.chance(50) ? 0 : k.d.in(1, 4);
        const Rule rule = [=](const TNOTE& before, const TNOTE& after, int, int) {
            TNOTE moved = before;
            moved.note = uint8_t(before.note + semitones);
            return after == moved && after.note >= 1 && after.note <= 127 &&
                   (instrument == 0 || before.instrument == instrument);
        };
        return Outcome{transpose(t, r, semitones, instrument).moved, true, reach_of(t, r), rule};
    },
    [](SongTransaction& t, Picker& k) {
        const EditRange r = k.range(k.pattern());
        const CellMask find = k.d.mask(), with = k.d.mask();
        const Rule rule = [=](const TNOTE& before, const TNOTE& after, int, int) {
            TNOTE replaced = before;
            with.apply_to(replaced);
            return find.matches(before) && after == replaced;
        };
        return Outcome{replace_all(t, r, find, with), true, reach_of(t, r), rule};
    },
    [](SongTransaction& t, Picker& k) {
        return Outcome{insert_position(t, k.d.near_edges(t.view_record().nbpos + 1), k.pattern())};
    },
    [](SongTransaction& t, Picker& k) { return Outcome{delete_position(t, k.position())}; },
    [](SongTransaction& t, Picker& k) { return Outcome{set_position_pattern(t, k.position(), k.pattern())}; },
    [](SongTransaction& t, Picker& k) { return Outcome{move_position(t, k.position(), k.position())}; },
    [](SongTransaction& t, Picker& k) { return Outcome{set_repeat_position(t, k.position())}; },
    [](SongTransaction& t, Picker& k) { return Outcome{new_pattern_at(t, k.position()) >= 0}; },
    [](SongTransaction& t, Picker& k) {
        return Outcome{new_position_with_new_pattern(t, k.position()) >= 0};
    },
    [](SongTransaction& t, Picker& k) {
        return Outcome{create_pattern(t, k.pattern(), k.one_of(std::array{0, 1, 64, 256, 257}))};
    },
    [](SongTransaction& t, Picker& k) {
        const int p = k.pattern();
        return Outcome{remove_pattern(t, p), false, {{p, 0, 0, kTracks - 1, kMaxRows}}};
    },
    [](SongTransaction& t, Picker& k) {
        // Rows dropped, and rows allocated past the old count, come back empty.
        const int p = k.pattern();
        const int rows = k.one_of(std::array{0, 1, 2, 17, 64, 256, 257});
        return Outcome{set_pattern_rows(t, p, rows), false, {{p, 0, 0, kTracks - 1, kMaxRows}}, kEmptied};
    },
    [](SongTransaction& t, Picker& k) {
        return Outcome{set_track_count(t, k.d.chance(10) ? 64 : k.one_of(std::array{0, 1, 3, 6, 12, 65}))};
    },
    [](SongTransaction& t, Picker& k) {
        const int pick = k.d.in(0, 30);
        const bool done = pick == 0 ? remove_sequence(t) : pick == 1 ? remove_all(t) : remove_sounds(t);
        return Outcome{done, false, {}, kEmptied, true};
    },
};

// Counts the cells that differ, checking each against the outcome's reach and rule.
int changed_cells(const Columns& before, Columns after, const Outcome& o) {
    for (const auto& [key, cells] : before) after[key];  // a column gone reads as empty
    int changed = 0;
    for (const auto& [key, now_cells] : after) {
        const auto was_at = before.find(key);
        const std::vector<TNOTE> none;
        const auto& was_cells = was_at == before.end() ? none : was_at->second;
        for (size_t r = 0; r < std::max(was_cells.size(), now_cells.size()); ++r) {
            const TNOTE was = r < was_cells.size() ? was_cells[r] : TNOTE{};
            const TNOTE now = r < now_cells.size() ? now_cells[r] : TNOTE{};
            if (was == now) continue;
            ++changed;
            const int p = key / kTracks, track = key % kTracks, row = int(r);
            const bool reached =
                o.anywhere || std::any_of(o.reach.begin(), o.reach.end(),
                                          [&](const CellBlock& b) { return inside(b, p, track, row); });
            EXPECT_TRUE(reached && (!o.rule || o.rule(was, now, track, row)))
                << "pattern " << p << " track " << track << " row " << row;
        }
    }
    return changed;
}

TEST(EditProperties, EditsChangeOnlyWhatTheySelectAndUndoRedoRestoreEverySongExactly) {
    for (uint32_t song = 0; song < 4; ++song) {
        SCOPED_TRACE("song " + std::to_string(song));
        Dice d{std::mt19937(1234 + song)};
        Engine engine;
        install_random_song(engine, d);
        EditHistory history;
        std::vector<size_t> before_step, after_step;
        for (int i = 0; i < 150; ++i) {
            const int group = d.in(0, 19);
            const int last = int(kEdits.size()) - 1;
            const size_t kind = size_t(group < 12   ? d.in(0, kCellEdits - 1)
                                       : group < 17 ? d.in(kCellEdits, kCellEdits + kPositionEdits - 1)
                                                    : d.in(kCellEdits + kPositionEdits, last));
            SCOPED_TRACE("edit " + std::to_string(i) + " of kind " + std::to_string(kind));
            const auto bytes = test::song_bytes(engine.bank);
            const auto cells = columns_of(engine.bank);
            SongTransaction t(engine.bank, engine.slots, "edit");
            Picker picker{d, t};
            const Outcome o = kEdits[kind](t, picker);
            EditStep step = t.commit();
            const auto bytes_after = test::song_bytes(engine.bank);
            const int changed = changed_cells(cells, columns_of(engine.bank), o);
            EXPECT_EQ(o.result != 0, bytes_after != bytes);
            EXPECT_TRUE(o.result != 0 || step.empty());
            EXPECT_TRUE(!o.counted || o.result == changed)
                << o.result << " reported, " << changed << " changed";
            const TMOD& m = engine.bank.current();
            EXPECT_TRUE(m.nbpos >= 1 && m.repeat < m.nbpos);
            if (step.empty()) continue;
            before_step.push_back(hash_of(bytes));
            after_step.push_back(hash_of(bytes_after));
            history.push(std::move(step));
        }
        EXPECT_GT(before_step.size(), 30u);  // enough edits really happened
        for (size_t i = before_step.size(); i-- > 0;) {
            ASSERT_TRUE(history.undo(engine.bank, engine.slots));
            ASSERT_EQ(hash_of(test::song_bytes(engine.bank)), before_step[i]) << "undo of step " << i;
        }
        for (size_t i = 0; i < after_step.size(); ++i) {
            ASSERT_TRUE(history.redo(engine.bank, engine.slots));
            ASSERT_EQ(hash_of(test::song_bytes(engine.bank)), after_step[i]) << "redo of step " << i;
        }
        EXPECT_EQ(engine.bank.nbvoie, engine.bank.current().nbtrack);
    }
}

}  // namespace
}  // namespace ondrel
