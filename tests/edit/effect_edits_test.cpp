// The effect panel, the track buttons and the reverb panels as undoable edits: alerts,
// the echo limit, the routing walks, the panels' conversions and limits, and edits swapped
// in while a render callback runs on its own thread.
#include "edit/effect_edits.h"

#include "edit/reverb_edits.h"
#include "edit/song_fixture.h"
#include "edit/sound_edits.h"
#include "support/fake_audio_device.h"

namespace ondrel {
namespace {

class EffectEdits : public test::EditFixture {
protected:
    TMOD& song() { return engine.bank.current(); }
    int16_t type(int slot) const { return engine.slots.efxtype[size_t(slot)]; }
    template <class Op>
    int slot_from(Op op) {  // runs an edit that answers with a slot
        int s = -1;
        edit([&](SongTransaction& t) { return (s = op(t)) >= 0; });
        return s;
    }
};

TEST_F(EffectEdits, RefusedClonesAndRemovalsShowTheirAlertsAndChangeNothing) {
    const std::tuple<bool, int, const char*, const char*> cases[] = {
        {true, 12, "You don't need to clone Efx 12", "ok !!"},
        {true, 5, "You can't clone these Efx", "why ?"},
        {true, 10, "You can't clone these Efx", "why ?"},
        {false, 11, "You can't remove a basic Efx, only cloned efx !!", "ah ah !"},
    };
    for (const auto& [clone, slot, text, button] : cases) {
        engine.alert_log.shown.clear();
        EXPECT_FALSE(edit(
            [&](SongTransaction& t) { return clone ? clone_effect(t, slot) >= 0 : remove_effect(t, slot); }));
        ASSERT_EQ(engine.alert_log.shown.size(), 1u) << text;
        EXPECT_EQ(engine.alert_log.shown[0].text, text);
        EXPECT_EQ(engine.alert_log.shown[0].buttons, std::vector<std::string>{button});
    }
}

TEST_F(EffectEdits, ClonesStopAtFifteenEchoesRemovalUnroutesAndUndoRestores) {
    for (int i = 0; i < 15; ++i) EXPECT_EQ(slot_from([](auto& t) { return clone_effect(t, 11); }), 20 + i);
    EXPECT_EQ(slot_from([](auto& t) { return clone_effect(t, 11); }), -1);
    EXPECT_TRUE(engine.alert_log.shown.empty());  // refused without a message
    EXPECT_EQ(slot_from([](auto& t) { return clone_effect(t, 9); }), 35);
    song().tracke[6] = 35;
    EXPECT_TRUE(edit([](SongTransaction& t) { return remove_effect(t, 35); }));
    EXPECT_EQ(std::make_pair(type(35), song().tracke[6]), std::make_pair(int16_t{0}, uint16_t{0}));
    EXPECT_FALSE(edit([](SongTransaction& t) { return remove_effect(t, 36); }));
    ASSERT_TRUE(undo());
    EXPECT_EQ(std::make_pair(type(35), song().tracke[6]), std::make_pair(int16_t{9}, uint16_t{35}));
    while (undo()) {
    }
    EXPECT_EQ(type(20), 0);
}

TEST_F(EffectEdits, TrackButtonsWalkTheSlotsWithTheirAsymmetry) {
    engine.slots.efxtype[99] = 1;  // a clone in the last slot
    song().tracke[2] = 99;
    EXPECT_EQ(slot_from([](auto& t) { return mnplusefx(t, 2); }), 1);    // wraps to 1
    EXPECT_EQ(slot_from([](auto& t) { return mnmoinsefx(t, 2); }), 17);  // from 1: on at 98, 99 passed by
    EXPECT_EQ(slot_from([](auto& t) { return mnmoinsefx(t, 3); }), 99);  // from 0: starts at 99 itself
    song().trackg[4] = 1;  // another bank: the word the mixer reads stays
    SongTransaction t(engine.bank, engine.slots, "bank 1");
    EXPECT_EQ(mnplusefx(t, 4), 1);
    EXPECT_TRUE(t.commit().empty());
    EXPECT_TRUE(undo() && undo());
    EXPECT_EQ(std::make_pair(song().tracke[2], song().tracke[3]), std::make_pair(uint16_t{1}, uint16_t{0}));
}

TEST_F(EffectEdits, EchoDelayInMillisecondsOrOneBeatAndTheUnitsSettings) {
    for (uint32_t ms = 1; ms <= kMaxEchoDelayMs; ++ms) ASSERT_EQ(echo_delay_ms(echo_delay_frames(ms)), ms);
    EXPECT_EQ(std::make_tuple(echo_delay_frames(1000), echo_delay_frames(0), echo_delay_frames(60000)),
              std::make_tuple(44100u, 44u, 441000u));
    EXPECT_EQ(std::make_pair(beat_frames(480000), echo_delay_ms(beat_frames(480000))),
              std::make_pair(21168u, 480u));

    const int echo = slot_from([](auto& t) { return clone_effect(t, 11); });              // instance 1
    EXPECT_FALSE(edit([](SongTransaction& t) { return set_echo_delay_ms(t, 3, 100); }));  // not an echo
    EXPECT_TRUE(edit([&](SongTransaction& t) { return set_echo_delay_ms(t, echo, 9000); }));
    EXPECT_EQ(std::make_pair(song().echolen[1], song().echolen[0]), std::make_pair(396900u, 44100u));
    EXPECT_GE(engine.slots.sizeecho[1], 4 * 396900u + 1024);  // the line holds the delay
    song().tempo = 600000;
    EXPECT_TRUE(edit([&](SongTransaction& t) {
        return set_echo_delay_to_beat(t, echo) & set_echo_feedback(t, echo, 500) &
               set_echo_invert(t, echo, true);
    }));
    EXPECT_EQ(std::make_tuple(song().echolen[1], song().echolevel[1], song().echoon[1]),
              std::make_tuple(26460u, 128u, uint8_t{1}));
    ASSERT_TRUE(undo() && undo());
    EXPECT_EQ(std::make_tuple(song().echolen[1], song().echolevel[1], song().echoon[1]),
              std::make_tuple(44100u, 75u, uint8_t{0}));

    song().efxc[16] = -4;  // the mixer turned it round at a bound
    EXPECT_TRUE(
        edit([](SongTransaction& t) { return set_auto_pan(t, 16, true) & set_auto_pan_speed(t, 16, 9); }));
    EXPECT_EQ(std::make_pair(song().efxflag[16], song().efxc[16]), std::make_pair(uint8_t{1}, int16_t{-9}));
    EXPECT_TRUE(edit(
        [](SongTransaction& t) { return set_active_filter_frequency(t, 5, 3) & set_filter_q(t, 17, 0); }));
    EXPECT_EQ(std::make_pair(song().efxval[5], song().efxd[17]), std::make_pair(10u, uint8_t{1}));
    EXPECT_TRUE(edit([](SongTransaction& t) { return set_active_filter_frequency(t, 5, 99999); }));
    EXPECT_EQ(song().efxval[5], 20000u);
    EXPECT_FALSE(edit([](SongTransaction& t) {  // slots without the unit each control belongs to
        return set_auto_pan(t, 40, true) || set_active_filter_frequency(t, 16, 500) || set_filter_q(t, 5, 3);
    }));
}

TEST_F(EffectEdits, ReverbPanelsConvertLimitAndUndo) {
    EffectUnits& units = engine.units;
    const ReverbSettings first = units.firstreverb.settings();
    const ReverbDHSSettings second = units.secreverb.settings();
    const std::tuple<int, int, uint32_t, uint16_t> delays[] = {
        {10, 3, 20000, 882},    {10, 0, 50, 4},          {10, 1, 90, 4},
        {10, 2, 91, 4},         {10, 4, 1000000, 11049}, {10, 6, 1000000, 44099},
        {9, 0, 1000000, 16383}, {9, 9, 1000, 44},        {9, 9, 2000000, 44099},
    };
    for (const auto& [unit, field, us, frames] : delays) {
        EXPECT_TRUE(edit([&](SongTransaction& t) { return set_reverb_delay(t, units, unit, field, us); }));
        const uint16_t got = unit == 10   ? units.firstreverb.length(field)
                             : field == 9 ? units.secreverb.delay_length()
                                          : units.secreverb.comb_length(field);
        EXPECT_EQ(got, frames) << unit << "/" << field << " " << us;
        // What the panel shows, typed again, gives the same line.
        EXPECT_EQ(reverb_frames(reverb_delay_shown(units, unit, field), 65535), frames);
    }
    EXPECT_TRUE(edit([&](SongTransaction& t) { return set_reverb_delay(t, units, 9, 9, 0); }));
    EXPECT_EQ(std::make_pair(units.secreverb.delay_length(), reverb_delay_shown(units, 9, 9)),
              std::make_pair(uint16_t{0}, 0u));
    EXPECT_TRUE(edit([&](SongTransaction& t) {
        return set_reverb_gain(t, units, 10, 5, 650) & set_reverb_gain(t, units, 9, 7, 1234) &
               set_reverb_cutoff(t, units, 1, 5) & set_reverb_cutoff(t, units, 2, 30000);
    }));
    // Shown back as typed, 0.918 included.
    EXPECT_EQ(std::make_tuple(reverb_gain_shown(units, 10, 5), reverb_gain_shown(units, 9, 7),
                              reverb_gain_shown(units, 10, 0), reverb_gain_shown(units, 9, 10)),
              std::make_tuple(650, 1234, 918, 1000));
    EXPECT_FLOAT_EQ(units.secreverb.settings().tap[2], 1.234f);  // DHS fields 5..9 are the taps
    EXPECT_EQ(std::make_pair(reverb_cutoff_shown(units, 1), reverb_cutoff_shown(units, 2)),
              std::make_pair(10, 11050));
    EXPECT_FALSE(edit([&](SongTransaction& t) {
        return set_reverb_cutoff(t, units, 2, 12000) || set_reverb_gain(t, units, 3, 0, 1);
    }));
    while (undo()) {
    }
    EXPECT_EQ(units.firstreverb.settings(), first);
    EXPECT_EQ(units.secreverb.settings(), second);
    ASSERT_TRUE(history.redo(engine.bank, engine.slots));
    EXPECT_EQ(units.firstreverb.length(3), 882);
}

TEST(EffectEditsWhilePlaying, AreSwappedInUnderTheDeviceLock) {
    Engine engine;
    EditHistory history;
    TMOD& m = engine.bank.current();
    m.nbtrack = 1;
    engine.bank.Gofree(m.patbase);
    engine.bank.patcreate(m.patbase, 1);
    for (int r = 0; r < 64; r += 4) engine.bank.song_pattern(0)->col[0][r] = {48, 0, 0, 1, 0, 0};
    engine.bank.t_sound[0] = test::make_sound({16, false}, std::vector<int>(4000, 9000));
    test::FakeDevice device(engine);
    device.start();
    engine.player.start(false);
    for (int i = 0; i < 60; ++i) {
        SongTransaction t(engine.bank, engine.slots, "edit");
        mnplusefx(t, 0);
        set_echo_delay_ms(t, 11, 5 + i * 37 % 900);
        set_reverb_delay(t, engine.units, i % 2 ? 9 : 10, i % 5, 1000 + 977 * i);
        set_reverb_gain(t, engine.units, 10, i % 7, 500 + i);
        apply_sound_tool(t, 0, i % 2 ? SoundTool::InvertSign : SoundTool::Reverse, {});
        if (i % 3 == 0) cut_frames(t, 0, {0, 10});
        history.push(t.commit());
        if (i % 4 == 3) history.undo(engine.bank, engine.slots);
        std::this_thread::sleep_for(std::chrono::microseconds(700));
    }
    const int heard = device.buffers.load();
    while (device.buffers.load() < heard + 3) std::this_thread::sleep_for(std::chrono::milliseconds(1));
    engine.player.stoppi();
    device.stop();
}

}  // namespace
}  // namespace ondrel
