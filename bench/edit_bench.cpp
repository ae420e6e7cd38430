// What each edit of a full 64-track, 256-row pattern costs (transaction, operation, commit,
// history), and what undoing it costs.
#include <benchmark/benchmark.h>

#include <chrono>
#include <functional>

#include "edit/edit_history.h"
#include "edit/pattern_edits.h"
#include "edit/song_edits.h"
#include "engine/engine.h"

namespace ondrel {
namespace {

constexpr int kRows = 256;
constexpr int kPatterns = 16;

// A song of kPatterns patterns of 64 tracks x 256 rows, every cell holding a note (each
// pattern its own), played in order; tracks is the song's track count.
void fill_song(Engine& engine, int tracks) {
    SongData data;
    TMOD& m = *data.mod;
    m.nbtrack = uint8_t(tracks);
    m.nbpos = kPatterns;
    for (int p = 0; p < kPatterns; ++p) {
        m.sequence[p] = uint8_t(p);
        m.rows[p] = kRows;
        data.patterns[size_t(p)] = make_pattern(tracks, kRows);
        for (int t = 0; t < tracks; ++t)
            for (int r = 0; r < kRows; ++r)
                data.patterns[size_t(p)]->col[t][r] = TNOTE{
                    .note = uint8_t(24 + (p + t + r) % 80), .volume = 64, .instrument = uint8_t(1 + t % 4)};
    }
    engine.bank.install(engine.bank.noimod, std::move(data));
}

using Edit = std::function<void(SongTransaction&)>;

// Each iteration makes the edit and undoes it; both are timed, the rest (setting up)
// is not. The counters are microseconds per edit and per undo.
void measure(benchmark::State& state, const Edit& edit, int tracks = kTracks) {
    using Clock = std::chrono::steady_clock;
    Engine engine;
    fill_song(engine, tracks);
    EditHistory history;
    Clock::duration edits{}, undos{};
    for (auto _ : state) {
        const auto start = Clock::now();
        SongTransaction t(engine.bank, engine.slots, "edit");
        edit(t);
        EditStep step = t.commit();
        const bool changed = !step.empty();
        history.push(std::move(step));
        const auto edited = Clock::now();
        history.undo(engine.bank, engine.slots);
        undos += Clock::now() - edited;
        edits += edited - start;
        if (!changed) {
            state.SkipWithError("the edit changed nothing");
            break;
        }
    }
    const auto microseconds = [](Clock::duration d) {
        return std::chrono::duration<double, std::micro>(d).count();
    };
    state.counters["edit_us"] = benchmark::Counter(microseconds(edits), benchmark::Counter::kAvgIterations);
    state.counters["undo_us"] = benchmark::Counter(microseconds(undos), benchmark::Counter::kAvgIterations);
}

const CellBlock kWhole{0, 0, 0, kTracks - 1, kRows - 1};

void register_all() {
    const std::pair<const char*, Edit> edits[] = {
        {"write_cell",
         [](auto& t) {
             write_cell(t, 0, 63, 255, {1, 0, 0, 1, 0, 0});
         }},
        {"clear_cell_part", [](auto& t) { clear_cell_part(t, 0, 63, 255, CellPart::Note); }},
        {"insert_row", [](auto& t) { insert_row(t, 0, 63, 0); }},
        {"delete_row", [](auto& t) { delete_row(t, 0, 63, 0); }},
        {"clear_block", [](auto& t) { clear_block(t, kWhole); }},
        {"cut_pattern",
         [](auto& t) {
             benchmark::DoNotOptimize(copy_block(t, kWhole));
             clear_block(t, kWhole);
         }},
        {"paste_block",
         [](auto& t) {
             paste_block(t, 0, 0, 0, copy_block(t, {1, 0, 0, 63, 255}), PasteMode::Replace);
         }},
        {"paste_block_mix",
         [](auto& t) {
             clear_block(t, {0, 0, 0, 63, 127});
             paste_block(t, 0, 0, 0, copy_block(t, {1, 0, 0, 63, 255}), PasteMode::Mix);
         }},
        {"transpose_pattern", [](auto& t) { transpose(t, EditRange::of_pattern(0), 1, 0); }},
        {"transpose_song", [](auto& t) { transpose(t, EditRange::whole_song(), 12, 2); }},
        {"replace_all_pattern",
         [](auto& t) {
             replace_all(t, EditRange::of_pattern(0), {std::nullopt, std::nullopt, 1}, {std::nullopt, 32});
         }},
        {"find_next_then_write",
         [](auto& t) {
             // A search through the whole pattern that finds nothing, then a cell written.
             benchmark::DoNotOptimize(find_next(t, EditRange::of_pattern(0), CellMask{127}, {}));
             write_cell(t, 0, 0, 0, {127});
         }},
        {"set_pattern_rows", [](auto& t) { set_pattern_rows(t, 0, 128); }},
        {"insert_position", [](auto& t) { insert_position(t, 0, 3); }},
        {"new_pattern_at", [](auto& t) { new_pattern_at(t, 0); }},
        {"remove_pattern", [](auto& t) { remove_pattern(t, 0); }},
        {"remove_sequence", [](auto& t) { remove_sequence(t); }},
    };
    for (const auto& [name, edit] : edits)
        benchmark::RegisterBenchmark(name, [edit = edit](benchmark::State& s) {
            measure(s, edit);
        })->Unit(benchmark::kMicrosecond);
    // Doubling the tracks of a song of 16 full patterns gives each pattern 32 new columns.
    const Edit to_64_tracks = [](SongTransaction& t) { set_track_count(t, 64); };
    benchmark::RegisterBenchmark("set_track_count", [to_64_tracks](benchmark::State& s) {
        measure(s, to_64_tracks, 32);
    })->Unit(benchmark::kMicrosecond);
}

}  // namespace
}  // namespace ondrel

int main(int argc, char** argv) {
    ondrel::register_all();
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
