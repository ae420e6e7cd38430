// The fixed work of one output buffer: what the render callback costs when nothing plays,
// when a song plays rows with no voice sounding, and with one voice: the floor under
// every sparse song's speed; and one voice on a loop of 16 samples, which makes a pass over
// its loop every 84 frames, as chip sounds do. Reported in nanoseconds per buffer of 1024
// frames.
#include <benchmark/benchmark.h>

#include <vector>

#include "engine/engine.h"

namespace ondrel {
namespace {

constexpr int kFrames = 1024;

enum class Content { Stopped, PlayingSilence, OneVoice, ShortLoop };

void set_up(Engine& e, Content content) {
    if (content == Content::Stopped) return;
    TMOD& m = e.bank.current();
    m.nbtrack = 4;
    e.bank.nbvoie = 4;
    if (content == Content::OneVoice || content == Content::ShortLoop) {
        SampleRef s = make_sample(8000);
        for (uint32_t i = 0; i < 8000; ++i) s->data[i] = static_cast<uint8_t>((i * 7) & 0x7f);
        s->bits = 8;
        s->rate = 8363;
        s->refnote = 48;
        s->volume = 64;
        s->loopon = 1;
        s->loopstart = 0;
        s->loopend = content == Content::ShortLoop ? 16 : 8000;
        e.bank.t_sound[0] = std::move(s);
        e.bank.song_pattern(0)->col[0][0] = {48, 0, 0, 1, 0, 0};
    }
    e.mixer.qual = 1;
    e.mixer.measure_load = false;  // as in an offline render
    e.player.tr.floop = 1;
    e.player.start(false);
}

void BM_Buffer(benchmark::State& state) {
    Engine engine;
    const auto content = static_cast<Content>(state.range(0));
    set_up(engine, content);
    std::vector<float> out(2 * kFrames);
    for (auto _ : state) {
        engine.mixer.BufferProc(nullptr, out.data(), out.size() * 4, AudioFormat{});
        benchmark::DoNotOptimize(out.data());
    }
    const char* labels[] = {"stopped", "playing, no voice", "one voice, interpolated",
                            "one voice, interpolated, 16-sample loop"};
    state.SetLabel(labels[state.range(0)]);
}
BENCHMARK(BM_Buffer)->Arg(0)->Arg(1)->Arg(2)->Arg(3);

}  // namespace
}  // namespace ondrel

BENCHMARK_MAIN();
