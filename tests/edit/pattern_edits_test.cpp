// Cells, rows and blocks of small patterns, checked cell by cell.
#include "edit/pattern_edits.h"

#include <gtest/gtest.h>

#include "edit/song_fixture.h"

namespace ondrel {
namespace {

using test::edit;

// A pattern's notes row by row, rows split by "|", "." for an empty cell.
std::string grid(const Engine& e, int pattern = 0) {
    std::string g;
    const Pattern* p = e.bank.song_pattern(pattern);
    for (int r = 0; p && r < p->nrows; ++r)
        for (int t = 0; t < e.bank.current().nbtrack; ++t) {
            const TNOTE c = test::cell_at(e.bank, pattern, t, r);
            g += (t ? " " : r ? "|" : "") + (c.empty() ? std::string(".") : std::to_string(c.note));
        }
    return g;
}

// Pattern 0 of a 4-track song with 4 rows: cell (track, row) holds note 10 * (track + 1) +
// row of instrument 1, but for the diagonal, which is empty.
constexpr const char* kStart = ". 20 30 40|11 . 31 41|12 22 . 42|13 23 33 .";
struct SmallSong : Engine {
    SmallSong() {
        SongData data;
        data.mod->nbtrack = 4;
        data.mod->rows[0] = 4;
        data.patterns[0] = make_pattern(4, 4);
        for (int t = 0; t < 4; ++t)
            for (int r = 0; r < 4; ++r)
                if (t != r) data.patterns[0]->col[t][r] = {uint8_t(10 * (t + 1) + r), 0, 0, 1, 0, 0};
        bank.install(0, std::move(data));
    }
};

TEST(PatternEdits, CopyAndClearTakeTheBlockCutToThePattern) {
    struct Case {
        CellBlock block;
        int tracks, rows;
        std::vector<int> notes;  // track-major
        const char* after_clear;
    };
    const Case cases[] = {
        {{0, 1, 1, 2, 2}, 2, 2, {0, 22, 31, 0}, ". 20 30 40|11 . . 41|12 . . 42|13 23 33 ."},
        {{0, 2, 2, 1, 1}, 2, 2, {0, 22, 31, 0}, ". 20 30 40|11 . . 41|12 . . 42|13 23 33 ."},
        {{0, 2, 3, 5, 7}, 2, 1, {33, 0}, ". 20 30 40|11 . 31 41|12 22 . 42|13 23 . ."},
        {{0, -3, -1, 0, 0}, 1, 1, {0}, kStart},
        {{0, 4, 0, 6, 3}, 0, 0, {}, kStart},
        {{0, 0, 4, 3, 9}, 0, 0, {}, kStart},
        {{5, 0, 0, 3, 3}, 0, 0, {}, kStart},  // no pattern 5
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(testing::Message() << "block from " << c.block.first_track << "," << c.block.first_row);
        SmallSong s;
        const CellClip clip = edit(s, [&](SongTransaction& t) { return copy_block(t, c.block); });
        std::vector<int> notes;
        for (const TNOTE& cell : clip.cells) notes.push_back(cell.note);
        EXPECT_EQ(std::tie(clip.tracks, clip.rows, notes), std::tie(c.tracks, c.rows, c.notes));
        const int cleared = edit(s, [&](SongTransaction& t) { return clear_block(t, c.block); });
        EXPECT_EQ(grid(s), c.after_clear);
        EXPECT_EQ(cleared, std::count_if(notes.begin(), notes.end(), [](int n) { return n != 0; }));
    }
}

TEST(PatternEdits, PasteIsClippedAtTheEdgesAndMixFillsOnlyEmptyCells) {
    // Track 0 of the clip holds note 1 then an empty cell, track 1 notes 3 and 4.
    const CellClip clip{2, 2, {{1, 0, 0, 2, 0, 0}, {}, {3, 0, 0, 2, 0, 0}, {4, 0, 0, 2, 0, 0}}};
    struct Case {
        int track, row;
        PasteMode mode;
        int changed;
        const char* after;
    };
    const Case cases[] = {
        {0, 0, PasteMode::Replace, 4, "1 3 30 40|. 4 31 41|12 22 . 42|13 23 33 ."},
        {0, 0, PasteMode::Mix, 2, "1 20 30 40|11 4 31 41|12 22 . 42|13 23 33 ."},
        {3, 3, PasteMode::Replace, 1, ". 20 30 40|11 . 31 41|12 22 . 42|13 23 33 1"},
        {-1, -1, PasteMode::Replace, 1, "4 20 30 40|11 . 31 41|12 22 . 42|13 23 33 ."},
        {2, -1, PasteMode::Replace, 2, ". 20 . 4|11 . 31 41|12 22 . 42|13 23 33 ."},
        {2, -1, PasteMode::Mix, 0, kStart},  // lands on full cells only
        {4, 0, PasteMode::Replace, 0, kStart},
        {-2, 0, PasteMode::Replace, 0, kStart},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(testing::Message()
                     << "at " << c.track << "," << c.row << " mix " << (c.mode == PasteMode::Mix));
        SmallSong s;
        EXPECT_EQ(
            edit(s, [&](SongTransaction& t) { return paste_block(t, 0, c.track, c.row, clip, c.mode); }),
            c.changed);
        EXPECT_EQ(grid(s), c.after);
    }
    SmallSong s;
    EXPECT_EQ(edit(s, [&](SongTransaction& t) { return paste_block(t, 0, 0, 0, {}, PasteMode::Replace); }),
              0);
    // A paste into a pattern not made yet makes it, with the song's tracks and rows.
    edit(s, [](SongTransaction& t) { return t.record().rows[3] = 2; });
    EXPECT_EQ(edit(s, [&](SongTransaction& t) { return paste_block(t, 3, 3, 1, clip, PasteMode::Replace); }),
              1);
    EXPECT_EQ(grid(s, 3), ". . . .|. . . 1");
}

TEST(PatternEdits, WritingClearingAndRowsOfOneTrack) {
    struct Case {
        const char* name;
        std::function<bool(SongTransaction&)> edit;
        bool changed;
        const char* after;
    };
    const Case cases[] = {
        {"write", [](auto& t) { return write_cell(t, 0, 3, 3, {.note = 99}); }, true,
         ". 20 30 40|11 . 31 41|12 22 . 42|13 23 33 99"},
        {"write the same", [](auto& t) { return write_cell(t, 0, 1, 0, {.note = 20, .instrument = 1}); },
         false, kStart},
        {"write past the tracks", [](auto& t) { return write_cell(t, 0, 4, 0, {.note = 99}); }, false,
         kStart},
        {"write past the rows", [](auto& t) { return write_cell(t, 0, 0, 4, {.note = 99}); }, false, kStart},
        {"clear the note", [](auto& t) { return clear_cell_part(t, 0, 1, 0, CellPart::Note); }, true,
         ". 0 30 40|11 . 31 41|12 22 . 42|13 23 33 ."},
        {"clear the cell", [](auto& t) { return clear_cell_part(t, 0, 1, 0, CellPart::All); }, true,
         ". . 30 40|11 . 31 41|12 22 . 42|13 23 33 ."},
        {"clear an empty volume", [](auto& t) { return clear_cell_part(t, 0, 1, 0, CellPart::Volume); },
         false, kStart},
        {"insert at the top", [](auto& t) { return insert_row(t, 0, 0, 0); }, true,
         ". 20 30 40|. . 31 41|11 22 . 42|12 23 33 ."},
        {"insert at the bottom", [](auto& t) { return insert_row(t, 0, 0, 3); }, true,
         ". 20 30 40|11 . 31 41|12 22 . 42|. 23 33 ."},
        {"insert past the end", [](auto& t) { return insert_row(t, 0, 0, 4); }, false, kStart},
        {"insert on the empty last row", [](auto& t) { return insert_row(t, 0, 3, 3); }, false, kStart},
        {"delete at the top", [](auto& t) { return delete_row(t, 0, 1, 0); }, true,
         ". . 30 40|11 22 31 41|12 23 . 42|13 . 33 ."},
        {"delete at the bottom", [](auto& t) { return delete_row(t, 0, 2, 3); }, true,
         ". 20 30 40|11 . 31 41|12 22 . 42|13 23 . ."},
        {"delete before the top", [](auto& t) { return delete_row(t, 0, 2, -1); }, false, kStart},
        {"delete in a missing pattern", [](auto& t) { return delete_row(t, 7, 0, 0); }, false, kStart},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        SmallSong s;
        EXPECT_EQ(edit(s, c.edit), c.changed);
        EXPECT_EQ(grid(s), c.after);
    }
}

// Pattern 0 with notes near both ends of the range, of instruments 1 and 2, a note-off
// and a cell with only a volume; pattern 1, played nowhere, with one note.
constexpr const char* kEnds = "1 128 11 116|2 60 . .|126 0 . .|127 115 . .";
struct NoteEnds : SmallSong {
    NoteEnds() {
        edit(*this, [](SongTransaction& t) {
            const TNOTE cells[4][4] = {{{1, 0, 0, 1}, {2, 0, 0, 2}, {126, 0, 0, 1}, {127, 0, 0, 2}},
                                       {{0x80, 0, 0, 1}, {60, 0, 0, 2}, {0, 64, 0, 1}, {115, 0, 0, 1}},
                                       {{11, 0, 0, 1}, {}, {}, {}},
                                       {{116, 0, 0, 2}, {}, {}, {}}};
            for (int tr = 0; tr < 4; ++tr)
                for (int r = 0; r < 4; ++r) write_cell(t, 0, tr, r, cells[tr][r]);
            return write_cell(t, 1, 0, 0, {50, 0, 0, 1});
        });
    }
};

TEST(PatternEdits, TransposeStopsAtTheNoteRangeAndCountsWhatStayed) {
    struct Case {
        EditRange range;
        int semitones, instrument, moved, out_of_range;
        const char* after;
        int pattern1_note;
    };
    const Case cases[] = {
        {EditRange::of_pattern(0), 1, 0, 7, 1, "2 128 12 117|3 61 . .|127 0 . .|127 116 . .", 50},
        {EditRange::of_pattern(0), -1, 0, 7, 1, "1 128 10 115|1 59 . .|125 0 . .|126 114 . .", 50},
        {EditRange::of_pattern(0), 12, 0, 5, 3, "13 128 23 116|14 72 . .|126 0 . .|127 127 . .", 50},
        {EditRange::of_pattern(0), -12, 2, 3, 1, "1 128 11 104|2 48 . .|126 0 . .|115 115 . .", 50},
        {EditRange::of_track(0, 1), 12, 0, 2, 0, "1 128 11 116|2 72 . .|126 0 . .|127 127 . .", 50},
        {EditRange::of_block({0, 0, 3, 3, 2}), 1, 0, 2, 1, "1 128 11 116|2 60 . .|127 0 . .|127 116 . .", 50},
        {EditRange::whole_song(), 1, 1, 5, 0, "2 128 12 116|2 60 . .|127 0 . .|127 116 . .", 51},
        {EditRange::of_pattern(0), 0, 0, 0, 0, kEnds, 50},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(testing::Message() << "by " << c.semitones << " of instrument " << c.instrument);
        NoteEnds s;
        const TransposeResult r =
            edit(s, [&](SongTransaction& t) { return transpose(t, c.range, c.semitones, c.instrument); });
        EXPECT_EQ(std::tie(r.moved, r.out_of_range), std::tie(c.moved, c.out_of_range));
        EXPECT_EQ(grid(s), c.after);
        EXPECT_EQ(test::cell_at(s.bank, 1, 0, 0).note, c.pattern1_note);
    }
}

TEST(PatternEdits, SearchGoesInReadingOrderAndWrapsAndReplaceWritesOnlyMaskedFields) {
    NoteEnds s;
    edit(s, [](SongTransaction& t) {  // positions 0 and 2 play pattern 0, position 1 nothing made
        t.record().nbpos = 3;
        t.record().sequence[1] = 2;
        return 0;
    });
    // Instrument 2, in reading order: track 3 row 0, tracks 0 and 1 of row 1, track 0 row 3.
    const CellMask i2{.instrument = 2};
    const CellMask none{};
    struct Find {
        EditRange range;
        CellMask mask;
        CellPlace after;
        std::optional<std::array<int, 4>> hit;  // position, pattern, track, row
    };
    const Find finds[] = {
        {EditRange::of_pattern(0), i2, {-1, 0, 0, 0}, std::array{-1, 0, 3, 0}},
        {EditRange::of_pattern(0), i2, {-1, 0, 3, 0}, std::array{-1, 0, 0, 1}},
        {EditRange::of_pattern(0), i2, {-1, 0, 0, 1}, std::array{-1, 0, 1, 1}},
        {EditRange::of_pattern(0), i2, {-1, 0, 0, 3}, std::array{-1, 0, 3, 0}},  // wraps
        {EditRange::of_pattern(0), {.note = 127, .instrument = 2}, {-1, 0, 0, 3}, std::array{-1, 0, 0, 3}},
        {EditRange::of_pattern(0), i2, {-1, 4, 3, 3}, std::array{-1, 0, 3, 0}},  // elsewhere: from the top
        {EditRange::of_track(0, 0), i2, {-1, 0, 0, 0}, std::array{-1, 0, 0, 1}},
        {EditRange::of_block({0, 1, 1, 3, 3}), i2, {-1, 0, 0, 0}, std::array{-1, 0, 1, 1}},
        {EditRange::whole_song(), i2, {0, 0, 1, 1}, std::array{0, 0, 0, 3}},
        {EditRange::whole_song(), i2, {0, 0, 0, 3}, std::array{2, 0, 3, 0}},  // past position 1
        {EditRange::whole_song(), i2, {1, 2, 0, 0}, std::array{2, 0, 3, 0}},
        {EditRange::whole_song(), {.note = 50}, {2, 0, 0, 0}, std::nullopt},  // pattern 1 is not played
        {EditRange::of_pattern(1), {.note = 50}, {-1, 1, 0, 0}, std::array{-1, 1, 0, 0}},
        {EditRange::of_pattern(5), i2, {-1, 5, 0, 0}, std::nullopt},
        {EditRange::of_pattern(0), none, {-1, 0, 0, 0}, std::nullopt},
        // Each of these finds nothing only because of its last field.
        {EditRange::of_pattern(0), {.note = 2, .volume = 1}, {}, std::nullopt},
        {EditRange::of_pattern(0), {.note = 2, .instrument = 1}, {}, std::nullopt},
        {EditRange::of_pattern(0), {.note = 2, .command = 1}, {}, std::nullopt},
        {EditRange::of_pattern(0), {.note = 2, .parameter = 1}, {}, std::nullopt},
        {EditRange::of_pattern(0), {.note = 5, .volume = 64}, {}, std::nullopt},
    };
    for (const Find& f : finds) {
        SCOPED_TRACE(testing::Message() << "after " << f.after.position << " " << f.after.pattern << " "
                                        << f.after.track << " " << f.after.row);
        const auto hit = edit(s, [&](SongTransaction& t) { return find_next(t, f.range, f.mask, f.after); });
        ASSERT_EQ(hit.has_value(), f.hit.has_value());
        if (hit) {
            EXPECT_EQ((std::array{hit->position, hit->pattern, hit->track, hit->row}), *f.hit);
        }
    }

    struct Replace {
        EditRange range;
        CellMask find, with;
        int changed;
        std::array<TNOTE, 4> column0;  // track 0 of pattern 0 afterwards
    };
    const std::array<TNOTE, 4> unchanged = {{{1, 0, 0, 1}, {2, 0, 0, 2}, {126, 0, 0, 1}, {127, 0, 0, 2}}};
    // clang-format off
    const Replace replaces[] = {
        {EditRange::of_pattern(0), {.instrument = 1}, {.volume = 7}, 6,
         {{{1, 7, 0, 1}, {2, 0, 0, 2}, {126, 7, 0, 1}, {127, 0, 0, 2}}}},
        {EditRange::of_track(0, 0), i2, {.note = 5, .instrument = 3, .command = 9, .parameter = 9}, 2,
         {{{1, 0, 0, 1}, {5, 0, 0, 3, 9, 9}, {126, 0, 0, 1}, {5, 0, 0, 3, 9, 9}}}},
        {EditRange::of_pattern(0), {.note = 126}, {.note = 126, .volume = 0}, 0, unchanged},
        {EditRange::of_pattern(0), none, {.note = 1}, 0, unchanged},
    };
    // clang-format on
    for (const Replace& r : replaces) {
        NoteEnds fresh;
        EXPECT_EQ(edit(fresh, [&](SongTransaction& t) { return replace_all(t, r.range, r.find, r.with); }),
                  r.changed);
        for (int row = 0; row < 4; ++row)
            EXPECT_EQ(test::cell_at(fresh.bank, 0, 0, row), r.column0[size_t(row)]);
    }
    // Instruments 1 and 2 are used, in pattern 1 too although it is not played.
    const auto unused = edit(s, [](SongTransaction& t) { return unused_instruments(t); });
    EXPECT_EQ(unused.size(), 125u);
    EXPECT_EQ(unused.front(), 3);
}

}  // namespace
}  // namespace ondrel
