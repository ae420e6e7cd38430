#include <gtest/gtest.h>

#include <filesystem>
#include <random>

#include "export/otm_writer.h"
#include "import/loader.h"
#include "support/temp_dir.h"

namespace ondrel {
namespace {

// Fills every field the native format carries with values that differ field to field.
void fill_song(SongBank& bank, EffectSlots& slots, unsigned seed) {
    std::mt19937 rng(seed);
    auto any = [&](int lo, int hi) { return std::uniform_int_distribution<int>(lo, hi)(rng); };
    auto fill = [&](auto& table, int lo, int hi) {
        for (auto& x : table) x = static_cast<std::remove_reference_t<decltype(x)>>(any(lo, hi));
    };
    TMOD& m = bank.current();
    set_text(m.name, "Round Trip \xE9t\xE9");
    m.format = 1;
    m.globalvol = 200;
    m.speed = 5;
    m.tempo = 431034;
    m.nbpos = 200;
    m.repeat = 17;
    m.nbtrack = 10;
    fill(m.sequence, 0, 3);
    fill(m.trackpan, 0, 256);
    fill(m.trackpan2, 0, 256);
    fill(m.trackvol, 0, 127);
    fill(m.trackc, 0, 255);
    fill(m.tracke, 0, 99);
    fill(m.nbvoice, 1, 127);
    fill(m.trackword1, 0, 16);
    fill(m.trackd, 0, 65535);
    fill(m.trackf, 0, 65535);
    fill(m.trackblock, 0, 255);
    for (auto& pattern : m.patmark)
        for (auto& mark : pattern) mark = {any(-100000, 100000), any(-5, 5)};
    fill(m.efxflag, 0, 1);
    fill(m.efxa, 0, 255);
    fill(m.efxb, 0, 255);
    fill(m.efxc, -20, 20);
    fill(m.efxval, 0, 20000);
    fill(m.echolen, 1, 88200);
    fill(m.echolevel, 0, 128);
    fill(m.echoon, 0, 1);
    slots.efxtype[21] = 11;
    slots.efxtype[30] = 16;
    slots.efxtype[99] = 1;
    slots.efxtype[40] = 6;   // types no unit knows, 0xFFFF among them
    slots.efxtype[41] = -1;

    const int rows[] = {64, 1, 200, 128};
    for (int p = 0; p < 4; ++p) {
        m.rows[p] = static_cast<int16_t>(rows[p]);
        bank.Gofree(m.patbase + p);
        bank.patcreate(m.patbase + p, m.nbtrack);
        Pattern& pat = *bank.pattern(m.patbase + p);
        for (int t = 0; t < m.nbtrack; ++t)
            for (int r = 0; r < rows[p] && t != 4; ++r)  // track 4 stays empty
                if (any(0, 3) == 0 || r == rows[p] - 1)
                    pat.col[t][r] = {static_cast<uint8_t>(any(0, 4) ? any(1, 127) : 0x80 | any(0, 127)),
                                     static_cast<uint8_t>(any(0, 128)),
                                     0,
                                     static_cast<uint8_t>(any(0, 127)),
                                     static_cast<uint8_t>(any(0, 40)),
                                     static_cast<uint8_t>(any(0, 255))};
    }
    const int slot_of[] = {0, 5, 64, 127};
    const uint32_t length_of[] = {1000, 2002, 4000, 0};
    for (int i = 0; i < 4; ++i) {
        SampleRef s = make_sample(length_of[i]);
        for (uint32_t b = 0; b < length_of[i]; ++b) s->data[b] = static_cast<uint8_t>(any(0, 255));
        s->bits = static_cast<int16_t>(i == 1 || i == 2 ? 16 : 8);
        s->stereo = static_cast<uint8_t>(i >= 2);
        s->framecode = frame_code(s->bits, s->stereo);
        s->rate = static_cast<uint32_t>(any(4000, 96000));
        s->loopstart = length_of[i] / 4;
        s->loopend = length_of[i] / 2;
        s->loopon = static_cast<uint16_t>(i & 1);
        s->refnote = static_cast<int16_t>(any(0, 127));
        s->volume = static_cast<int16_t>(any(0, 128));
        s->level = static_cast<int16_t>(any(0, 128));
        s->finetune = static_cast<int16_t>(any(-8, 15));
        s->flag2 = static_cast<uint8_t>(any(0, 1));
        s->flagword = static_cast<uint16_t>(any(0, 31));
        s->setting = static_cast<uint32_t>(any(0, 1 << 20));
        fill(s->envelope, 0, 65535);
        set_sample_name(*s, ("sample " + std::to_string(i)).c_str(), 31);
        bank.t_sound[m.sndbase + slot_of[i]] = std::move(s);
    }
}

// The reader puts each value where the writer took it from: a value read into another
// field would be written back in the wrong place, as the fields all differ.
TEST(OtmRoundTrip, EveryFieldTheReaderReadsComesBack) {
    for (unsigned seed : {1u, 2u, 3u}) {
        SongBank original;
        EffectSlots original_slots;
        fill_song(original, original_slots, seed);
        test::TempDir dir;
        const std::string path = dir.file("trip.otm");
        std::string why;
        ASSERT_TRUE(save_otm(path, original, 0, original_slots, why)) << why;
        EXPECT_STREQ(original.current().path, path.c_str());

        SongBank loaded;
        EffectSlots loaded_slots;
        const LoadResult r = load(path, loaded, loaded_slots);
        ASSERT_TRUE(r.ok) << r.error;
        EXPECT_FALSE(r.truncated);
        EXPECT_EQ(write_otm(loaded, 0, loaded_slots), write_otm(original, 0, original_slots)) << seed;
        EXPECT_EQ(loaded.current().trackd[9], original.current().trackd[9]);
        EXPECT_EQ(loaded.song_pattern(2)->col[9][199].parameter,
                  original.song_pattern(2)->col[9][199].parameter);
        EXPECT_EQ(loaded.song_sample(64)->data[3999], original.song_sample(64)->data[3999]);
        EXPECT_EQ(loaded.song_sample(1), nullptr);
        // A type no unit knows is kept, listed under its number alone.
        EXPECT_EQ(loaded_slots.efxtype[41], -1);
        EXPECT_EQ(added_effect_label(41, loaded_slots.efxtype[41]), "(41)");
    }
}

TEST(OtmRoundTrip, ChunksComeInTheOrderTheReaderExpects) {
    SongBank bank;
    EffectSlots slots;
    bank.t_sound[2] = make_sample(3);
    bank.patcreate(9, 2);
    const std::vector<uint8_t> bytes = write_otm(bank, 0, slots);
    std::vector<std::string> ids;
    size_t at = 0;
    while (at + 8 <= bytes.size()) {
        ids.emplace_back(bytes.begin() + static_cast<long>(at), bytes.begin() + static_cast<long>(at) + 4);
        at += 8 + (bytes[at + 4] | bytes[at + 5] << 8 | bytes[at + 6] << 16 | size_t{bytes[at + 7]} << 24);
    }
    EXPECT_EQ(at, bytes.size());
    EXPECT_EQ(ids, (std::vector<std::string>{"o.t.", "inst", "patt", "patt", "efx."}));
}

TEST(OtmSave, ASaveReplacesTheFileWholeOrLeavesWhatWasThere) {
    SongBank bank;
    EffectSlots slots;
    test::TempDir dir;
    const std::string path = dir.write("old.otm", std::vector<uint8_t>(100000, 0xAA));
    std::string why;
    ASSERT_TRUE(save_otm(path, bank, 0, slots, why)) << why;
    EXPECT_EQ(test::read_all(path), write_otm(bank, 0, slots));

    // The target is a directory holding a file: the rename must fail.
    SongBank other;
    std::filesystem::create_directory(dir.file("song.otm"));
    const std::string inside = dir.write("song.otm/keep.txt", {'k'});
    EXPECT_FALSE(save_otm(dir.file("song.otm"), other, 0, slots, why));
    EXPECT_FALSE(why.empty());
    EXPECT_EQ(test::read_all(inside), std::vector<uint8_t>{'k'});
    EXPECT_EQ(std::distance(std::filesystem::directory_iterator(dir.path()), {}), 2);  // no temporary left
    EXPECT_FALSE(save_otm(dir.file("no/such/dir/song.otm"), other, 0, slots, why));
    EXPECT_STREQ(other.current().path, "");
}

}  // namespace
}  // namespace ondrel
