#include "song/song_bank.h"

#include <gtest/gtest.h>

namespace ondrel {
namespace {

TEST(SongBank, SongsAreAddedUpToSixtyThreeAndKeepEachOthersData) {
    AlertLog alerts;
    SongBank bank(&alerts);
    EXPECT_EQ(bank.song_pattern(0)->allocated_tracks(), 8);
    EXPECT_EQ(bank.nbvoie, 8);
    EXPECT_EQ(bank.current().patmark[127][7].position, kEmptyMark);
    EXPECT_EQ(bank.current().efxval[64], 0u);  // only the first 64 slots default to 1000 Hz
    Pattern* first = bank.song_pattern(0);
    bank.t_sound[3] = make_sample(10);
    p_s* sample = bank.t_sound[3].get();
    for (int i = 1; i < kSongsUsable; ++i) ASSERT_TRUE(bank.newmusic()) << i;
    EXPECT_EQ(std::make_tuple(bank.nbimod, bank.noimod, bank.current().patbase, bank.p_pat.size()),
              std::make_tuple(63, 62, 62 * 128, 63u * 128));
    EXPECT_EQ(bank.pattern(0), first);
    EXPECT_EQ(bank.sample(3), sample);
    EXPECT_EQ(bank.sample(128 + 3), nullptr);
    EXPECT_TRUE(alerts.shown.empty());

    EXPECT_FALSE(bank.newmusic());
    EXPECT_EQ(bank.nbimod, 63);
    ASSERT_EQ(alerts.shown.size(), 1u);
    EXPECT_EQ(alerts.shown[0].text, "Can't create new music");
    EXPECT_EQ(alerts.shown[0].buttons, std::vector<std::string>{"My god..."});
}

TEST(SongBank, PatternsAreCreatedWidenedAndFreed) {
    SongBank bank;
    bank.current().rows[5] = 17;
    bank.patcreate(5, 3);
    Pattern* p = bank.pattern(5);
    ASSERT_NE(p, nullptr);
    EXPECT_EQ(p->allocated_tracks(), 3);
    for (int r = 0; r < 17; ++r) EXPECT_TRUE(p->column(2)[r].empty());
    p->col[1][16].note = 50;
    bank.patcreate(5, 10);  // exists: nothing changes
    EXPECT_EQ(bank.pattern(5), p);
    EXPECT_EQ(p->allocated_tracks(), 3);

    bank.updatenbvoice(12);  // every pattern gets the missing columns
    EXPECT_EQ(bank.nbvoie, 12);
    EXPECT_EQ(bank.pattern(0)->allocated_tracks(), 12);
    EXPECT_EQ(p->allocated_tracks(), 12);
    EXPECT_EQ(p->col[1][16].note, 50);
    EXPECT_TRUE(p->column(11)[16].empty());
    bank.updatenbvoice(4);  // narrower: nothing freed
    EXPECT_EQ(p->allocated_tracks(), 12);

    bank.Gofree(5);
    EXPECT_EQ(bank.pattern(5), nullptr);
    bank.Gofree(5000);  // out of the table: ignored
}

TEST(SongBank, KillingASongShiftsTheLaterOnesDown) {
    SongBank bank;
    ASSERT_TRUE(bank.newmusic());
    ASSERT_TRUE(bank.newmusic());
    set_text(bank.timod[2]->name, "last");
    bank.patcreate(2 * 128 + 4, 1);
    Pattern* last_pattern = bank.pattern(2 * 128 + 4);
    bank.select(1);
    bank.killmusic();
    EXPECT_STREQ(bank.current().name, "last");
    EXPECT_EQ(std::make_tuple(bank.nbimod, bank.noimod, bank.current().patbase, bank.current().sndbase),
              std::make_tuple(2, 1, 128, 128));
    EXPECT_EQ(bank.pattern(128 + 4), last_pattern);
    EXPECT_EQ(bank.p_pat.size(), 256u);
    bank.killmusic();
    bank.killmusic();  // the last song is replaced by an empty one
    EXPECT_EQ(bank.nbimod, 1);
    EXPECT_STREQ(bank.current().name, "");
    EXPECT_NE(bank.song_pattern(0), nullptr);
}

TEST(SampleRecord, ResetValuesSlackAndBounds) {
    SampleRef s = make_sample(100);
    EXPECT_EQ(s->data, reinterpret_cast<uint8_t*>(s.get()) + sizeof(p_s));
    for (size_t i = 0; i < 100 + kSampleSlack; ++i) ASSERT_EQ(s->data[i], 0) << i;
    EXPECT_EQ(std::make_tuple(s->refnote, s->level, s->setting, s->range2[1]),
              std::make_tuple(72, 64, 102400u, 127));
    // Envelope 0 is flat at 128, envelope 4 falls from 128 to 0 at x 255.
    EXPECT_EQ(std::make_tuple(s->env(0, 2), s->env(2, 1), s->env(4, 1), s->env(4, 4)),
              std::make_tuple(128 << 8 | 128, 64 << 8 | 64, 64 << 8 | 96, 255 << 8 | 0));
    s->volume = 90;
    s->rate = 22050;
    Raz_data(*s);  // keeps data, length and volume
    EXPECT_EQ(std::make_tuple(s->volume, s->rate, s->length), std::make_tuple(90, 0u, 100u));

    s->bits = 16;
    s->stereo = 1;
    s->refnote = 300;
    s->loopstart = 2000;
    s->loopend = 5000;
    bound_sample(*s);
    EXPECT_EQ(std::make_tuple(s->framecode, s->refnote, s->loopstart, s->loopend),
              std::make_tuple(2, 127, 100u, 100u));
    s->bits = 12;
    bound_sample(*s);
    EXPECT_EQ(s->bits, 8);
    EXPECT_EQ(s->framecode, 1);  // 8-bit stereo: two bytes a frame
}

TEST(Record, BoundingClampsIndicesFromFiles) {
    TMOD m;
    set_new_song_defaults(m, 0);
    m.trackvol[3] = 200;
    m.tracke[4] = 150;
    m.nbvoice[5] = 0;
    m.nbvoice[6] = 500;
    m.efxb[7] = 400;
    m.efxa[8] = -3;
    m.rows[8] = 0;
    m.rows[9] = 30000;
    m.tempo = 0;
    m.nbtrack = 0;
    m.mode = 7;
    bound_record(m);
    EXPECT_EQ(std::make_tuple(m.trackvol[3], m.tracke[4], m.nbvoice[5], m.nbvoice[6], m.efxb[7], m.efxa[8]),
              std::make_tuple(127, 0, 1, 127, 255, 0));
    EXPECT_EQ(std::make_tuple(m.rows[8], m.rows[9], m.tempo, m.nbtrack, m.mode),
              std::make_tuple(1, kMaxRows, 480000u, 1, 2));
}

}  // namespace
}  // namespace ondrel
