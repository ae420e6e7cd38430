#include <algorithm>
#include <chrono>
#include <cstdio>
#include <iostream>
#include <mutex>
#include <thread>

#include "cli/cli_load.h"
#include "cli/commands.h"
#include "cli/console.h"
#include "cli/sound_options.h"
#include "cli/terminal_keys.h"
#include "platform/sdl_audio_output.h"

namespace ondrel {

namespace {

void play_usage(std::ostream& out) {
    out << "usage: ondrel play FILE [options]\n"
           "Plays the song on the sound card with a status line; it ends by itself at the\n"
           "song's end or when the song comes back to a row it has played. Keys: q or Esc\n"
           "stops, l toggles looping (then the song plays until you stop it).\n\n"
           "  --loop               loop the song\n"
        << sound_options_help()
        << "Exit status 3 means no sound device could be opened ('ondrel render' works without one).\n";
}

void show_status(const Engine& e, double seconds) {
    const TMOD& m = e.bank.current();
    const int pos = e.player.tr.nopat;
    std::fprintf(stderr, "\r%-15s pos %3d/%-3d pat %3d row %3d/%-3d %3d:%02d  L %s R %s  load %3.0f%% ",
                 e.player.status, pos, m.nbpos, m.sequence[std::clamp(pos, 0, 255)], e.player.tr.nopos.load(),
                 m.rows[m.sequence[std::clamp(pos, 0, 255)]], static_cast<int>(seconds) / 60,
                 static_cast<int>(seconds) % 60, level_meter(e.mixer.lmax, 12).c_str(),
                 level_meter(e.mixer.rmax, 12).c_str(), e.mixer.powermusic * 100.0);
    std::fflush(stderr);
}

}  // namespace

int cmd_play(const Args& args) {
    std::string in, error;
    bool loop = false;
    SoundOptions sound;
    for (size_t i = 0; i < args.size() && error.empty(); ++i) {
        const std::string& a = args[i];
        if (a == "-h" || a == "--help") {
            play_usage(std::cout);
            return kExitOk;
        } else if (a == "--loop") {
            loop = true;
        } else if (parse_sound_option(args, i, sound, error)) {
        } else if (!a.empty() && a[0] != '-' && in.empty()) {
            in = a;
        } else {
            error = "unexpected " + a;
        }
    }
    if (error.empty() && in.empty()) error = "which song?";
    if (!error.empty()) {
        std::cerr << "ondrel play: " << error << "\n";
        play_usage(std::cerr);
        return kExitUsage;
    }

    Engine engine;
    if (!load_for_cli(engine, in)) return kExitFailed;
    apply_sound_options(sound, engine);
    MidiSetup midi(engine);
    if (!start_midi_synth(sound, midi)) return kExitFailed;
    Player& player = engine.player;
    player.tr.floop = loop;
    player.watch_for_repeats(!loop);

    SdlAudioOutput output(engine.mixer, player, engine.bank);
    std::string why;
    if (!output.open(sound.buffer_frames, why)) {
        std::cerr << "ondrel: " << why << "\n";
        return kExitNoDevice;
    }
    StopRequests stop_requests;
    const bool status = is_terminal(2);
    TerminalKeys keys;
    player.start(false);
    const auto started = std::chrono::steady_clock::now();
    const char* ended = "the end of the song";
    for (;;) {
        std::this_thread::sleep_for(std::chrono::milliseconds(50));
        const double seconds =
            std::chrono::duration<double>(std::chrono::steady_clock::now() - started).count();
        if (status) show_status(engine, seconds);
        Message msg;
        while (player.to_window.pop(msg)) {
        }
        const int key = keys.poll();
        if (key == 'q' || key == 'Q' || key == 27 || stop_requests.asked()) {
            ended = "your request";
            break;
        }
        if (key == 'l' || key == 'L') {
            loop = !loop;
            player.tr.floop = loop;
        }
        if (!player.tr.playing) break;
        if (!loop && player.repeated) {
            ended = "the point where the song loops back";
            break;
        }
        if (sound.max_seconds > 0 && seconds >= sound.max_seconds) {
            ended = "the time limit";
            break;
        }
    }
    player.stoppi();
    output.close();
    if (status) std::fprintf(stderr, "\n");
    std::fprintf(stderr, "stopped at %s (sound driver: %s)\n", ended, output.driver());
    return kExitOk;
}

}  // namespace ondrel
