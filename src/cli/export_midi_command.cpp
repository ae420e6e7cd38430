#include <chrono>
#include <cstdio>
#include <iostream>

#include "cli/cli_load.h"
#include "cli/commands.h"
#include "cli/console.h"
#include "cli/song_output_args.h"
#include "render/midi_export.h"

namespace ondrel {

namespace {

void export_midi_usage(std::ostream& out) {
    out << "usage: ondrel export-midi FILE -o OUT.mid [options]\n"
           "Plays the song as 'render' does, faster than real time, and writes what the sequencer\n"
           "plays as a standard MIDI file (format 1, 960 ticks to the quarter note): a tempo track,\n"
           "then one track for each song track that plays notes. A track with a MIDI channel holds\n"
           "exactly what the MIDI output gets from it; the others get channels no MIDI track uses\n"
           "(never 10, the drums), their notes, and each note's instrument N as program N-1. A\n"
           "quarter note is 48 sequencer steps: four rows at speed 6. It stops where 'render'\n"
           "stops; notes still sounding end there.\n\n"
           "  -o OUT.mid           the file to write ('-': standard output)\n"
           "  --max-seconds S      stop after S seconds of the song\n"
           "  --pitch N            global pitch, 64 to 192 (128 = normal): the song's speed\n"
           "  --no-tempo           one sequencer step per buffer, as 'render --no-tempo' plays\n"
           "  --buffer FRAMES      frames per buffer, 64 to 4096 (default 1024)\n"
           "  --quiet              no progress bar\n"
           "The other options of 'render' are taken and change nothing in a MIDI file.\n";
}

}  // namespace

int cmd_export_midi(const Args& args) {
    SongOutputArgs parsed;
    const int exit_code =
        parse_song_output_args(args, "export-midi", "OUT.mid", export_midi_usage, nullptr, parsed);
    if (exit_code >= 0) return exit_code;
    Engine engine;
    if (!load_song_with_options(parsed, engine)) return kExitFailed;
    const bool progress = !parsed.quiet && is_terminal(2);
    auto last_shown = std::chrono::steady_clock::now();
    const TMOD& song = engine.bank.current();
    MidiExportOptions options{{parsed.sound.buffer_frames, parsed.sound.max_seconds}, nullptr};
    if (progress)
        options.progress = [&](const Player& player, double seconds) {
            const auto now = std::chrono::steady_clock::now();
            if (now - last_shown < std::chrono::milliseconds(100)) return;
            show_song_progress(player, song, seconds, "played");
            last_shown = now;
        };
    const MidiExport exported = song_to_midi(engine, options);
    if (progress) std::fprintf(stderr, "\r%70s\r", "");
    std::string why;
    if (!save_midi_file(parsed.out, exported.file, why)) {
        std::cerr << "ondrel: " << why << "\n";
        return kExitFailed;
    }
    if (!parsed.quiet)
        std::fprintf(stderr, "wrote %s: %.1f s of song, tracks with notes: %zu; stopped at the %s\n",
                     parsed.out == "-" ? "standard output" : parsed.out.c_str(), exported.seconds,
                     exported.file.tracks.size(), render_end_text(exported.end));
    return kExitOk;
}

}  // namespace ondrel
