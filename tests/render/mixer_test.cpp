#include "mixer_fixture.h"
#include "render/pan_table.h"

namespace ondrel {
namespace {

using Mix = test::MixerFixture;
constexpr float kTol = 1e-6f;

TEST_F(Mix, PanTable) {
    EXPECT_EQ(pan_gain(0), 0.0f);
    EXPECT_NEAR(pan_gain(64), 0.70710678f, 1e-7f);
    for (int p : {0, 1, 63, 64, 127}) EXPECT_FLOAT_EQ(tab_pan()[p], pan_gain(p)) << p;
}

// One voice on one sample: the left output, as the sample values it should carry.
TEST_F(Mix, OneVoiceReadsItsSampleAsItShould) {
    using V = std::vector<int8_t>;
    struct Case {
        const char* what;
        V data;
        uint32_t loopstart, loopend;  // a loop when loopend is not 0
        double step;
        int quality, muted;
        std::vector<int> heard;
        bool active_after;
    };
    const V ramp = {0, 8, 16, 24, 32, 40, 48, 56, 64, 72, 80};
    const Case cases[] = {
        {"constant", V(100, 64), 0, 0, 1, 0, 0, {64, 64, 64, 64}, true},
        {"half speed", {0, 20, 40, 60, 80, 100}, 0, 0, 0.5, 0, 0, {0, 0, 20, 20, 40, 40}, true},
        {"interpolated", {0, 20, 40, 60, 80, 100}, 0, 0, 0.5, 1, 0, {0, 10, 20, 30, 40, 50}, true},
        {"step 0", {10, 20, 30, 40}, 0, 0, 0, 0, 0, {10, 10, 10}, true},
        {"loop wraps in a piece", ramp, 4, 8, 1.5, 0, 0, {0, 8, 24, 32, 48, 32, 48, 32, 48, 32}, true},
        {"loop end at its start", V(12, 50), 8, 8, 1, 0, 0, {50, 50, 50, 50, 50, 50, 50, 50, 0, 0, 0}, true},
        {"one-shot ends", V(6, 30), 0, 0, 1, 0, 0, {30, 30, 30, 30, 30, 30, 0, 0}, false},
        {"muted", V(6, 30), 0, 0, 1, 0, 1, {0, 0, 0, 0, 0, 0, 0, 0}, false},
    };
    for (const Case& c : cases) {
        p_s& s = sample8(1, c.data);
        s.loopon = c.loopend != 0;
        s.loopstart = c.loopstart;
        s.loopend = c.loopend;
        mixer.qual = static_cast<int16_t>(c.quality);
        mixer.mute[0] = static_cast<uint8_t>(c.muted);
        mixer.ftemp = 0;  // one piece for the whole buffer
        Voice& v = start_voice(0, 1, c.step);
        const auto out = render(static_cast<int>(c.heard.size()));
        for (size_t i = 0; i < c.heard.size(); ++i)
            EXPECT_NEAR(left(out, static_cast<int>(i)), centred(c.heard[i]), kTol)
                << c.what << ", frame " << i;
        EXPECT_EQ(v.active != 0, c.active_after) << c.what;
    }
    EXPECT_EQ(player.nlist[0].position, 6u);  // the muted voice went on
}

TEST_F(Mix, LoopPositionAndFractionCarryOver) {
    std::vector<int8_t> ramp(16, 1);
    p_s& s = sample8(1, ramp);
    s.loopon = 1;
    s.loopstart = 4;
    s.loopend = 8;
    Voice& v = start_voice(0, 1, 1.5);
    render(10);
    EXPECT_EQ(v.position, 6u);
    EXPECT_EQ(v.fraction, 0.0f);
    v.period = 1.5f;  // below period 2 a voice stands still, silent
    const auto out = render(8);
    for (float x : out) EXPECT_EQ(x, 0.0f);
    EXPECT_EQ(v.position, 6u);
    EXPECT_EQ(v.active, 1);
    start_voice(1, 5);  // an empty slot ends the voice
    render(4);
    EXPECT_EQ(player.nlist[1].active, 0);
}

TEST_F(Mix, PanModesSilenceOneSideByVoiceNumber) {
    sample8(1, std::vector<int8_t>(100, 64));
    struct Case {
        int mode, voice;
        bool left_heard, right_heard;
    };
    const Case cases[] = {{1, 0, false, true}, {1, 1, true, false}, {1, 2, true, false}, {1, 3, false, true},
                          {3, 0, false, true}, {3, 1, true, false}, {3, 2, false, true}, {2, 3, true, true}};
    for (const Case& c : cases) {
        song().mode = static_cast<int16_t>(c.mode);
        for (auto& v : player.nlist) v.active = 0;
        start_voice(c.voice, 1);
        const auto out = render(4);
        EXPECT_NEAR(left(out, 2), c.left_heard ? centred(64) : 0.0f, kTol) << c.mode << " voice " << c.voice;
        EXPECT_NEAR(right(out, 2), c.right_heard ? centred_right(64) : 0.0f, kTol)
            << c.mode << " voice " << c.voice;
    }
}

TEST_F(Mix, TrackGainsPanAndMaster) {
    sample8(1, std::vector<int8_t>(100, 64));
    song().trackvol[2] = 0;    // pan position 0: hard left is sin(0)
    song().trackpan2[2] = 64;  // the right gain, half
    start_voice(0, 1, 1.0, 2);
    auto out = render(4);
    EXPECT_EQ(left(out, 1), 0.0f);
    EXPECT_NEAR(right(out, 1), 0.25f * 0.5f * pan_gain(127) * 0.5f, kTol);
    EXPECT_NEAR(mixer.rmax.load(), right(out, 1), kTol);
    song().globalvol = 128;  // master 2.0
    out = render(4);
    EXPECT_NEAR(right(out, 1), 0.25f * 0.5f * pan_gain(127), kTol);
}

TEST_F(Mix, VoicesAddOverOneThatEndedOrIsMuted) {
    // The first voice sets the frames it plays; the frames after its end must be silence
    // before the next voice adds to them, and a muted voice sets nothing.
    sample8(1, std::vector<int8_t>(4, 30));
    sample8(2, std::vector<int8_t>(100, 20));
    sample8(3, std::vector<int8_t>(100, 10));
    start_voice(0, 1, 1.0, 0);
    start_voice(1, 2, 1.0, 1);
    start_voice(2, 3, 1.0, 2);
    mixer.mute[2] = 1;
    auto out = render(12);
    for (int i = 0; i < 4; ++i) EXPECT_NEAR(left(out, i), centred(30) + centred(20), kTol) << i;
    for (int i = 4; i < 12; ++i) EXPECT_NEAR(left(out, i), centred(20), kTol) << i;
    mixer.mute[2] = 0;
    mixer.mute[1] = 1;  // the first voice heard is now the third
    out = render(4);
    for (int i = 0; i < 4; ++i) EXPECT_NEAR(right(out, i), centred_right(10), kTol) << i;
    mixer.mute[1] = 0;  // at volume 0 it is skipped as if muted, yet plays on
    Voice& quiet = player.nlist[1];
    quiet.volume = 0;
    const uint32_t at = quiet.position;
    out = render(4);
    for (int i = 0; i < 4; ++i) EXPECT_NEAR(right(out, i), centred_right(10), kTol) << i;
    EXPECT_EQ(quiet.position, at + 4);
}

TEST_F(Mix, SixteenBitStereoAndTheClip) {
    sample<int16_t>(1, {1000, -2000, 1000, -2000, 1000, -2000, 1000, -2000}, true);
    start_voice(0, 1);
    auto out = render(4);
    const float unit = 0.25f / 32768.0f;
    EXPECT_NEAR(left(out, 3), 1000 * unit * pan_gain(64), kTol);
    EXPECT_NEAR(right(out, 3), -2000 * unit * pan_gain(63), kTol);
    EXPECT_EQ(player.nlist[0].active, 0);  // four frames, then the end

    sample<int16_t>(1, std::vector<int16_t>(64, 32767));
    sample<int16_t>(2, std::vector<int16_t>(64, -32768));
    song().globalvol = 256;    // x 4
    song().trackpan[0] = 256;  // x 2
    song().trackpan2[1] = 256;
    song().trackvol[0] = 127;  // left
    song().trackvol[1] = 0;    // right
    start_voice(0, 1, 1.0, 0);
    start_voice(1, 2, 1.0, 1);
    out = render(8);
    EXPECT_EQ(left(out, 3), 1.0f);
    EXPECT_EQ(right(out, 3), -1.0f);
    EXPECT_EQ(mixer.lmax.load(), 1.0f);
    EXPECT_EQ(mixer.rmax.load(), 1.0f);
}

TEST_F(Mix, TicksSplitTheBufferAndCarryTheRest) {
    song().speed = 31;  // long rows: notick counts the sequencer calls
    player.start(false);
    EXPECT_EQ(mixer.tick_frames(), 441.0);
    render(4096);  // 9 ticks of 441 frames, then 127 of a tenth
    EXPECT_EQ(player.tr.notick, 10);
    EXPECT_EQ(mixer.bpmreste, 314.0);
    render(314);  // the rest opens the next call without a new tick
    EXPECT_EQ(player.tr.notick, 10);
    render(1);
    EXPECT_EQ(player.tr.notick, 11);
    mixer.ftemp = 0;  // one tick a buffer, whatever its size
    render(4096);
    EXPECT_EQ(player.tr.notick, 12);
    // The global pitch scales the tick: 64 doubles it, 192 shortens it by a quarter.
    mixer.valpitch = 64;
    EXPECT_EQ(mixer.tick_frames(), 882.0);
    mixer.valpitch = 192;
    EXPECT_EQ(mixer.tick_frames(), 220.5);
}

TEST_F(Mix, OtherBuffersAndLoadingRenderNothingAndHoldTheSequencer) {
    sample8(1, std::vector<int8_t>(100, 64));
    start_voice(0, 1);
    player.start(false);
    std::vector<float> buffer(64, 7.0f);
    mixer.BufferProc(nullptr, buffer.data(), buffer.size() * 4, AudioFormat{44100.0f, 2, kFormatShort});
    for (float x : buffer) EXPECT_EQ(x, 7.0f);
    EXPECT_EQ(mixer.nbpass.load(), 0u);
    engine.bank.loadin = 1;
    for (float x : render(1000)) EXPECT_EQ(x, 0.0f);
    EXPECT_EQ(player.tr.notick, 0);
    EXPECT_EQ(mixer.nbpass.load(), 1u);
    engine.bank.loadin = 0;
}

// Captures what the effect stage hands each slot.
struct SlotProbe : EffectProcessor {
    struct Call {
        int slot, type, control;
        float first_send, last_send, gain_left, gain_right;
    };
    std::vector<Call> calls;
    void run(int slot, int type, const float* send, float*, int frames, int control, float el,
             float er) override {
        calls.push_back({slot, type, control, send[0], send[frames - 1], el, er});
    }
};

TEST_F(Mix, RoutedVoicesFeedTheirSlotsSendBuffer) {
    SlotProbe probe;
    mixer.set_effects(&probe);
    sample8(1, std::vector<int8_t>(100, 64));
    song().tracke[0] = 11;  // echo: dry sound kept, send at the track's send level
    song().trackc[0] = 64;
    song().tracke[1] = 1;  // FIR low pass: heard only through the filter
    start_voice(0, 1, 1.0, 0);
    start_voice(1, 1, 1.0, 1);
    auto out = render(8);  // sent from the first buffer on: every slot has its buffer
    ASSERT_EQ(probe.calls.size(), 2u);
    EXPECT_EQ(probe.calls[0].slot, 1);
    EXPECT_EQ(probe.calls[0].control, 128);
    EXPECT_NEAR(probe.calls[0].first_send, 0.5f, kTol);  // the track's left gain, 1.0
    EXPECT_EQ(probe.calls[1].slot, 11);
    EXPECT_EQ(probe.calls[1].type, 11);
    EXPECT_EQ(probe.calls[1].control, 64);
    EXPECT_NEAR(probe.calls[1].last_send, 0.25f, kTol);  // 0.5 x 64 / 128
    EXPECT_NEAR(left(out, 0), centred(64), kTol);        // only voice 0 is heard dry
    // Once no voice writes a slot, its buffer is cleared.
    for (auto& v : player.nlist) v.active = 0;
    probe.calls.clear();
    render(8);
    ASSERT_EQ(probe.calls.size(), 2u);
    EXPECT_EQ(probe.calls[1].first_send, 0.0f);
}

TEST_F(Mix, AutoPanMovesOncePerBufferAndTurnsAtItsBounds) {
    SlotProbe probe;
    mixer.set_effects(&probe);
    song().tracke[0] = 9;
    song().efxflag[9] = 1;
    song().efxa[9] = 10;
    song().efxb[9] = 20;
    song().efxc[9] = 6;
    player.autovar[9] = 10;
    std::vector<int> positions;
    for (int i = 0; i < 5; ++i) {
        render(4);
        positions.push_back(player.autovar[9]);
    }
    EXPECT_EQ(positions, (std::vector<int>{16, 20, 14, 10, 16}));
    EXPECT_EQ(probe.calls[0].gain_left, pan_gain(5));  // the position halved
    EXPECT_EQ(probe.calls[0].gain_right, pan_gain(122));
}

}  // namespace
}  // namespace ondrel
