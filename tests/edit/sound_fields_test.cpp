// The instrument editor's fields, the envelope curve against the mixer's own envelope
// function, and the blocks command 30 plays.
#include "edit/sound_fields.h"

#include "edit/song_fixture.h"
#include "edit/sound_blocks.h"

namespace ondrel {
namespace {

constexpr int kSlot = 4;

class SoundFields : public test::EditFixture {
protected:
    // 100 frames of 16-bit stereo: 4 bytes a frame.
    void SetUp() override { put_sound(kSlot, test::make_sound({16, true}, std::vector<int>(200, 0))); }
    const p_s& s() const { return *sound(kSlot); }
};

TEST_F(SoundFields, AreKeptInTheirRangesAndAnUnchangedValueMakesNoStep) {
    auto set_all = [](SongTransaction& t) {
        return set_sound_volume(t, kSlot, 1000) | set_sound_finetune(t, kSlot, 20) |
               set_sound_refnote(t, kSlot, -3) | set_sound_rate(t, kSlot, 96000) |
               set_sound_name(t, kSlot, std::string(40, 'k'));
    };
    EXPECT_TRUE(edit(set_all));
    EXPECT_EQ(std::make_tuple(s().volume, s().finetune, s().refnote, s().rate),
              std::make_tuple(int16_t{128}, int16_t{15}, int16_t{0}, 65535u));
    EXPECT_EQ(std::string(s().name), std::string(31, 'k'));
    EXPECT_FALSE(edit(set_all));
    EXPECT_FALSE(edit([](SongTransaction& t) { return set_sound_volume(t, 77, 10); }));  // no sound there
    EXPECT_TRUE(undo());
    EXPECT_EQ(std::make_tuple(s().volume, s().rate), std::make_tuple(int16_t{100}, 22050u));

    EXPECT_TRUE(edit([](SongTransaction& t) { return set_sound_loop(t, kSlot, true, 10, 100); }));
    EXPECT_EQ(std::make_tuple(int(s().loopon), s().loopstart, s().loopend), std::make_tuple(1, 40u, 400u));
    for (auto [start, end] : {std::pair{10u, 101u}, {50u, 50u}, {60u, 50u}})
        EXPECT_FALSE(edit([&](SongTransaction& t) { return set_sound_loop(t, kSlot, true, start, end); }));
}

TEST_F(SoundFields, EnvelopePointsStayInOrderAndTheirBitsSwitch) {
    // Reset points sit at x 0, 64, 128, 192, 255.
    struct Case {
        int point, x, level;
        uint16_t word;
    };
    for (const Case c : {Case{2, 250, 300, 192 << 8 | 255},  // x held below point 3, level at most 255
                         Case{1, 10, 7, 10 << 8 | 7}, Case{0, 99, 1, 0 << 8 | 1},  // point 0's x is not used
                         Case{4, 300, 0, 255 << 8 | 0}}) {
        EXPECT_TRUE(
            edit([&](SongTransaction& t) { return set_envelope_point(t, kSlot, 2, c.point, c.x, c.level); }));
        EXPECT_EQ(s().env(2, c.point), c.word) << c.point;
    }
    EXPECT_EQ(s().env(3, 2), 128 << 8 | 64);  // other envelopes untouched
    EXPECT_TRUE(edit([](SongTransaction& t) { return set_envelope_enabled(t, kSlot, 4, true); }));
    EXPECT_TRUE(edit([](SongTransaction& t) { return set_envelope_enabled(t, kSlot, 0, true); }));
    EXPECT_FALSE(edit([](SongTransaction& t) { return set_envelope_enabled(t, kSlot, 0, true); }));
    EXPECT_TRUE(edit([](SongTransaction& t) { return set_envelope_enabled(t, kSlot, 4, false); }));
    EXPECT_EQ(s().flagword, 0x01);
}

TEST(EnvelopeCurve, IsWhatTheMixersEnvelopeFunctionGivesAtEachPlace) {
    Engine engine;
    Player& player = engine.player;
    const uint8_t shapes[][2][5] = {
        {{0, 64, 128, 192, 255}, {128, 96, 64, 32, 0}},  // x positions, levels
        {{0, 0, 10, 10, 128}, {255, 0, 200, 3, 90}},     // steps, and nothing from the middle on
        {{7, 255, 255, 255, 255}, {0, 255, 1, 1, 1}},
    };
    for (const auto& shape : shapes)
        for (uint32_t length : {0u, 1u, 37u, 70001u})
            for (int framecode : {0, 2}) {
                SampleRef s = make_sample(length << framecode);
                s->framecode = static_cast<int16_t>(framecode);
                s->setting = length * 3 + 5;
                for (int k = 0; k < kEnvelopeKinds; ++k)
                    for (int p = 0; p < kEnvelopePoints; ++p)
                        s->env(k, p) =
                            static_cast<uint16_t>(shape[0][p] << 8 | ((shape[1][p] + 40 * k) & 255));
                for (int kind = 0; kind < kEnvelopeKinds; ++kind) {
                    const std::vector<float> curve = envelope_curve(*s, kind, 97);
                    const uint64_t span = kind == 4 ? s->setting : length;  // the fade runs over setting
                    ASSERT_EQ(curve.size(), 97u);
                    for (size_t i = 0; i < curve.size(); ++i) {
                        player.nlist[3].position = player.nlist[3].count1 =
                            static_cast<uint32_t>(i * span / 97);
                        ASSERT_EQ(curve[i],
                                  player.compute_adsr(kind, 3, static_cast<unsigned long>(span), s.get()))
                            << "kind " << kind << " length " << length << " place " << i;
                    }
                }
            }
}

class SoundBlocks : public test::EditFixture {
protected:
    void SetUp() override { put_sound(kSlot, test::make_sound({8, true}, std::vector<int>(2000, 0))); }
    std::optional<FrameRange> block(int n) const {
        return sound_block(engine.bank.current(), kSlot, n, 1000);
    }
};

TEST_F(SoundBlocks, AreNamedKeptInsideTheSoundAndUndone) {
    EXPECT_EQ(block_name(1) + block_name(8), "Block 1Block 8");
    EXPECT_TRUE(edit([](SongTransaction& t) { return set_sound_block(t, kSlot, 3, {100, 5000}); }));
    const PatMark& mark = engine.bank.current().patmark[kSlot + 1][2];
    EXPECT_EQ(std::make_pair(mark.position, mark.value), std::make_pair(100, 1000));  // cut at 1000 frames
    EXPECT_FALSE(edit([](SongTransaction& t) { return move_sound_block(t, kSlot, 3, 950); }));  // no room
    EXPECT_TRUE(edit([](SongTransaction& t) { return move_sound_block(t, kSlot, 3, 0); }));
    EXPECT_EQ(block(3)->end, 900u);
    EXPECT_FALSE(edit([](SongTransaction& t) {
        return set_sound_block(t, kSlot, 9, {1, 2}) || set_sound_block(t, kSlot, 1, {1000, 1200}) ||
               set_sound_block(t, 127, 1, {1, 2}) || move_sound_block(t, kSlot, 2, 10);
    }));
    EXPECT_TRUE(edit([](SongTransaction& t) { return clear_sound_block(t, kSlot, 3); }));
    EXPECT_FALSE(block(3));
    EXPECT_FALSE(edit([](SongTransaction& t) { return clear_sound_block(t, kSlot, 3); }));
    ASSERT_TRUE(undo());
    EXPECT_EQ(block(3)->first, 0u);
}

TEST_F(SoundBlocks, AreWhatCommand30PlaysForTheSound) {
    edit([](SongTransaction& t) { return set_sound_block(t, kSlot, 2, {300, 700}); });
    TMOD& m = engine.bank.current();
    m.nbtrack = 1;
    engine.bank.Gofree(m.patbase);
    engine.bank.patcreate(m.patbase, 1);
    engine.bank.song_pattern(0)->col[0][0] = TNOTE{48, 0, 0, kSlot + 1, 30, 2};
    engine.player.start(true);
    engine.player.gere_play();
    EXPECT_EQ(std::make_pair(engine.player.nlist[0].position, engine.player.nlist[0].endpos),
              std::make_pair(300u, 700u));
}

}  // namespace
}  // namespace ondrel
