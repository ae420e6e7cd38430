#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <filesystem>
#include <random>

#include "export/otm_writer.h"
#include "import/loader.h"
#include "support/chunk_builder.h"
#include "support/temp_dir.h"

namespace ondrel {
namespace {

// Fills every field the native format carries with values that differ field to field.
void fill_song(SongBank& bank, EffectSlots& slots, unsigned seed) {
    std::mt19937 rng(seed);
    auto any = [&](int lo, int hi) { return std::uniform_int_distribution<int>(lo, hi)(rng); };
    TMOD& m = bank.current();
    set_text(m.name, "Round Trip \xE9t\xE9");
    m.format = 1;
    m.globalvol = 200;
    m.speed = 5;
    m.tempo = 431034;
    m.nbpos = 200;
    m.repeat = 17;
    m.nbtrack = 10;
    for (int i = 0; i < m.nbpos; ++i) m.sequence[i] = static_cast<uint8_t>(any(0, 3));
    for (int t = 0; t < kTracks; ++t) {
        m.trackpan[t] = static_cast<uint16_t>(any(0, 256));
        m.trackpan2[t] = static_cast<uint16_t>(any(0, 256));
        m.trackvol[t] = static_cast<uint16_t>(any(0, 127));
        m.trackc[t] = static_cast<uint16_t>(any(0, 255));
        m.tracke[t] = static_cast<uint16_t>(any(0, 3) == 0 ? any(1, 99) : 0);
        m.nbvoice[t] = static_cast<int16_t>(any(0, 5) == 0 ? 127 : any(1, 5));
        m.trackword1[t] = static_cast<uint16_t>(any(0, 16));
        m.trackd[t] = static_cast<uint16_t>(any(0, 65535));
        m.trackf[t] = static_cast<uint16_t>(any(0, 65535));
    }
    for (auto& b : m.trackblock) b = static_cast<uint8_t>(any(0, 255));
    for (auto& pattern : m.patmark)
        for (auto& mark : pattern) mark = {any(-100000, 100000), any(-5, 5)};
    for (int s = 0; s < kEffectSlots; ++s) {
        m.efxflag[s] = static_cast<uint8_t>(any(0, 1));
        m.efxa[s] = static_cast<int16_t>(any(0, 255));
        m.efxb[s] = static_cast<int16_t>(any(0, 255));
        m.efxc[s] = static_cast<int16_t>(any(-20, 20));
        m.efxval[s] = static_cast<uint32_t>(any(0, 20000));
    }
    for (int u = 0; u < kEchoUnits; ++u) {
        m.echolen[u] = static_cast<uint32_t>(any(1, 88200));
        m.echolevel[u] = static_cast<uint32_t>(any(0, 128));
        m.echoon[u] = static_cast<uint8_t>(any(0, 1));
    }
    slots.efxtype[21] = 11;
    slots.efxtype[30] = 16;
    slots.efxtype[99] = 1;

    const int rows[] = {64, 1, 200, 128};
    for (int p = 0; p < 4; ++p) {
        m.rows[p] = static_cast<int16_t>(rows[p]);
        bank.Gofree(m.patbase + p);
        bank.patcreate(m.patbase + p, m.nbtrack);
        Pattern& pat = *bank.pattern(m.patbase + p);
        for (int t = 0; t < m.nbtrack; ++t) {
            if (t == 4) continue;  // an empty track
            for (int r = 0; r < rows[p]; ++r) {
                if (any(0, 3) != 0 && r != rows[p] - 1) continue;
                pat.col[t][r] = {static_cast<uint8_t>(any(0, 4) ? any(1, 127) : 0x80 | any(0, 127)),
                                 static_cast<uint8_t>(any(0, 128)),
                                 0,
                                 static_cast<uint8_t>(any(0, 127)),
                                 static_cast<uint8_t>(any(0, 40)),
                                 static_cast<uint8_t>(any(0, 255))};
            }
        }
    }

    struct Shape {
        int bits;
        int stereo;
        uint32_t length;
    };
    const Shape shapes[] = {{8, 0, 1000}, {16, 0, 2002}, {16, 1, 4000}, {8, 1, 0}};
    const int slot_of[] = {0, 5, 64, 127};
    for (int i = 0; i < 4; ++i) {
        SampleRef s = make_sample(shapes[i].length);
        for (uint32_t b = 0; b < shapes[i].length; ++b) s->data[b] = static_cast<uint8_t>(any(0, 255));
        s->bits = static_cast<int16_t>(shapes[i].bits);
        s->stereo = static_cast<uint8_t>(shapes[i].stereo);
        s->framecode = frame_code(s->bits, s->stereo);
        s->rate = static_cast<uint32_t>(any(4000, 96000));
        s->loopstart = shapes[i].length / 4;
        s->loopend = shapes[i].length / 2;
        s->loopon = static_cast<int16_t>(i & 1);
        s->refnote = static_cast<int16_t>(any(0, 127));
        s->volume = static_cast<int16_t>(any(0, 128));
        s->level = static_cast<int16_t>(any(0, 128));
        s->finetune = static_cast<int16_t>(any(-8, 15));
        s->flag2 = static_cast<uint8_t>(any(0, 1));
        s->flagword = static_cast<uint16_t>(any(0, 31));
        s->setting = static_cast<uint32_t>(any(0, 1 << 20));
        for (auto& w : s->envelope) w = static_cast<uint16_t>(any(0, 65535));
        set_sample_name(*s, ("sample " + std::to_string(i)).c_str(), 31);
        bank.t_sound[m.sndbase + slot_of[i]] = std::move(s);
    }
}

// Every field the native format carries, compared byte for byte.
#define EXPECT_SAME(a, b, field) EXPECT_EQ(0, std::memcmp(&(a).field, &(b).field, sizeof((a).field))) << #field

void expect_same_song(const SongBank& a, const EffectSlots& sa, const SongBank& b, const EffectSlots& sb) {
    const TMOD& x = a.current();
    const TMOD& y = b.current();
    EXPECT_SAME(x, y, name);
    EXPECT_SAME(x, y, format);
    EXPECT_SAME(x, y, globalvol);
    EXPECT_SAME(x, y, speed);
    EXPECT_SAME(x, y, tempo);
    EXPECT_SAME(x, y, nbpos);
    EXPECT_SAME(x, y, repeat);
    EXPECT_SAME(x, y, nbtrack);
    EXPECT_SAME(x, y, sequence);
    EXPECT_SAME(x, y, trackpan);
    EXPECT_SAME(x, y, trackpan2);
    EXPECT_SAME(x, y, trackvol);
    EXPECT_SAME(x, y, trackc);
    EXPECT_SAME(x, y, tracke);
    EXPECT_SAME(x, y, nbvoice);
    EXPECT_SAME(x, y, trackword1);
    EXPECT_SAME(x, y, trackd);
    EXPECT_SAME(x, y, trackf);
    EXPECT_SAME(x, y, trackblock);
    EXPECT_SAME(x, y, patmark);
    EXPECT_SAME(x, y, efxflag);
    EXPECT_SAME(x, y, efxa);
    EXPECT_SAME(x, y, efxb);
    EXPECT_SAME(x, y, efxc);
    EXPECT_SAME(x, y, efxval);
    EXPECT_SAME(x, y, echolen);
    EXPECT_SAME(x, y, echolevel);
    EXPECT_SAME(x, y, echoon);
    EXPECT_SAME(x, y, rows);
    EXPECT_SAME(sa, sb, efxtype);
    for (int p = 0; p < kPatternsPerSong; ++p) {
        const Pattern* pa = a.song_pattern(p);
        const Pattern* pb = b.song_pattern(p);
        ASSERT_EQ(pa == nullptr, pb == nullptr) << "pattern " << p;
        for (int t = 0; pa && t < x.nbtrack; ++t)
            ASSERT_EQ(0, std::memcmp(pa->column(t), pb->column(t), sizeof(TNOTE) * static_cast<size_t>(x.rows[p])))
                << "pattern " << p << " track " << t;
    }
    for (int i = 0; i < kSamplesPerSong; ++i) {
        const p_s* s = a.song_sample(i);
        const p_s* t = b.song_sample(i);
        ASSERT_EQ(s == nullptr, t == nullptr) << "sample " << i;
        if (!s) continue;
        EXPECT_SAME(*s, *t, name);
        EXPECT_SAME(*s, *t, length);
        EXPECT_SAME(*s, *t, loopstart);
        EXPECT_SAME(*s, *t, loopend);
        EXPECT_SAME(*s, *t, loopon);
        EXPECT_SAME(*s, *t, rate);
        EXPECT_SAME(*s, *t, bits);
        EXPECT_SAME(*s, *t, stereo);
        EXPECT_SAME(*s, *t, framecode);
        EXPECT_SAME(*s, *t, refnote);
        EXPECT_SAME(*s, *t, volume);
        EXPECT_SAME(*s, *t, level);
        EXPECT_SAME(*s, *t, finetune);
        EXPECT_SAME(*s, *t, flag2);
        EXPECT_SAME(*s, *t, flagword);
        EXPECT_SAME(*s, *t, setting);
        EXPECT_SAME(*s, *t, envelope);
        ASSERT_EQ(std::memcmp(s->data, t->data, s->length), 0) << "data of sample " << i;
    }
}

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
        expect_same_song(original, original_slots, loaded, loaded_slots);
        // Saving what was loaded gives the same bytes again.
        EXPECT_EQ(write_otm(loaded, 0, loaded_slots), write_otm(original, 0, original_slots));
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

TEST(OtmRoundTrip, EveryTruncationOfAWrittenFileStaysInBounds) {
    SongBank bank;
    EffectSlots slots;
    TMOD& m = bank.current();
    m.rows[0] = 16;
    bank.Gofree(m.patbase);
    bank.patcreate(m.patbase, 4);
    bank.pattern(m.patbase)->col[2][7] = {60, 64, 0, 1, 33, 3};
    SampleRef s = make_sample(40);
    s->bits = 16;
    s->framecode = 1;
    s->loopon = 1;
    s->loopend = 40;
    bank.t_sound[0] = std::move(s);
    const std::vector<uint8_t> full = write_otm(bank, 0, slots);
    const std::vector<size_t> ends = test::chunk_ends(full);
    ASSERT_EQ(ends.back(), full.size());
    for (size_t n = 0; n < full.size(); n += (n < 8500 ? 7 : 1)) {
        std::vector<uint8_t> part(full.begin(), full.begin() + static_cast<long>(n));
        ModuleRead out;
        ByteReader r(part);
        if (!read_otm(r, out)) {
            EXPECT_LT(n, 8u);
            continue;
        }
        EXPECT_EQ(out.truncated, std::find(ends.begin(), ends.end(), n) == ends.end()) << n;
        if (const p_s* t = out.song.samples[0].get()) {
            EXPECT_LE(t->length, 40u);
            EXPECT_LE(t->loopend, t->length);
        }
    }
}

TEST(OtmSave, AFailedSaveLeavesWhatWasThere) {
    SongBank bank;
    EffectSlots slots;
    test::TempDir dir;
    // The target is a directory holding a file: the rename must fail.
    std::filesystem::create_directory(dir.file("song.otm"));
    const std::string inside = dir.write("song.otm/keep.txt", {'k'});
    std::string why;
    EXPECT_FALSE(save_otm(dir.file("song.otm"), bank, 0, slots, why));
    EXPECT_FALSE(why.empty());
    EXPECT_EQ(test::read_all(inside), std::vector<uint8_t>{'k'});
    size_t entries = 0;
    for (const auto& e : std::filesystem::directory_iterator(dir.path())) entries += !e.path().empty();
    EXPECT_EQ(entries, 1u);  // no temporary file left behind

    EXPECT_FALSE(save_otm(dir.file("no/such/dir/song.otm"), bank, 0, slots, why));
    EXPECT_STREQ(bank.current().path, "");
}

TEST(OtmSave, SavingOverAnExistingFileReplacesItWhole) {
    SongBank bank;
    EffectSlots slots;
    test::TempDir dir;
    const std::string path = dir.write("old.otm", std::vector<uint8_t>(100000, 0xAA));
    std::string why;
    ASSERT_TRUE(save_otm(path, bank, 0, slots, why)) << why;
    EXPECT_EQ(test::read_all(path), write_otm(bank, 0, slots));
}

}  // namespace
}  // namespace ondrel
