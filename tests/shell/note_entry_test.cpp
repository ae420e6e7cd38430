// The computer keyboard as a piano and as digits, and note entry through the program:
// what lands in the pattern, where the cursor goes, chords, blocks, and undo.
#include <gtest/gtest.h>

#include "shell/editor_cursor.h"
#include "shell/note_keys.h"
#include "shell/program.h"

namespace ondrel {
namespace {

TEST(NoteKeys, BothLayoutsPlayTheSamePianoFromTheBaseOctave) {
    struct Case {
        KeyboardLayout layout;
        char key;
        int semitones;  // above the base octave's C; -1: not a piano key
    };
    const Case cases[] = {
        {KeyboardLayout::Amiga, 'z', 0},  {KeyboardLayout::Amiga, 's', 1},  {KeyboardLayout::Amiga, 'm', 11},
        {KeyboardLayout::Amiga, 'q', 12}, {KeyboardLayout::Amiga, '2', 13}, {KeyboardLayout::Amiga, 'y', 21},
        {KeyboardLayout::Amiga, 'u', 23}, {KeyboardLayout::Amiga, 'i', 24}, {KeyboardLayout::Amiga, 'p', 28},
        {KeyboardLayout::Amiga, 'a', -1}, {KeyboardLayout::Amiga, '1', -1}, {KeyboardLayout::Atari, 'y', 0},
        {KeyboardLayout::Atari, 'z', 21}, {KeyboardLayout::Atari, 'x', 2},  {KeyboardLayout::Atari, 'p', 28},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(std::string(1, c.key));
        const auto note = piano_note(c.layout, c.key, 3);
        if (c.semitones < 0) EXPECT_FALSE(note);
        else EXPECT_EQ(note, 60 + c.semitones);
    }
    EXPECT_EQ(piano_note(KeyboardLayout::Amiga, 'z', 0), 24);
    EXPECT_EQ(piano_note(KeyboardLayout::Amiga, 'p', kHighestOctave), 124);  // the top key stays a note
    EXPECT_TRUE(is_note_off_key('1'));
}

TEST(NoteKeys, DigitsGoIntoTheFieldUnderTheCursorInItsOwnBase) {
    struct Case {
        int field;
        char key;
        TNOTE before;
        std::optional<TNOTE> after;
    };
    const Case cases[] = {
        {kFieldInstrument0, '1', {0, 0, 0, 5, 0, 0}, TNOTE{0, 0, 0, 15, 0, 0}},
        {kFieldInstrument0, 'c', {0, 0, 0, 9, 0, 0}, TNOTE{0, 0, 0, 127, 0, 0}},  // 129 held at 127
        {kFieldInstrument1, 'a', {}, std::nullopt},
        {kFieldVolume0, '2', {0, 64, 0, 0, 0, 0}, TNOTE{0, 255, 0, 0, 0, 0}},     // 264 held at 255
        {kFieldVolume2, '9', {0, 64, 0, 0, 0, 0}, TNOTE{0, 69, 0, 0, 0, 0}},
        {kFieldCommand, 'x', {}, TNOTE{0, 0, 0, 0, 33, 0}},
        {kFieldParameter0, 'f', {0, 0, 0, 0, 12, 0x0A}, TNOTE{0, 0, 0, 0, 12, 0xFA}},
        {kFieldParameter1, 'g', {}, std::nullopt},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(std::string(1, c.key) + " in field " + std::to_string(c.field));
        EXPECT_EQ(type_digit(c.before, c.field, c.key), c.after);
    }
}

class NoteEntry : public ::testing::Test {
protected:
    void key(int32_t k, uint8_t mods = kModNone) {
        p.key_down({k, mods});
        p.run_pending();
    }
    void release(int32_t k) { p.key_up({k, kModNone}); }
    void tap(int32_t k) {
        key(k);
        release(k);
    }
    TNOTE cell(int track, int row) const { return p.engine.bank.song_pattern(0)->col[track][row]; }
    int row() const { return p.engine.player.cursor.poscurv; }
    Program p;
};

TEST_F(NoteEntry, KeysWriteOnlyInEditModeAndMoveByTheJumpStep) {
    tap('z');
    EXPECT_EQ(cell(0, 0).note, 0);  // outside edit mode a key only plays
    key(kKeySpace);
    key('3', kModCtrl);  // "Jump 3 lines"
    p.engine.player.cursor.cursnd = 4;
    tap('z');
    EXPECT_EQ(cell(0, 0), (TNOTE{60, 0, 0, 5, 0, 0}));
    EXPECT_EQ(row(), 3);
    key('1');
    EXPECT_EQ(cell(0, 3).note, 0x80);
    EXPECT_EQ(row(), 6);
    key(kKeyPadPlus);
    tap('q');
    EXPECT_EQ(cell(0, 6).note, 84);
    // Ctrl+Z takes the steps back one by one.
    key('z', kModCtrl);
    key('z', kModCtrl);
    EXPECT_EQ(cell(0, 6).note, 0);
    EXPECT_EQ(cell(0, 3).note, 0);
    EXPECT_EQ(cell(0, 0).note, 60);
}

TEST_F(NoteEntry, OutsideEditModeTheKeysPlayFromAnyFieldInItDigitsGoIntoTheField) {
    struct Case {
        bool edit_mode;
        int field;
        char key;
        int heard;         // the note played; 0: none
        TNOTE cell_after;  // at row 0 of track 1
    };
    const Case cases[] = {
        {false, kFieldNote, 'z', 60, {}},
        {false, kFieldInstrument0, 'c', 64, {}},
        {false, kFieldVolume2, 'q', 72, {}},
        {false, kFieldParameter1, 'm', 71, {}},
        {false, kFieldVolume0, 'a', 0, {}},  // no piano key
        {true, kFieldNote, 'z', 60, {60, 0, 0, 1, 0, 0}},
        {true, kFieldInstrument1, '2', 0, {0, 0, 0, 2, 0, 0}},  // a piano key, but a digit here
        {true, kFieldCommand, 'c', 0, {0, 0, 0, 0, 12, 0}},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(std::string(1, c.key) + " in field " + std::to_string(c.field) +
                     (c.edit_mode ? " editing" : ""));
        Program q;
        q.editor.edit_mode = c.edit_mode;
        set_cursor_place(q, {0, 1, c.field});
        q.key_down({c.key, kModNone});
        q.run_pending();
        q.key_up({c.key, kModNone});
        const bool heard = q.engine.player.tr.afpending.load() != 0;
        EXPECT_EQ(heard ? int(q.engine.player.tr.afnote.note) : 0, c.heard);
        EXPECT_EQ(heard ? int(q.engine.player.tr.aftrack) : 1, 1);
        EXPECT_EQ(q.engine.bank.song_pattern(0)->col[1][0], c.cell_after);
    }
}

TEST_F(NoteEntry, KeypadSlashAndStarChooseThePreviousAndNextInstrument) {
    struct Case {
        int16_t before;  // cursnd: the instrument less one
        int32_t key;
        int16_t after;
    };
    const Case cases[] = {
        {4, kKeyPadMultiply, 5}, {4, kKeyPadDivide, 3}, {0, kKeyPadDivide, 0}, {127, kKeyPadMultiply, 127}};
    for (const Case& c : cases) {
        SCOPED_TRACE(std::to_string(c.before) + " " + chord_text(plain(c.key)));
        p.engine.player.cursor.cursnd = c.before;
        key(c.key);
        EXPECT_EQ(p.engine.player.cursor.cursnd, c.after);
        EXPECT_EQ(p.last_said(), "Instrument " + std::to_string(c.after + 1));
    }
    // A note then goes in with it.
    key(kKeySpace);
    key('z');
    EXPECT_EQ(cell(0, 0).instrument, 128);
}

TEST_F(NoteEntry, KeysHeldTogetherMakeAChordAcrossTracks) {
    key(kKeySpace);
    for (char k : {'z', 'c', 'b'}) key(k);
    for (char k : {'z', 'c', 'b'}) release(k);
    EXPECT_EQ(std::make_tuple(cell(0, 0).note, cell(1, 0).note, cell(2, 0).note, row()),
              std::make_tuple(60, 64, 67, 1));
    key('x');  // alone again: the next row, the cursor's track
    EXPECT_EQ(cell(0, 1).note, 62);
}

TEST_F(NoteEntry, BlocksAreMarkedCopiedPastedAndTransposed) {
    key(kKeySpace);
    for (char k : {'z', 'x', 'c'}) tap(k);
    key(kKeyHome);
    key(kKeyDown, kModShift);
    key(kKeyDown, kModShift);  // rows 0 to 2 of track 0
    key('c', kModAlt);
    key(kKeyTab);
    key('v', kModAlt);  // pasted at the cursor: track 1, row 2
    EXPECT_EQ(cell(1, 2).note, 60);
    EXPECT_EQ(cell(1, 4).note, 64);
    key(kKeyUp, kModCtrl);  // a semitone up: the block, still marked on track 0
    EXPECT_EQ(cell(0, 0).note, 61);
    EXPECT_EQ(cell(1, 2).note, 60);
    key(kKeyDelete, kModAlt);
    EXPECT_EQ(cell(0, 1).note, 0);
}

}  // namespace
}  // namespace ondrel
