// The program driven through its command queue, as the window, keys and drops drive it.
#include "shell/program.h"

#include <gtest/gtest.h>

#include <filesystem>

#include "edit/song_fixture.h"
#include "edit/sound_blocks.h"
#include "shell/editor_cursor.h"
#include "shell/program_fixture.h"

namespace ondrel {
namespace {

const std::string kModule = "../shared/corpus/mod/TDZ3.MOD";
const std::string kSound = "../shared/corpus/sound/blip.wav";

class ProgramTest : public test::ProgramFixture {
protected:
    void SetUp() override {
        for (const auto& f : {kModule, kSound})
            if (!std::filesystem::exists(f)) GTEST_SKIP() << f << " is missing";
    }
    // A cell change the way an editor command makes one.
    void change_a_cell() {
        p.edit("cell", [](SongTransaction& t) { t.pattern(t.live().sequence[0])->col[0][0].note = 49; });
    }
    std::string front_text() const { return p.alerts.front() ? p.alerts.front()->text : ""; }
};

TEST_F(ProgramTest, OpensModulesSoundsAndRefusesTheRest) {
    open({kModule});
    EXPECT_EQ(p.engine.bank.nbimod, 1);
    EXPECT_EQ(std::string(p.engine.bank.current().path), kModule);
    EXPECT_FALSE(p.history().dirty());

    p.engine.player.cursor.cursnd = 100;
    open({kSound});
    const p_s* sound = p.engine.bank.song_sample(100);
    ASSERT_NE(sound, nullptr);
    EXPECT_EQ(sound->rate, 16000u);
    EXPECT_TRUE(p.history().dirty());  // a sound put in is an edit, and undone like one
    run("UNDO");
    EXPECT_EQ(p.engine.bank.song_sample(100), nullptr);

    open({dir.write("notes.txt", {'h', 'i'})});
    EXPECT_EQ(front_text(), "I don't use this file");
    EXPECT_EQ(p.alerts.front()->buttons, std::vector<std::string>{"oops !!"});
    p.alerts.answer(0);

    // A module that cannot be read leaves the song as it was and says why.
    open({dir.write("broken.mod", std::vector<uint8_t>(100, 7))});
    EXPECT_EQ(std::string(p.engine.bank.current().path), kModule);
    EXPECT_FALSE(p.alerts.empty());
}

TEST_F(ProgramTest, MultipleMusicLoadingAddsSongsThatCanBeChosenAndKilled) {
    run("MulL");
    open({kModule, kModule});
    EXPECT_EQ(p.engine.bank.nbimod, 3);
    EXPECT_EQ(p.engine.bank.noimod, 2);
    test::run(p, ShellMessage(fourcc("ZI00") + 1));
    EXPECT_EQ(p.engine.bank.noimod, 1);
    run("kiLL");
    EXPECT_EQ(p.engine.bank.nbimod, 2);
    run("NEWM");
    EXPECT_EQ(p.engine.bank.nbimod, 3);
    EXPECT_STREQ(p.engine.bank.current().name, "");
}

TEST_F(ProgramTest, SavingAForeignSongAsksForANativeFileAndKeepsTheOriginal) {
    open({kModule});
    const auto original = test::read_all(kModule);
    run("SAve");
    ASSERT_TRUE(p.file_panel.open());
    EXPECT_EQ(p.file_panel.suggested_name, "TDZ3.otm");
    p.file_chosen(dir.file("copy"));
    p.run_pending();
    EXPECT_EQ(test::read_all(kModule), original);
    EXPECT_EQ(std::string(p.engine.bank.current().path), dir.file("copy.otm"));
    EXPECT_FALSE(p.history().dirty());

    // From now on "Save Song" writes the native file in place, without asking.
    change_a_cell();
    run("SAve");
    EXPECT_FALSE(p.file_panel.open());
    EXPECT_FALSE(p.history().dirty());
    Program again;
    test::open_files(again, {dir.file("copy.otm")});
    EXPECT_EQ(again.engine.bank.song_pattern(again.engine.bank.current().sequence[0])->col[0][0].note, 49);
}

TEST_F(ProgramTest, SaveAsMidifileProposesTheSongsNameBesideItAndSaysWhatItWrote) {
    open({kModule});
    run("SAvm");
    EXPECT_EQ(p.file_panel.directory + "/" + p.file_panel.suggested_name, "../shared/corpus/mod/TDZ3.mid");
    p.file_chosen(dir.file("tune"));
    p.run_pending();
    EXPECT_EQ(test::read_all(dir.file("tune.mid")).at(13), 0xC0);  // 960 ticks a quarter note
    EXPECT_EQ(p.last_said().rfind("Saved " + dir.file("tune.mid") + " (", 0), 0u) << p.last_said();
    run("SAvm");
    p.file_chosen(dir.file("missing/tune.mid"));
    p.run_pending();
    EXPECT_EQ(front_text(), p.last_said());  // an alert says why it could not be written
}

TEST_F(ProgramTest, UnsavedChangesAreAskedAboutBeforeTheyAreLost) {
    change_a_cell();
    run("news");
    ASSERT_EQ(p.alerts.size(), 1u);
    p.alerts.answer(kAnswerCancel);
    EXPECT_TRUE(p.history().dirty());
    run("news");
    p.alerts.answer(kAnswerDontSave);
    EXPECT_FALSE(p.history().dirty());
    EXPECT_EQ(p.engine.bank.song_pattern(0)->col[0][0].note, 0);

    // Quitting asks too, and "Cancel" keeps the program running.
    bool quit_work_done = false;
    p.on_quit = [&] { quit_work_done = true; };
    change_a_cell();
    run("_QRQ");
    EXPECT_EQ(p.quit_state(), Program::QuitState::Asking);
    p.alerts.answer(kAnswerCancel);
    EXPECT_EQ(p.quit_state(), Program::QuitState::Running);
    run("_QRQ");
    p.alerts.answer(kAnswerDontSave);
    EXPECT_EQ(p.quit_state(), Program::QuitState::Done);
    EXPECT_TRUE(quit_work_done);
}

TEST_F(ProgramTest, KeysReachTheTransportAndTheCursor) {
    open({kModule});
    p.key_down(plain(kKeyF1 + 4));  // F5
    p.run_pending();
    EXPECT_EQ(p.engine.player.tr.playing, 1);
    p.key_down(plain(kKeyF1 + 7));  // F8
    p.run_pending();
    EXPECT_EQ(p.engine.player.tr.playing, 0);
    p.key_down(plain(kKeyUp));  // from row 0 up wraps to the pattern's last row
    EXPECT_EQ(p.engine.player.cursor.poscurv,
              p.engine.bank.current().rows[p.engine.bank.current().sequence[0]] - 1);
    p.key_down(plain(kKeyTab));
    EXPECT_EQ(p.engine.player.cursor.track, 1);
}

// The pan modes are checked by their marks in the command table's tests.
TEST_F(ProgramTest, OptionsChangeWhatTheyName) {
    struct Option {
        const char* code;
        bool (*on)(const Program&);
    };
    const Option options[] = {
        {"GOte", [](const Program& q) { return q.engine.mixer.ftemp != 0; }},
        {"vuvu", [](const Program& q) { return q.engine.player.tr.fvuvu != 0; }},
        {"accd", [](const Program& q) { return q.engine.player.tr.faccedit != 0; }},
        {"MulL", [](const Program& q) { return q.engine.bank.fmulload != 0; }},
        {"full", [](const Program& q) { return q.windows.full_screen; }},
        {"Mint", [](const Program& q) { return q.engine.mixer.qual == 1; }},
        {"ATRI", [](const Program& q) { return q.editor.layout == KeyboardLayout::Atari; }},
    };
    for (const Option& o : options) {
        SCOPED_TRACE(o.code);
        const bool before = o.on(p);
        run(o.code);
        EXPECT_NE(o.on(p), before);
    }
}

TEST(AlertKeys, EnterNeverTakesADestructiveChoiceAndEscapeTakesCancelOrTheFirst) {
    struct Case {
        std::vector<std::string> buttons;
        int default_button;
        int enter, escape;
    };
    const Case cases[] = {
        {{"Save", "Don't Save", "Cancel"}, -1, 2, 2},
        {{"Yes", "No !!"}, -1, 1, 0},  // the synthesiser's questions: Escape says yes
        {{"Reopen", "Discard"}, 0, 0, 0},
        {{"oops !!"}, -1, 0, 0},
        {{}, -1, 0, 0},
        {{"One", "Two"}, 2, 1, 0},  // a default that is no button: the last
    };
    for (const Case& c : cases) {
        const Alert alert{"title", "text", c.buttons, c.default_button};
        SCOPED_TRACE(c.buttons.empty() ? "no buttons" : c.buttons.front());
        EXPECT_EQ(enter_button(alert), c.enter);
        EXPECT_EQ(escape_button(alert), c.escape);
    }
}

// Find and replace over notes 49 at (row 0, track 0), (2, 1) and (4, 0); 49 becomes 50.
TEST(ProgramSearch, ReplaceTakesTheHitUnderTheCursorThenFindsTheNextAndNeverLeavesTheScope) {
    using Kind = EditRange::Kind;
    struct Case {
        const char* name;
        Kind scope;
        bool block;  // the block over rows 0 to 4 of track 0 marked; else its marks stay, unmarked
        CursorPlace cursor;
        const char* code;
        std::vector<int> notes;  // of the three cells, in reading order
        CursorPlace then;
        const char* said;
    };
    // clang-format off
    const Case cases[] = {
        {"replace all, no block marked", Kind::Block, false, {0, 0}, "Srpl", {49, 49, 49}, {0, 0},
         "No block is marked to replace in"},
        {"replace all in the block", Kind::Block, true, {0, 0}, "Srpl", {50, 49, 50}, {0, 0}, "2 cells replaced"},
        {"replace all in the pattern", Kind::Pattern, false, {1, 1}, "Srpl", {50, 50, 50}, {1, 1},
         "3 cells replaced"},
        {"replace on a hit", Kind::Pattern, false, {0, 0}, "Srp1", {50, 49, 49}, {2, 1}, "1 cell replaced"},
        {"replace on no hit only finds", Kind::Pattern, false, {1, 0}, "Srp1", {49, 49, 49}, {2, 1}, ""},
        {"replace the last hit, wrapping", Kind::Pattern, false, {4, 0}, "Srp1", {49, 49, 50}, {0, 0},
         "1 cell replaced"},
        {"replace the track's only hit", Kind::Track, false, {2, 1}, "Srp1", {49, 50, 49}, {2, 1},
         "1 cell replaced, no more found"},
        {"replace outside the block only finds", Kind::Block, true, {2, 1}, "Srp1", {49, 49, 49}, {4, 0}, ""},
        {"replace, no block marked", Kind::Block, false, {0, 0}, "Srp1", {49, 49, 49}, {0, 0},
         "No block is marked to replace in"},
    };
    // clang-format on
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        Program p;
        // An edit swaps in a copy of the pattern: look it up each time.
        const auto notes = [&] {
            const Pattern& now = *p.engine.bank.song_pattern(0);
            return std::vector<int>{now.col[0][0].note, now.col[1][2].note, now.col[0][4].note};
        };
        Pattern& pattern = *p.engine.bank.song_pattern(0);
        pattern.col[0][0].note = pattern.col[1][2].note = pattern.col[0][4].note = 49;
        p.editor.search.scope = c.scope;
        p.editor.search.find.note = 49;
        p.editor.search.replace.note = 50;
        p.editor.block = {c.block, 0, 0, 0, 4};
        set_cursor_place(p, c.cursor);
        test::run(p, c.code);
        EXPECT_EQ(notes(), c.notes);
        EXPECT_EQ(std::make_pair(cursor_place(p).row, cursor_place(p).track),
                  std::make_pair(c.then.row, c.then.track));
        EXPECT_EQ(p.last_said(), c.said);
        // All of it one undo step.
        const bool changed = c.notes != std::vector<int>{49, 49, 49};
        EXPECT_EQ(p.history().can_undo(), changed);
        test::run(p, "UNDO");
        EXPECT_EQ(notes(), (std::vector<int>{49, 49, 49}));
        EXPECT_FALSE(p.history().can_undo());
    }
}

// A sound of 10 frames with block 1 over [4, 8): its start mark dragged moves it, its end
// mark dragged resizes it; the block stays inside the sound and never empty.
TEST(ProgramSoundBlocks, AStartMarkMovesTheBlockAndAnEndMarkResizesIt) {
    struct Case {
        int64_t first;
        int64_t end;  // -1: none, a move
        uint32_t first_after, end_after;
    };
    const Case cases[] = {
        {2, -1, 2, 6}, {9, -1, 6, 10}, {4, 6, 4, 6}, {4, 9, 4, 9}, {4, 2, 4, 5}, {4, 99, 4, 10},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(std::to_string(c.first) + " " + std::to_string(c.end));
        Program p;
        p.engine.bank.t_sound[size_t(p.engine.player.cursor.cursnd)] =
            test::make_sound({8, false}, std::vector<int>(10, 0));
        p.post(ShellMessage(fourcc("SNbk")).with("block", 1).with("first", 4).with("end", 8));
        ShellMessage drag(fourcc("SNbm"));
        drag.with("block", 1).with("first", c.first);
        if (c.end >= 0) drag.with("end", c.end);
        test::run(p, drag);
        const auto block = sound_block(p.engine.bank.current(), p.engine.player.cursor.cursnd, 1, 10);
        ASSERT_TRUE(block);
        EXPECT_EQ(std::make_pair(block->first, block->end), std::make_pair(c.first_after, c.end_after));
    }
}

}  // namespace
}  // namespace ondrel
