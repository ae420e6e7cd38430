// Edits made on copies and swapped in: undo and redo give back the song byte for byte, and
// what the sequencer wrote meanwhile survives an edit of other fields.
#include "edit/song_transaction.h"

#include <gtest/gtest.h>

#include "edit/edit_history.h"
#include "edit/song_fixture.h"

namespace ondrel {
namespace {

using test::song_bytes;

TEST(SongTransaction, UndoAndRedoRestoreEveryKindOfChangeExactly) {
    Engine engine;
    EditHistory history;
    const auto before = song_bytes(engine.bank);

    SongTransaction t(engine.bank, engine.slots, "mixed");
    t.record().speed = 3;
    t.record().sequence[1] = 2;
    t.pattern(0)->col[1][5] = TNOTE{48, 64, 0, 1, 12, 32};
    t.set_pattern(2, make_pattern(4, 32));
    SampleRef s = make_sample(100);
    s->data[7] = 42;
    t.set_sample(3, std::move(s));
    t.effect_types()[25] = 11;
    EditStep step = t.commit();
    ASSERT_FALSE(step.empty());
    history.push(std::move(step));
    const auto after = song_bytes(engine.bank);
    EXPECT_NE(before, after);
    EXPECT_EQ(engine.bank.current().speed, 3);
    EXPECT_EQ(engine.slots.efxtype[25], 11);

    ASSERT_TRUE(history.undo(engine.bank, engine.slots));
    EXPECT_EQ(song_bytes(engine.bank), before);
    EXPECT_EQ(engine.slots.efxtype[25], 0);
    ASSERT_TRUE(history.redo(engine.bank, engine.slots));
    EXPECT_EQ(song_bytes(engine.bank), after);
    EXPECT_EQ(engine.slots.efxtype[25], 11);
}

TEST(SongTransaction, KeepsWhatTheSequencerWroteWhileTheEditWasMade) {
    Engine engine;
    SongTransaction t(engine.bank, engine.slots, "name");
    set_text(t.record().name, "edited");
    engine.bank.current().tempo = 600000;  // a tempo command played meanwhile
    EditStep step = t.commit();
    EXPECT_STREQ(engine.bank.current().name, "edited");
    EXPECT_EQ(engine.bank.current().tempo, 600000u);
    // The step holds the record as it was just before the swap.
    ASSERT_TRUE(step.record);
    EXPECT_STREQ(step.record->name, "");
    EXPECT_EQ(step.record->tempo, 600000u);
}

TEST(SongTransaction, NothingChangedMakesNoStep) {
    Engine engine;
    SongTransaction t(engine.bank, engine.slots, "nothing");
    t.record();
    t.pattern(0);  // a copy, unchanged, still counts as replaced
    EditStep step = t.commit();
    EXPECT_EQ(step.patterns.size(), 1u);
    SongTransaction u(engine.bank, engine.slots, "nothing at all");
    u.record();
    EXPECT_TRUE(u.commit().empty());
}

TEST(EditHistory, KeepsHundredsOfStepsAndKnowsWhenTheSongMatchesItsFile) {
    Engine engine;
    EditHistory history;
    EXPECT_FALSE(history.dirty());
    for (int i = 0; i < 300; ++i) {
        SongTransaction t(engine.bank, engine.slots, "cell");
        t.pattern(0)->col[0][i % 64].note = static_cast<uint8_t>(1 + i % 100);
        history.push(t.commit());
    }
    EXPECT_EQ(history.undo_depth(), 300u);
    EXPECT_TRUE(history.dirty());
    history.mark_saved();
    EXPECT_FALSE(history.dirty());
    ASSERT_TRUE(history.undo(engine.bank, engine.slots));
    EXPECT_TRUE(history.dirty());
    ASSERT_TRUE(history.redo(engine.bank, engine.slots));
    EXPECT_FALSE(history.dirty());
    // A new edit after an undo drops the saved state for good.
    history.undo(engine.bank, engine.slots);
    SongTransaction t(engine.bank, engine.slots, "other");
    t.record().speed = 2;
    history.push(t.commit());
    EXPECT_FALSE(history.can_redo());
    EXPECT_TRUE(history.dirty());
    while (history.undo(engine.bank, engine.slots)) {
    }
    EXPECT_TRUE(history.dirty());
    history.clear();
    EXPECT_FALSE(history.dirty());
    EXPECT_FALSE(history.can_undo());
}

}  // namespace
}  // namespace ondrel
