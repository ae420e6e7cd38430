#include "render/offline_render.h"

#include "mixer_fixture.h"

namespace ondrel {
namespace {

class OfflineRender : public test::MixerFixture {
protected:
    // A one-track song of positions patterns of rows rows at speed 6, 125 BPM.
    void make_song(int positions, int rows) {
        TMOD& m = song();
        m.nbtrack = 1;
        m.nbpos = static_cast<uint8_t>(positions);
        for (int p = 0; p < positions; ++p) {
            m.sequence[p] = static_cast<uint8_t>(p);
            m.rows[p] = static_cast<int16_t>(rows);
            engine.bank.Gofree(m.patbase + p);
            engine.bank.patcreate(m.patbase + p, 1);
        }
        engine.bank.nbvoie = 1;
        sample8(1, std::vector<int8_t>(200000, 20));
        engine.bank.song_pattern(0)->col[0][0] = {48, 0, 0, 1, 0, 0};
    }
    RenderEnd run(OfflineOptions options, uint64_t& frames) {
        frames = 0;
        return render_offline(mixer, player, options, [&](const float*, int count, double) {
            frames += static_cast<uint64_t>(count);
            return true;
        });
    }
};

TEST_F(OfflineRender, StopsAtTheSongsEnd) {
    make_song(2, 4);
    uint64_t frames = 0;
    EXPECT_EQ(run({256, 0}, frames), RenderEnd::SongEnd);
    // 8 rows of 12 half-ticks of 441 frames, the last one whole.
    const uint64_t song = 8 * 12 * 441;
    EXPECT_GE(frames, song);
    EXPECT_LT(frames, song + 256);
    EXPECT_EQ(player.tr.playing, 0);
    EXPECT_EQ(player.tr.nopat, 0);
}

TEST_F(OfflineRender, ASongThatJumpsBackEndsWhereItRepeats) {
    make_song(3, 4);
    engine.bank.song_pattern(2)->col[0][3] = {0, 0, 0, 0, 11, 1};  // back to position 1
    uint64_t frames = 0;
    EXPECT_EQ(run({512, 0}, frames), RenderEnd::Repeat);
    const uint64_t once = 12 * 12 * 441;
    EXPECT_GE(frames, once);
    EXPECT_LT(frames, once + 512);
}

TEST_F(OfflineRender, TimeLimitIsExact) {
    make_song(100, 64);
    uint64_t frames = 0;
    EXPECT_EQ(run({1000, 1.5}, frames), RenderEnd::TimeLimit);
    EXPECT_EQ(frames, 66150u);
}

TEST_F(OfflineRender, ASinkThatFailsStopsTheRender) {
    make_song(4, 64);
    int calls = 0;
    const RenderEnd end =
        render_offline(mixer, player, {}, [&](const float*, int, double) { return ++calls < 3; });
    EXPECT_EQ(end, RenderEnd::Aborted);
    EXPECT_EQ(calls, 3);
}

}  // namespace
}  // namespace ondrel
