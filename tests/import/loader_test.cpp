#include "import/loader.h"

#include <gtest/gtest.h>

#include <cstring>

#include "support/temp_dir.h"

namespace ondrel {
namespace {

class LoaderTest : public ::testing::Test {
protected:
    AlertLog alerts;
    SongBank bank{&alerts};
    EffectSlots slots;
    test::TempDir dir;

    // A format case (tests/import/cases) copied under another name.
    std::string copy_of(const std::string& name, const std::string& as) {
        return dir.write(as, test::read_all("tests/import/cases/" + name));
    }

    // The current song, named "mine", with a note and a sample of its own.
    void make_mine() {
        set_text(bank.current().name, "mine");
        bank.song_pattern(0)->col[0][0].note = 42;
        bank.t_sound[0] = make_sample(8);
    }
    void expect_mine_kept() {
        EXPECT_STREQ(bank.current().name, "mine");
        EXPECT_EQ(bank.song_pattern(0)->col[0][0].note, 42);
        EXPECT_NE(bank.song_sample(0), nullptr);
        EXPECT_EQ(bank.nbimod, 1);
    }
};

TEST_F(LoaderTest, LoadsIntoTheCurrentSongAndRecordsThePath) {
    make_mine();
    const std::string path = copy_of("otm-old-layout.otm", "SONG.OTM");  // the ending without case
    const LoadResult r = load(path, bank, slots);
    ASSERT_TRUE(r.ok) << r.error;
    EXPECT_FALSE(r.truncated);
    EXPECT_EQ(r.song, 0);
    EXPECT_EQ(bank.nbimod, 1);
    EXPECT_STREQ(bank.current().name, "Old Song");
    EXPECT_EQ(bank.current().path, path);
    EXPECT_EQ(bank.nbvoie, 2);
    EXPECT_STREQ(bank.song_sample(0)->name, "word");
    EXPECT_EQ(bank.song_pattern(2)->col[0][0].instrument, 35);
    EXPECT_EQ(bank.song_pattern(0)->col[0][0].note, 0);  // the file's pattern 0, not the old one
    EXPECT_EQ(bank.loadin.load(), 0);
}

TEST_F(LoaderTest, RefusedFilesLeaveTheSongTheUserHad) {
    make_mine();
    for (const char* magic : {"ICE!", "PP20", "EKO!", "ATM5"}) {
        std::vector<uint8_t> packed(magic, magic + 4);
        packed.resize(100);
        const LoadResult r = load(dir.write("packed.otm", packed), bank, slots);
        EXPECT_FALSE(r.ok);
        EXPECT_NE(r.error.find(magic), std::string::npos) << r.error;
    }
    ASSERT_EQ(alerts.shown.size(), 4u);
    EXPECT_EQ(alerts.shown[0].text, "Packed with unknown packer");
    EXPECT_EQ(alerts.shown[0].buttons, std::vector<std::string>{"Arg!!"});
    const LoadResult missing = load(dir.file("absent.otm"), bank, slots);
    EXPECT_NE(missing.error.find("absent.otm"), std::string::npos);
    for (const std::vector<uint8_t>& junk :
         {std::vector<uint8_t>{'n', 'o', 'p', 'e', 0, 0, 0, 0}, std::vector<uint8_t>{}})
        EXPECT_FALSE(load(dir.write("junk.otm", junk), bank, slots).ok);
    EXPECT_FALSE(load(dir.write("song.xm", {1, 2, 3}), bank, slots).ok);  // known, not read yet
    // Another format's module under a name read as MOD: refused, saying what it is.
    std::vector<uint8_t> xm(1200);
    std::memcpy(xm.data(), "Extended Module: tune", 21);
    const std::pair<std::string, const char*> misnamed[] = {{dir.write("tune.mod", xm), "FastTracker"},
                                                            {copy_of("s3m-rules.s3m", "s.mod"), ".s3m"},
                                                            {copy_of("mtm-rules.mtm", "m.mod"), ".mtm"}};
    for (const auto& [path, said] : misnamed) {
        const LoadResult r = load(path, bank, slots);
        EXPECT_FALSE(r.ok) << path;
        EXPECT_NE(r.error.find(said), std::string::npos) << r.error;
    }
    bank.fmulload = 1;
    EXPECT_FALSE(load(dir.write("bad.otm", {'x'}), bank, slots).ok);
    expect_mine_kept();
}

TEST_F(LoaderTest, ReaderIsChosenByTheEndingWithoutCase) {
    const std::pair<const char*, const char*> cases[] = {{"a/b/SONG.OTM", ".otm"}, {"x.S3m", ".s3m"},
                                                         {"x.mtm", ".mtm"},        {"x.xm", ".xm"},
                                                         {"mod.ode2ptk", ""},      {"otm", ""}};
    for (const auto& [path, extension] : cases) EXPECT_STREQ(reader_for(path).extension, extension) << path;
}

TEST_F(LoaderTest, MultipleMusicLoadingAddsASong) {
    make_mine();
    bank.fmulload = 1;
    const LoadResult r = load(copy_of("mod-rules.mod", "second.mod"), bank, slots);
    ASSERT_TRUE(r.ok) << r.error;
    EXPECT_EQ(bank.nbimod, 2);
    EXPECT_EQ(bank.noimod, 1);
    EXPECT_EQ(r.song, 1);
    EXPECT_STREQ(bank.timod[0]->name, "mine");
    EXPECT_STREQ(bank.current().name, "Title Of The Song!!!");
    EXPECT_EQ(bank.current().patbase, 128);
    EXPECT_STREQ(bank.sample(128)->name, "first");
    EXPECT_EQ(bank.pattern(0)->col[0][0].note, 42);  // the first song's own pattern stays
}

TEST_F(LoaderTest, TheFilesEffectUnitsAreInstalled) {
    ASSERT_TRUE(load(copy_of("otm-new-layout.otm", "fx.otm"), bank, slots).ok);
    EXPECT_EQ(slots.efxtype[21], 11);  // the file's added units
    EXPECT_EQ(slots.sizeecho[2], 4u * 3000 + 1024);
}

}  // namespace
}  // namespace ondrel
