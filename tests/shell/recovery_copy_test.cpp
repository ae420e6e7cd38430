#include "shell/recovery_copy.h"

#include <gtest/gtest.h>

#include <cstdlib>

#include "export/otm_writer.h"
#include "shell/command_handlers.h"
#include "shell/program_fixture.h"

namespace ondrel {
namespace {

using test::TempDir;

void name_song(TMOD& song, const char* name, const char* path) {
    set_text(song.name, name);
    set_text(song.path, path);
}

TEST(RecoveryCopy, WriteFindReopenDiscard) {
    TempDir dir;
    const std::string state = dir.file("state/ondrel");  // created by the first write
    EXPECT_TRUE(find_recovery_copies(state).empty());

    Engine before;
    name_song(before.bank.current(), "unsaved work", "/home/me/songs/work.mod");
    before.bank.current().speed = 3;
    before.bank.pattern(before.bank.current().patbase)->column(2)[5].note = 40;
    std::string why;
    for (int copy = 0; copy < 2; ++copy)  // a second copy waits beside the first
        ASSERT_TRUE(write_recovery_copy(state, before.bank, 0, before.slots, why)) << why;
    EXPECT_STREQ(before.bank.current().path, "/home/me/songs/work.mod");
    EXPECT_FALSE(write_recovery_copy(state, before.bank, 5, before.slots, why));

    const auto copies = find_recovery_copies(state);
    ASSERT_EQ(copies.size(), 2u);
    EXPECT_EQ(copies[0].song_file, state + "/recovery-0.otm");
    EXPECT_EQ(copies[1].original_path, "/home/me/songs/work.mod");

    Engine after;
    const LoadResult r = reopen_recovery_copy(copies[0], after.bank, after.slots);
    ASSERT_TRUE(r.ok) << r.error;
    EXPECT_STREQ(after.bank.current().path, "/home/me/songs/work.mod");
    EXPECT_EQ(write_otm(after.bank, 0, after.slots), write_otm(before.bank, 0, before.slots));

    discard_recovery_copy(copies[0]);
    ASSERT_EQ(find_recovery_copies(state).size(), 1u);
    EXPECT_EQ(find_recovery_copies(state)[0].song_file, copies[1].song_file);
    // A copy whose origin line is lost still counts, as a song never saved.
    std::filesystem::remove(state + "/recovery-1.txt");
    EXPECT_EQ(find_recovery_copies(state).at(0).original_path, "");
    // The state directory cannot be made: a file stands in its way.
    EXPECT_FALSE(
        write_recovery_copy(dir.write("blocked", {1}) + "/ondrel", before.bank, 0, before.slots, why));
}

// The program's side: unsaved songs kept on a signal, offered back at the next start.
TEST(RecoveryCopy, ProgramKeepsUnsavedSongsAndOffersThemBack) {
    TempDir dir;
    setenv("XDG_STATE_HOME", dir.path().c_str(), 1);
    {
        Program ended;
        name_song(ended.engine.bank.current(), "first", "/songs/first.otm");
        test::run(ended, "NEWM");
        name_song(ended.engine.bank.current(), "second", "");
        ended.edit("cell", [](SongTransaction& t) { t.pattern(t.live().sequence[0])->col[0][0].note = 49; });
        ended.quit_on_signal();  // only the second song has changes
    }
    ASSERT_EQ(find_recovery_copies(dir.file("ondrel")).size(), 1u);

    Program next;
    offer_recovery_copies(next);
    ASSERT_NE(next.alerts.front(), nullptr);
    EXPECT_EQ(next.alerts.front()->buttons, (std::vector<std::string>{"Reopen", "Discard"}));
    next.alerts.answer(enter_button(*next.alerts.front()));  // Enter keeps the copy
    EXPECT_STREQ(next.engine.bank.current().name, "second");
    EXPECT_EQ(next.engine.bank.pattern(next.engine.bank.current().patbase)->column(0)[0].note, 49);
    EXPECT_TRUE(next.history().dirty());
    EXPECT_TRUE(find_recovery_copies(dir.file("ondrel")).empty());
}

}  // namespace
}  // namespace ondrel
