#include <chrono>
#include <cmath>
#include <cstdio>
#include <iostream>
#include <vector>

#include "cli/cli_load.h"
#include "cli/commands.h"
#include "cli/song_output_args.h"
#include "cli/sound_options.h"
#include "export/png_writer.h"
#include "render/offline_render.h"
#include "shell/analyser_view.h"

namespace ondrel {

namespace {

void spectrogram_usage(std::ostream& out) {
    out << "usage: ondrel spectrogram FILE -o OUT.png [options]\n"
           "Renders the song offline and draws the analyser's Radar view of the whole song:\n"
           "512 columns (the transform's packed values, 0 Hz at the left, 22050 Hz at the\n"
           "right), one row for every 75 ms of the song, from the top down.\n\n"
           "  -o OUT.png           the picture to write\n"
           "  --quiet              no progress line\n"
        << sound_options_help();
}

}  // namespace

int cmd_spectrogram(const Args& args) {
    SongOutputArgs parsed;
    const int exit_code =
        parse_song_output_args(args, "spectrogram", "OUT.png", spectrogram_usage, nullptr, parsed);
    if (exit_code >= 0) return exit_code;
    const std::string& out = parsed.out;
    const bool quiet = parsed.quiet;
    Engine engine;
    if (!load_song_with_options(parsed, engine)) return kExitFailed;
    MidiSetup midi(engine);
    if (!start_midi_synth(parsed.sound, midi)) return kExitFailed;
    // The mixer fills the analyser block from the song; a row is drawn each time 75 ms of
    // the song have been rendered, from the block as the window would find it then.
    engine.mixer.f_fftmode = 1;
    AnalyserView view;
    std::vector<uint32_t> pixels;
    constexpr double kFramesPerRow = kOutputRate * kAnalyserPeriodUs / 1e6;
    uint64_t done = 0;
    const bool progress = !quiet && is_terminal(2);
    auto last_shown = std::chrono::steady_clock::now();
    const RenderEnd end = render_offline(
        engine.mixer, engine.player, OfflineOptions{parsed.sound.buffer_frames, parsed.sound.max_seconds},
        [&](const float*, int count, double seconds) {
            done += static_cast<uint64_t>(count);
            double block[512];
            for (size_t i = 0; i < 512; ++i)
                block[i] = engine.mixer.Bufferfft1[i].load(std::memory_order_relaxed);
            while (static_cast<double>(pixels.size() / kAnalyserWidth) * kFramesPerRow <
                   static_cast<double>(done)) {
                pixels.resize(pixels.size() + kAnalyserWidth);
                radar_line(view.transform(block).data(), pixels.data() + pixels.size() - kAnalyserWidth);
            }
            const auto now = std::chrono::steady_clock::now();
            if (progress && now - last_shown > std::chrono::milliseconds(100)) {
                std::fprintf(stderr, "\r%3d:%02d of the song analysed", static_cast<int>(seconds) / 60,
                             static_cast<int>(seconds) % 60);
                std::fflush(stderr);
                last_shown = now;
            }
            return true;
        });
    if (progress) std::fprintf(stderr, "\r%40s\r", "");
    const int rows = static_cast<int>(pixels.size() / kAnalyserWidth);
    std::string why;
    if (!write_png(out, kAnalyserWidth, rows, pixels, why)) {
        std::cerr << "ondrel: " << why << "\n";
        return kExitFailed;
    }
    if (!quiet)
        std::fprintf(stderr, "wrote %s: %d rows of 75 ms (%.1f s of song), stopped at the %s\n", out.c_str(),
                     rows, static_cast<double>(done) / kOutputRate, render_end_text(end));
    return kExitOk;
}

}  // namespace ondrel
