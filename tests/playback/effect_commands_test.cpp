#include <array>

#include "song_fixture.h"

namespace ondrel {
namespace {

class Commands : public test::SongFixture {
protected:
    void SetUp() override {
        make_song(4, {0, 1});
        add_sample(1, 40, 0);
    }
    float period(int note) const { return floatnote()[note]; }
};

enum Field { kVolume, kActive, kPeriod, kBase, kPosition, kTempo, kSpeed, kTrackVol, kGlobal, kPans };

// What a few cells of track 0 leave after a number of sequencer calls (12 a row at speed
// 6; the first call of a row is its tick 0).
struct Case {
    const char* what;
    std::vector<std::array<int, 6>> cells;  // row, note, instrument, command, parameter, volume
    int calls;
    Field field;
    double want;
};

TEST_F(Commands, CellsLeaveTheirValues) {
    const float p48 = period(48);
    const Case cases[] = {
        {"F 32: tempo in BPM", {{0, 0, 0, 15, 32, 0}}, 1, kTempo, 1875000},
        {"F 0: nothing", {{0, 0, 0, 15, 0, 0}}, 1, kSpeed, 6},
        {"F 31: speed", {{1, 0, 0, 15, 31, 0}}, 13, kSpeed, 31},
        {"slide up on the first tick", {{0, 48, 1, 1, 2, 0}}, 1, kBase, p48 - 2},
        {"and on each of six", {{0, 48, 1, 1, 2, 0}}, 12, kBase, p48 - 12},
        {"E5x without a note: no period", {{0, 48, 1, 0, 0, 0}, {1, 0, 0, 14, 0x53, 0}}, 13, kPeriod, 0},
        {"C 0x50: no upper clamp", {{0, 48, 1, 12, 0x50, 0}}, 1, kVolume, 160},
        {"A 0x30 slides up to 128", {{0, 48, 1, 12, 0x50, 0}, {1, 0, 0, 10, 0x30, 0}}, 13, kVolume, 128},
        {"A 0x05 slides down each tick", {{0, 48, 1, 12, 0x40, 0}, {1, 0, 0, 10, 5, 0}}, 24, kVolume, 68},
        {"5 0x12: the whole byte slides up", {{0, 48, 1, 12, 5, 0}, {1, 0, 0, 5, 0x12, 0}}, 13, kVolume, 46},
        {"6 0x0F slides down", {{0, 48, 1, 12, 0x40, 0}, {1, 0, 0, 6, 0x0F, 0}}, 13, kVolume, 98},
        {"EA5 fine up", {{0, 48, 1, 14, 0xA5, 0}}, 1, kVolume, 50},
        {"EB9 fine down", {{0, 48, 1, 14, 0xB9, 0}}, 1, kVolume, 22},
        {"EC2 keeps the volume on tick 1", {{0, 48, 1, 14, 0xC2, 0}}, 4, kVolume, 40},
        {"and cuts on tick 2", {{0, 48, 1, 14, 0xC2, 0}}, 5, kVolume, 0},
        {"ED2 waits on tick 1", {{0, 48, 1, 14, 0xD2, 100}}, 4, kActive, 0},
        {"and starts on tick 2, cell volume", {{0, 48, 1, 14, 0xD2, 100}}, 5, kVolume, 100},
        {"26 3 waits three half-ticks", {{0, 50, 1, 26, 3, 0}}, 3, kActive, 0},
        {"and starts on the fourth", {{0, 50, 1, 26, 3, 0}}, 4, kVolume, 40},
        {"26 0 does not wait", {{0, 50, 1, 26, 0, 0}}, 1, kActive, 1},
        {"9 0x10: sample offset", {{0, 48, 1, 9, 0x10, 0}}, 1, kPosition, 0x1000},
        {"8 100: track volume", {{0, 0, 0, 8, 100, 0}}, 1, kTrackVol, 50},
        {"16 200: global volume", {{0, 0, 0, 16, 200, 0}}, 1, kGlobal, 200},
        {"22 90: both pans", {{0, 0, 0, 22, 90, 0}}, 1, kPans, 90090},
        {"21 10: first pan", {{0, 0, 0, 21, 10, 0}}, 1, kPans, 128010},
        {"27 20: second pan", {{0, 0, 0, 27, 20, 0}}, 1, kPans, 20128},
    };
    for (const Case& c : cases) {
        make_song(4, {0, 1});
        for (const auto& [row, note, instrument, command, parameter, volume] : c.cells)
            put(0, row, 0, note, instrument, command, parameter, volume);
        play();
        calls(c.calls);
        const Voice& v = voice(0);
        const TMOD& m = song();
        const double pans = m.trackpan[0] + m.trackpan2[0] * 1000.0;
        const double values[] = {1.0 * v.volume,    1.0 * v.active,
                                 v.period,          v.baseperiod,
                                 1.0 * v.position,  1.0 * m.tempo,
                                 1.0 * m.speed,     1.0 * m.trackvol[0],
                                 1.0 * m.globalvol, pans};
        EXPECT_FLOAT_EQ(values[c.field], c.want) << c.what;
        player.stoppi();
        set_new_song_defaults(song(), 0);
    }
}

TEST_F(Commands, FinetuneLowersThePitchBelowTheNextSemitone) {
    put(0, 0, 0, 48, 1, 14, 0x58);  // 8: 7/8 of a semitone down
    play();
    calls(1);
    EXPECT_GT(voice(0).period, period(48));
    EXPECT_LT(voice(0).period, period(47));
}

TEST_F(Commands, SlidesStopAtThePeriodLimits) {
    put(0, 0, 0, 48, 1);
    put(0, 1, 0, 0, 0, 1, 10);
    put(0, 2, 0, 0, 0, 2, 10);
    put(0, 3, 0, 0, 0, 14, 0x15);  // fine slides: row start only
    put(0, 4, 0, 0, 0, 14, 0x27);
    play();
    calls(12);
    voice(0).baseperiod = 20;
    calls(1);
    EXPECT_EQ(voice(0).baseperiod, 16.0f);
    EXPECT_EQ(voice(0).period, 16.0f);
    calls(11);
    voice(0).baseperiod = 6840;
    calls(1);
    EXPECT_EQ(voice(0).baseperiod, 6848.0f);
    calls(11);
    voice(0).baseperiod = 100;
    calls(12);
    EXPECT_EQ(voice(0).baseperiod, 95.0f);
    calls(1);
    EXPECT_EQ(voice(0).baseperiod, 102.0f);
}

TEST_F(Commands, VibratoDepthAndMemory) {
    put(0, 0, 0, 48, 1, 4, 0x83);
    put(0, 1, 0, 0, 0, 4, 0x00);  // keeps speed and depth
    put(0, 2, 0, 0, 0, 4, 0x05);  // 15 or less: a new depth, the speed stays
    for (int r = 3; r < 64; ++r) put(0, r, 0, 0, 0, 4, 0xFF);
    play();
    calls(1);
    EXPECT_EQ(voice(0).vibparam, 0x83);
    EXPECT_EQ(voice(0).vibpos, 32);
    rows(1);
    EXPECT_EQ(voice(0).vibparam, 0x83);
    rows(1);
    EXPECT_EQ(voice(0).vibparam, 0x85);
    rows(1);
    const float base = voice(0).baseperiod;
    float lo = base, hi = base;
    for (int i = 0; i < 12 * 20; ++i) {
        calls(1);
        lo = std::min(lo, voice(0).period);
        hi = std::max(hi, voice(0).period);
        EXPECT_EQ(voice(0).baseperiod, base);
    }
    // Depth 15 swings a sine of peak 255 by 15/128 of it, truncated: 29 each way.
    EXPECT_EQ(hi - base, 29.0f);
    EXPECT_EQ(base - lo, 29.0f);
}

TEST_F(Commands, TonePortamentoReachesItsTargetExactly) {
    put(0, 0, 0, 48, 1);
    put(0, 1, 0, 60, 0, 3, 40);
    for (int r = 2; r < 20; ++r) put(0, r, 0, 0, 0, 3, 0);
    play();
    rows(1);
    calls(1);  // the target is set, nothing retriggers, and the first tick already slides
    EXPECT_EQ(voice(0).note, 48);
    EXPECT_FLOAT_EQ(voice(0).baseperiod, period(48) - 40);
    rows(10);
    EXPECT_FLOAT_EQ(voice(0).baseperiod, period(60));
    EXPECT_EQ(voice(0).portatarget, 0.0f);
    EXPECT_EQ(voice(0).portaspeed, 40);
}

TEST_F(Commands, ArpeggioCyclesWithTheSpeed) {
    put(0, 0, 0, 48, 1, 0, 0x47);
    play();
    // (speed - tick) mod 3: ticks 0 and 3 the note, 1 and 4 the note + y, 2 and 5 + x.
    const int notes[] = {48, 55, 52, 48, 55, 52};
    for (int tick = 0; tick < 6; ++tick) {
        calls(1);
        EXPECT_FLOAT_EQ(voice(0).period, period(notes[tick])) << tick;
        calls(1);
    }
}

TEST_F(Commands, SampleBlocks) {
    song().patmark[1][1] = {300, 700};  // entry = the instrument number, block 2
    put(0, 0, 0, 48, 1);
    put(0, 1, 0, 0, 0, 30, 9);  // above 8: ignored
    put(0, 2, 0, 0, 0, 30, 2);
    put(0, 3, 0, 0, 0, 30, 0);
    play();
    rows(2);
    EXPECT_EQ(voice(0).block, 0);
    calls(1);
    EXPECT_EQ(voice(0).block, 2);
    EXPECT_EQ(voice(0).position, 300u);
    EXPECT_EQ(voice(0).endpos, 700u);
    voice(0).position = 444;
    calls(11 + 1);
    EXPECT_EQ(voice(0).block, 0);
    EXPECT_EQ(voice(0).position, 444u);  // back to the whole sample without moving
}

TEST_F(Commands, EffectSlotRoutingAndSendLevels) {
    put(0, 0, 0, 0, 0, 33, 11);  // echo: has a type
    put(0, 0, 1, 0, 0, 33, 4);   // no unit in slot 4: nothing
    put(0, 0, 2, 0, 0, 33, 12);  // a second slot: its send buffer exists, so it is routed
    play();
    calls(1);
    EXPECT_EQ(song().tracke[0], 11);
    EXPECT_EQ(player.efxaffiche[0], 11);
    EXPECT_EQ(song().tracke[1], 0);
    EXPECT_EQ(song().tracke[2], 12);
    EXPECT_EQ(player.efxaffiche[2], 12);
    song().tracke[3] = 11;
    put(0, 1, 0, 0, 0, 34, 77);
    put(0, 1, 1, 0, 0, 33, 0);
    calls(11 + 1);
    EXPECT_EQ(song().trackc[0], 77);
    EXPECT_EQ(song().trackc[3], 77);
    EXPECT_EQ(song().trackc[2], 128);
}

}  // namespace
}  // namespace ondrel
