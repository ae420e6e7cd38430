// What each effect unit costs per second of audio, and the whole effect stage with every
// unit routed against the mixer alone.
#include <benchmark/benchmark.h>

#include <cmath>
#include <vector>

#include "engine/engine.h"

namespace ondrel {
namespace {

constexpr int kFrames = 1024;
constexpr double kBuffersPerSecond = 44100.0 / kFrames;

void BM_Unit(benchmark::State& state) {
    const int slot = static_cast<int>(state.range(0));
    Engine engine;
    std::vector<float> send(kFrames), out(2 * kFrames);
    for (int i = 0; i < kFrames; ++i) send[i] = static_cast<float>(std::sin(i * 0.05)) * 0.3f;
    const int type = engine.slots.efxtype[slot];
    for (auto _ : state) {
        engine.units.begin_buffer();
        engine.units.run(slot, type, send.data(), out.data(), kFrames, 128, 1.0f, 1.0f);
        benchmark::DoNotOptimize(out.data());
    }
    // Seconds of audio processed per second of work.
    state.counters["x_realtime"] = benchmark::Counter(
        static_cast<double>(state.iterations()) / kBuffersPerSecond, benchmark::Counter::kIsRate);
    state.SetLabel(engine.rack.label(slot));
}
BENCHMARK(BM_Unit)->Arg(1)->Arg(2)->Arg(3)->Arg(5)->Arg(9)->Arg(10)->Arg(11)->Arg(12)->Arg(16)->Arg(17);

// A song of eight tracks playing looped samples; routed: each track to another unit.
void song_with_every_unit(Engine& e, bool routed) {
    TMOD& m = e.bank.current();
    m.nbtrack = 8;
    e.bank.nbvoie = 8;
    SampleRef s = make_sample(20000);
    for (uint32_t i = 0; i < 20000; ++i)
        s->data[i] = static_cast<uint8_t>(static_cast<int8_t>(std::sin(i * 0.1) * 100));
    s->bits = 8;
    s->rate = 8363;
    s->refnote = 48;
    s->volume = 64;
    s->loopon = 1;
    s->loopstart = 1000;
    s->loopend = 20000;
    e.bank.t_sound[0] = std::move(s);
    Pattern* p = e.bank.song_pattern(0);
    for (int t = 0; t < 8; ++t) p->col[t][0] = {static_cast<uint8_t>(40 + t * 3), 0, 0, 1, 0, 0};
    const int units[] = {1, 2, 5, 9, 10, 11, 12, 16};
    if (routed)
        for (int t = 0; t < 8; ++t) m.tracke[t] = static_cast<uint16_t>(units[t]);
    e.mixer.qual = 1;
    e.player.tr.floop = 1;
    e.player.start(false);
}

void BM_Mixer(benchmark::State& state) {
    Engine engine;
    song_with_every_unit(engine, state.range(0) != 0);
    std::vector<float> out(2 * kFrames);
    for (auto _ : state) {
        engine.mixer.BufferProc(nullptr, out.data(), out.size() * 4, AudioFormat{});
        benchmark::DoNotOptimize(out.data());
    }
    state.counters["x_realtime"] = benchmark::Counter(
        static_cast<double>(state.iterations()) / kBuffersPerSecond, benchmark::Counter::kIsRate);
    state.SetLabel(state.range(0) ? "8 tracks, each through a different unit" : "8 tracks, dry");
}
BENCHMARK(BM_Mixer)->Arg(0)->Arg(1);

}  // namespace
}  // namespace ondrel

BENCHMARK_MAIN();
