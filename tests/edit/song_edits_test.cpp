// The sequence, new and removed patterns, sounds, and the song's row and track counts.
#include "edit/song_edits.h"

#include <gtest/gtest.h>

#include <functional>

#include "edit/pattern_edits.h"
#include "edit/song_fixture.h"

namespace ondrel {
namespace {

// A 4-track song playing patterns 5 6 7 (repeat at position 1); patterns 5 and 6 exist
// (16 rows, one note in each) and so does pattern 2, played nowhere; one sound.
struct SequenceSong : Engine {
    SequenceSong() {
        SongData data;
        TMOD& m = *data.mod;
        m.nbtrack = 4;
        m.nbpos = 3;
        m.repeat = 1;
        for (int pos = 0; pos < 3; ++pos) m.sequence[pos] = uint8_t(5 + pos);
        for (int p : {2, 5, 6}) {
            m.rows[p] = 16;
            data.patterns[size_t(p)] = make_pattern(4, 16);
            data.patterns[size_t(p)]->col[0][15] = {uint8_t(p), 0, 0, 1, 0, 0};
        }
        data.samples[0] = make_sample(8);
        bank.install(0, std::move(data));
    }
    template <class Edit>
    auto edit(Edit&& e) {
        return test::edit(*this, e);
    }
    const TMOD& m() const { return bank.current(); }
    std::vector<int> sequence() const { return {m().sequence, m().sequence + m().nbpos}; }
};

TEST(SongEdits, PositionCommandsAtTheSequenceEndsKeepTheRepeatOnItsPosition) {
    struct Case {
        const char* name;
        std::function<bool(SongTransaction&)> edit;
        bool done;
        std::vector<int> sequence;
        int repeat;
    };
    // clang-format off
    const Case cases[] = {
        {"insert first", [](auto& t) { return insert_position(t, 0, 9); }, true, {9, 5, 6, 7}, 2},
        {"insert at the repeat", [](auto& t) { return insert_position(t, 1, 9); }, true, {5, 9, 6, 7}, 1},
        {"insert last", [](auto& t) { return insert_position(t, 3, 9); }, true, {5, 6, 7, 9}, 1},
        {"insert past the end", [](auto& t) { return insert_position(t, 4, 9); }, false, {5, 6, 7}, 1},
        {"insert a bad pattern", [](auto& t) { return insert_position(t, 0, 128); }, false, {5, 6, 7}, 1},
        {"delete first", [](auto& t) { return delete_position(t, 0); }, true, {6, 7}, 0},
        {"delete the repeat", [](auto& t) { return delete_position(t, 1); }, true, {5, 7}, 1},
        {"delete last", [](auto& t) { return delete_position(t, 2); }, true, {5, 6}, 1},
        {"delete past the end", [](auto& t) { return delete_position(t, 3); }, false, {5, 6, 7}, 1},
        {"move first to last", [](auto& t) { return move_position(t, 0, 2); }, true, {6, 7, 5}, 0},
        {"move last to first", [](auto& t) { return move_position(t, 2, 0); }, true, {7, 5, 6}, 2},
        {"move the repeat", [](auto& t) { return move_position(t, 1, 2); }, true, {5, 7, 6}, 2},
        {"move onto the repeat", [](auto& t) { return move_position(t, 2, 1); }, true, {5, 7, 6}, 2},
        {"move to itself", [](auto& t) { return move_position(t, 1, 1); }, false, {5, 6, 7}, 1},
        {"set a pattern", [](auto& t) { return set_position_pattern(t, 2, 0); }, true, {5, 6, 0}, 1},
        {"set the same pattern", [](auto& t) { return set_position_pattern(t, 2, 7); }, false, {5, 6, 7}, 1},
        {"repeat last", [](auto& t) { return set_repeat_position(t, 2); }, true, {5, 6, 7}, 2},
        {"repeat past the end", [](auto& t) { return set_repeat_position(t, 3); }, false, {5, 6, 7}, 1},
        {"new pattern", [](auto& t) { return new_pattern_at(t, 2) == 0; }, true, {5, 6, 0}, 1},
        {"next position & new pattern", [](auto& t) { return new_position_with_new_pattern(t, 2) == 0; }, true,
         {5, 6, 7, 0}, 1},
        {"remove a pattern played once", [](auto& t) { return remove_pattern(t, 6); }, true, {5, 7}, 1},
        {"remove a pattern played nowhere", [](auto& t) { return remove_pattern(t, 2); }, true, {5, 6, 7}, 1},
        {"remove a pattern not made", [](auto& t) { return remove_pattern(t, 7); }, true, {5, 6}, 1},
        {"remove nothing", [](auto& t) { return remove_pattern(t, 9); }, false, {5, 6, 7}, 1},
        {"remove the sequence", [](auto& t) { return remove_sequence(t); }, true, {0}, 0},
    };
    // clang-format on
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        SequenceSong s;
        EXPECT_EQ(s.edit(c.edit), c.done);
        EXPECT_EQ(s.sequence(), c.sequence);
        EXPECT_EQ(s.m().repeat, c.repeat);
    }
}

TEST(SongEdits, NewPatternsAreFreeOnesWithTheRowsTheyReplaceAndRemovalsFreeWhatTheyName) {
    SequenceSong s;
    // Pattern 0 is the first neither made nor played; its rows come from pattern 6.
    EXPECT_EQ(s.edit([](SongTransaction& t) { return new_pattern_at(t, 1); }), 0);
    EXPECT_EQ(s.edit([](SongTransaction& t) { return first_free_pattern(t); }), 1);
    ASSERT_NE(s.bank.song_pattern(0), nullptr);
    EXPECT_EQ(s.bank.song_pattern(0)->nrows, 16);
    EXPECT_EQ(s.m().rows[0], 16);
    EXPECT_EQ(s.bank.song_pattern(0)->allocated_tracks(), 4);
    EXPECT_FALSE(s.edit([](SongTransaction& t) { return create_pattern(t, 5, 16); }));
    EXPECT_FALSE(s.edit([](SongTransaction& t) { return create_pattern(t, 9, 257); }));

    // Every position playing the removed pattern goes but the last one standing.
    s.edit([](SongTransaction& t) {
        for (int pos = 0; pos < 3; ++pos) set_position_pattern(t, pos, 5);
        return 0;
    });
    EXPECT_TRUE(s.edit([](SongTransaction& t) { return remove_pattern(t, 5); }));
    EXPECT_EQ(s.sequence(), std::vector<int>{5});
    EXPECT_EQ(s.bank.song_pattern(5), nullptr);

    // Sounds, then everything; nothing left to remove says so.
    EXPECT_TRUE(s.edit([](SongTransaction& t) { return remove_sounds(t); }));
    EXPECT_EQ(s.bank.song_sample(0), nullptr);
    EXPECT_FALSE(s.edit([](SongTransaction& t) { return remove_sounds(t); }));
    EXPECT_TRUE(s.edit([](SongTransaction& t) { return remove_all(t); }));
    for (int p = 1; p < kPatternsPerSong; ++p) EXPECT_EQ(s.bank.song_pattern(p), nullptr) << p;
    EXPECT_EQ(s.bank.song_pattern(0)->allocated_tracks(), 4);
    EXPECT_FALSE(s.edit([](SongTransaction& t) { return remove_all(t); }));

    // A song whose 128 patterns are all made has no room for a new one.
    SequenceSong full;
    full.edit([](SongTransaction& t) {
        for (int p = 0; p < kPatternsPerSong; ++p) create_pattern(t, p, 1);
        return 0;
    });
    EXPECT_EQ(full.edit([](SongTransaction& t) { return new_position_with_new_pattern(t, 0); }), -1);
    EXPECT_EQ(full.sequence(), (std::vector<int>{5, 6, 7}));
}

TEST(SongEdits, RowAndTrackCountsKeepPatternsAndTheirEntriesTogether) {
    SequenceSong s;
    struct Case {
        int pattern, rows;
        bool done;
        int last_note;  // note of track 0's last row afterwards
    };
    const Case cases[] = {{5, 8, true, 0},  {5, 256, true, 0},  {6, 16, false, 6},
                          {6, 0, false, 6}, {6, 257, false, 6}, {128, 8, false, 0}};
    for (const Case& c : cases) {
        SCOPED_TRACE(testing::Message() << "pattern " << c.pattern << " to " << c.rows);
        EXPECT_EQ(s.edit([&](SongTransaction& t) { return set_pattern_rows(t, c.pattern, c.rows); }), c.done);
        if (const Pattern* p = s.bank.song_pattern(c.pattern)) {
            EXPECT_EQ(p->nrows, s.m().rows[c.pattern]);
            EXPECT_EQ(p->col[0][p->nrows - 1].note, c.last_note);
        }
    }
    // Rows a file left allocated past the entry come back empty when the pattern grows.
    s.edit([](SongTransaction& t) { return t.record().rows[6] = 4; });
    EXPECT_TRUE(s.edit([](SongTransaction& t) { return set_pattern_rows(t, 6, 16); }));
    EXPECT_TRUE(test::cell_at(s.bank, 6, 0, 15).empty());
    // A pattern not made yet takes the new count when it is made.
    EXPECT_TRUE(s.edit([](SongTransaction& t) { return set_pattern_rows(t, 7, 3); }));
    EXPECT_EQ(s.bank.song_pattern(7), nullptr);
    EXPECT_TRUE(s.edit([](SongTransaction& t) { return write_cell(t, 7, 0, 2, {1}); }));
    EXPECT_EQ(s.bank.song_pattern(7)->nrows, 3);

    // More tracks: every pattern gets its columns; fewer: the cells stay, out of reach.
    EXPECT_TRUE(s.edit([](SongTransaction& t) { return set_track_count(t, 6); }));
    for (int p : {2, 5, 6, 7}) EXPECT_EQ(s.bank.song_pattern(p)->allocated_tracks(), 6) << p;
    EXPECT_EQ(s.bank.nbvoie, 6);
    EXPECT_FALSE(s.edit([](SongTransaction& t) { return set_track_count(t, 6); }));
    EXPECT_FALSE(s.edit([](SongTransaction& t) { return set_track_count(t, 65); }));
    EXPECT_TRUE(s.edit([](SongTransaction& t) { return set_track_count(t, 1); }));
    EXPECT_FALSE(s.edit([](SongTransaction& t) { return write_cell(t, 2, 1, 0, {1}); }));
    EXPECT_EQ(s.edit([](SongTransaction& t) { return whole_pattern(t, 2).tracks(); }), 1);
}

}  // namespace
}  // namespace ondrel
