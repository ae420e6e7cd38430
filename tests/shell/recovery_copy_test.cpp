#include "shell/recovery_copy.h"

#include <gtest/gtest.h>

#include "engine/engine.h"
#include "export/otm_writer.h"
#include "support/temp_dir.h"

namespace ondrel {
namespace {

using test::TempDir;

TEST(RecoveryCopy, WriteFindReopenDiscard) {
    TempDir dir;
    const std::string state = dir.file("state/ondrel");  // created by the first write
    EXPECT_FALSE(find_recovery_copy(state));

    Engine before;
    TMOD& song = before.bank.current();
    set_text(song.name, "unsaved work");
    set_text(song.path, "/home/me/songs/work.mod");
    song.speed = 3;
    before.bank.pattern(song.patbase)->column(2)[5].note = 40;
    std::string why;
    ASSERT_TRUE(write_recovery_copy(state, before.bank, before.bank.noimod, before.slots, why)) << why;
    EXPECT_STREQ(song.path, "/home/me/songs/work.mod");

    const auto copy = find_recovery_copy(state);
    ASSERT_TRUE(copy);
    EXPECT_EQ(copy->song_file, recovery_song_file(state));
    EXPECT_EQ(copy->original_path, "/home/me/songs/work.mod");

    Engine after;
    const LoadResult r = reopen_recovery_copy(*copy, after.bank, after.slots);
    ASSERT_TRUE(r.ok) << r.error;
    EXPECT_STREQ(after.bank.current().path, "/home/me/songs/work.mod");
    EXPECT_EQ(write_otm(after.bank, after.bank.noimod, after.slots),
              write_otm(before.bank, before.bank.noimod, before.slots));

    discard_recovery_copy(state);
    EXPECT_FALSE(find_recovery_copy(state));
    discard_recovery_copy(state);  // twice is harmless
}

TEST(RecoveryCopy, RefusalsAndOddStates) {
    TempDir dir;
    Engine engine;
    std::string why;
    EXPECT_FALSE(write_recovery_copy(dir.path().string(), engine.bank, 5, engine.slots, why));
    EXPECT_FALSE(why.empty());
    // The state directory cannot be made: a file stands in its way.
    const std::string blocked = dir.write("blocked", {1});
    EXPECT_FALSE(write_recovery_copy(blocked + "/ondrel", engine.bank, 0, engine.slots, why));

    // A song never saved has no original path; a copy without its origin line still counts.
    ASSERT_TRUE(write_recovery_copy(dir.path().string(), engine.bank, 0, engine.slots, why)) << why;
    std::filesystem::remove(dir.file("recovery-origin.txt"));
    const auto copy = find_recovery_copy(dir.path().string());
    ASSERT_TRUE(copy);
    EXPECT_EQ(copy->original_path, "");
}

}  // namespace
}  // namespace ondrel
