#include "song_fixture.h"

namespace ondrel {
namespace {

class Commands : public test::SongFixture {
protected:
    void SetUp() override {
        make_song(4, {0, 1});
        add_sample(1, 40, 0);
    }
};

TEST_F(Commands, SpeedAndTempo) {
    put(0, 0, 0, 0, 0, 15, 32);
    put(0, 0, 1, 0, 0, 15, 0);  // nothing
    play();
    calls(1);
    EXPECT_EQ(song().tempo, 1875000u);
    EXPECT_EQ(song().speed, 6);
    put(0, 1, 0, 0, 0, 15, 31);
    calls(11 + 1);
    EXPECT_EQ(song().speed, 31);
}

TEST_F(Commands, FinetuneOnARowWithoutANoteZeroesThePeriod) {
    put(0, 0, 0, 48, 1);
    put(0, 1, 0, 0, 0, 14, 0x53);
    play();
    rows(1);
    EXPECT_GT(voice(0).period, 0.0f);
    calls(1);
    EXPECT_EQ(voice(0).finetune, 3);
    EXPECT_EQ(voice(0).period, 0.0f);
    EXPECT_EQ(voice(0).baseperiod, 0.0f);
}

TEST_F(Commands, FinetuneWithANoteUsesTheFactor) {
    put(0, 0, 0, 48, 1, 14, 0x58);
    play();
    calls(1);
    EXPECT_FLOAT_EQ(voice(0).period, period_of(48, 8));
    EXPECT_GT(voice(0).period, floatnote()[48]);  // 8 lowers the pitch by 7/8 semitone
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

TEST_F(Commands, SlidesAlreadyActOnTheFirstTick) {
    put(0, 0, 0, 48, 1, 1, 2);
    play();
    calls(1);
    EXPECT_FLOAT_EQ(voice(0).baseperiod, floatnote()[48] - 2);
    calls(11);
    EXPECT_FLOAT_EQ(voice(0).baseperiod, floatnote()[48] - 12);  // six ticks
}

TEST_F(Commands, VibratoDepthFifteenMovesAtMost29) {
    put(0, 0, 0, 48, 1);
    for (int r = 1; r < 64; ++r) put(0, r, 0, 0, 0, 4, 0xFF);
    play();
    rows(1);
    const float base = voice(0).baseperiod;
    float lo = base, hi = base;
    for (int i = 0; i < 12 * 20; ++i) {
        calls(1);
        lo = std::min(lo, voice(0).period);
        hi = std::max(hi, voice(0).period);
        EXPECT_EQ(voice(0).baseperiod, base);
    }
    EXPECT_EQ(hi - base, 29.0f);
    EXPECT_EQ(base - lo, 29.0f);
}

TEST_F(Commands, VibratoKeepsItsSpeedAndDepthBetweenRows) {
    put(0, 0, 0, 48, 1, 4, 0x83);
    put(0, 1, 0, 0, 0, 4, 0x00);
    put(0, 2, 0, 0, 0, 4, 0x05);
    play();
    calls(1);
    EXPECT_EQ(voice(0).vibparam, 0x83);
    EXPECT_EQ(voice(0).vibpos, 32);
    calls(11 + 1);
    EXPECT_EQ(voice(0).vibparam, 0x83);
    calls(11 + 1);
    EXPECT_EQ(voice(0).vibparam, 0x85);  // a parameter of 15 or less leaves the speed
}

TEST_F(Commands, TonePortamentoReachesItsTargetExactly) {
    put(0, 0, 0, 48, 1);
    put(0, 1, 0, 60, 0, 3, 40);
    for (int r = 2; r < 20; ++r) put(0, r, 0, 0, 0, 3, 0);
    play();
    rows(1);
    const float from = voice(0).baseperiod;
    calls(1);  // the target is set, nothing retriggers, and the first tick already slides
    EXPECT_EQ(voice(0).note, 48);
    EXPECT_FLOAT_EQ(voice(0).baseperiod, from - 40);
    rows(10);
    EXPECT_FLOAT_EQ(voice(0).baseperiod, period_of(60));
    EXPECT_EQ(voice(0).portatarget, 0.0f);
    EXPECT_EQ(voice(0).portaspeed, 40);
}

TEST_F(Commands, ArpeggioCyclesWithTheSpeed) {
    put(0, 0, 0, 48, 1, 0, 0x47);
    play();
    std::vector<float> seen;
    for (int tick = 0; tick < 6; ++tick) {
        calls(1);
        seen.push_back(voice(0).period);
        calls(1);
    }
    // (speed - tick) mod 3: ticks 0, 3 base; 1, 4 the y note; 2, 5 the x note.
    const std::vector<float> want = {period_of(48), period_of(55), period_of(52),
                                     period_of(48), period_of(55), period_of(52)};
    for (int i = 0; i < 6; ++i) EXPECT_FLOAT_EQ(seen[i], want[i]) << i;
}

TEST_F(Commands, VolumeCommands) {
    put(0, 0, 0, 48, 1, 12, 0x50);  // no upper clamp
    play();
    calls(1);
    EXPECT_EQ(voice(0).volume, 160);
    put(0, 1, 0, 0, 0, 10, 0x30);
    calls(11 + 1);
    EXPECT_EQ(voice(0).volume, 128);  // +6 a tick from 160, clamped
    put(0, 2, 0, 0, 0, 10, 0x05);
    calls(11 + 12);
    EXPECT_EQ(voice(0).volume, 128 - 6 * 10);
    voice(0).volume = 10;
    put(0, 3, 0, 0, 0, 5, 0x12);  // 18 > 15: the whole byte slides up
    calls(1 + 1);
    EXPECT_EQ(voice(0).volume, 10 + 36);
    put(0, 4, 0, 0, 0, 6, 0x0F);
    calls(11 + 1);
    EXPECT_EQ(voice(0).volume, 98);  // up to 128 by the end of row 3, then down 30
}

TEST_F(Commands, FineVolumeAndNoteCut) {
    put(0, 0, 0, 48, 1, 14, 0xA5);
    play();
    calls(1);
    EXPECT_EQ(voice(0).volume, 50);
    put(0, 1, 0, 0, 0, 14, 0xB9);
    calls(11 + 1);
    EXPECT_EQ(voice(0).volume, 32);
    put(0, 2, 0, 0, 0, 14, 0xC2);
    calls(11 + 4);
    EXPECT_EQ(voice(0).volume, 32);
    calls(1);  // tick 2
    EXPECT_EQ(voice(0).volume, 0);
}

TEST_F(Commands, NoteDelayTriggersOnItsTick) {
    put(0, 0, 0, 48, 1, 14, 0xD2, 100);
    play();
    calls(1);
    EXPECT_EQ(voice(0).active, 0);
    calls(3);
    EXPECT_EQ(voice(0).active, 0);
    calls(1);  // notick 4: tick 2
    EXPECT_EQ(voice(0).active, 1);
    EXPECT_EQ(voice(0).note, 48);
    EXPECT_EQ(voice(0).volume, 100);
}

TEST_F(Commands, HalfTickDelayUsesOddCallsToo) {
    put(0, 0, 0, 50, 1, 26, 3);
    play();
    calls(3);
    EXPECT_EQ(voice(0).active, 0);
    calls(1);  // the call with notick 3
    EXPECT_EQ(voice(0).active, 1);
    EXPECT_EQ(voice(0).volume, 40);
    put(0, 1, 1, 52, 1, 26, 0);  // 0: no delay
    calls(8 + 1);
    EXPECT_EQ(voice(1).active, 1);
}

TEST_F(Commands, SampleOffsetAndTrackWords) {
    put(0, 0, 0, 48, 1, 9, 0x10);
    put(0, 0, 1, 0, 0, 8, 100);
    put(0, 0, 2, 0, 0, 16, 200);
    put(0, 0, 3, 0, 0, 22, 90);
    put(0, 1, 0, 0, 0, 21, 10);
    put(0, 1, 1, 0, 0, 27, 20);
    play();
    calls(1);
    EXPECT_EQ(voice(0).position, 0x1000u);
    EXPECT_EQ(song().trackvol[1], 50);
    EXPECT_EQ(song().globalvol, 200);
    EXPECT_EQ(song().trackpan[3], 90);
    EXPECT_EQ(song().trackpan2[3], 90);
    rows(1);
    EXPECT_EQ(song().trackpan[0], 10);
    EXPECT_EQ(song().trackpan2[0], 128);
    EXPECT_EQ(song().trackpan2[1], 20);
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
    engine.slots.reserve_send_buffers(1);
    put(0, 0, 0, 0, 0, 33, 11);  // echo: has a type
    put(0, 0, 1, 0, 0, 33, 4);   // no unit in slot 4: nothing
    put(0, 0, 2, 0, 0, 33, 12);  // a second slot, but only one send buffer: nothing
    play();
    calls(1);
    EXPECT_EQ(song().tracke[0], 11);
    EXPECT_EQ(player.efxaffiche[0], 11);
    EXPECT_EQ(song().tracke[1], 0);
    EXPECT_EQ(song().tracke[2], 0);
    song().tracke[3] = 11;
    put(0, 1, 0, 0, 0, 34, 77);
    put(0, 1, 1, 0, 0, 33, 0);
    calls(11 + 1);
    EXPECT_EQ(song().trackc[0], 77);
    EXPECT_EQ(song().trackc[3], 77);
    EXPECT_EQ(song().trackc[2], 128);
}

TEST_F(Commands, NoteDelayAtTickZeroTriggersInBothPasses) {
    test::SongFixture::song().trackword1[0] = 1;
    struct Count : MidiOut {
        int on = 0;
        void NoteOn(uint8_t, uint8_t, uint8_t, uint64_t) override { ++on; }
        void NoteOff(uint8_t, uint8_t, uint8_t, uint64_t) override {}
        void ProgramChange(uint8_t, uint8_t, uint64_t) override {}
    } out;
    player.papi = &out;
    put(0, 0, 0, 48, 1, 14, 0xD0);
    play();
    calls(1);
    EXPECT_EQ(out.on, 2);
    player.papi = nullptr;
}

}  // namespace
}  // namespace ondrel
