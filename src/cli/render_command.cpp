#include <algorithm>
#include <chrono>
#include <cstdio>
#include <iostream>

#include "cli/cli_load.h"
#include "cli/commands.h"
#include "cli/console.h"
#include "cli/song_output_args.h"
#include "cli/sound_options.h"
#include "export/wav_writer.h"
#include "render/offline_render.h"

namespace ondrel {

namespace {

void render_usage(std::ostream& out) {
    out << "usage: ondrel render FILE -o OUT.wav [options]\n"
           "Renders the song offline, faster than real time, to a 44100 Hz stereo WAV file.\n"
           "It stops at the song's end, when the song comes back to a row it has already\n"
           "played, or at --max-seconds. A file OUT is replaced only once it is complete;\n"
           "a pipe or a device (or '-', standard output) gets the sound as it is rendered.\n\n"
           "  -o OUT.wav           the file to write\n"
           "  --float              32-bit float samples instead of 16-bit\n"
           "  --quiet              no progress bar\n"
        << sound_options_help();
}

}  // namespace

int cmd_render(const Args& args) {
    SongOutputArgs parsed;
    bool as_float = false;
    const auto own_flag = [&](const std::string& a) {
        if (a != "--float") return false;
        as_float = true;
        return true;
    };
    const int exit_code = parse_song_output_args(args, "render", "OUT.wav", render_usage, own_flag, parsed);
    if (exit_code >= 0) return exit_code;
    const std::string& out = parsed.out;
    const bool quiet = parsed.quiet;
    Engine engine;
    if (!load_song_with_options(parsed, engine)) return kExitFailed;
    MidiSetup midi(engine);
    if (!start_midi_synth(parsed.sound, midi)) return kExitFailed;
    WavWriter wav;
    std::string why;
    if (!wav.open(out, 2, 44100, as_float ? WavSampleFormat::Float32 : WavSampleFormat::Pcm16, why)) {
        std::cerr << "ondrel: " << why << "\n";
        return kExitFailed;
    }
    const bool progress = !quiet && is_terminal(2);
    const auto started = std::chrono::steady_clock::now();
    auto last_shown = started;
    const TMOD& song = engine.bank.current();
    const RenderEnd end = render_offline(
        engine.mixer, engine.player, OfflineOptions{parsed.sound.buffer_frames, parsed.sound.max_seconds},
        [&](const float* frames, int count, double seconds) {
            if (!wav.write(frames, static_cast<size_t>(count))) return false;
            const auto now = std::chrono::steady_clock::now();
            if (progress && now - last_shown > std::chrono::milliseconds(100)) {
                show_song_progress(engine.player, song, seconds, "rendered");
                last_shown = now;
            }
            return true;
        });
    if (progress) std::fprintf(stderr, "\r%70s\r", "");
    if (end == RenderEnd::Aborted) why = wav.error();
    if (end == RenderEnd::Aborted || !wav.finish(why)) {
        std::cerr << "ondrel: " << why << "\n";
        wav.abandon();
        return kExitFailed;
    }
    const double seconds = static_cast<double>(wav.frames_written()) / 44100.0;
    const double took = std::chrono::duration<double>(std::chrono::steady_clock::now() - started).count();
    if (!quiet)
        std::fprintf(stderr, "wrote %s: %.1f s of sound in %.2f s (%.0fx real time); stopped at the %s\n",
                     out == "-" ? "standard output" : out.c_str(), seconds, took,
                     took > 0 ? seconds / took : 0.0, render_end_text(end));
    return kExitOk;
}

}  // namespace ondrel
