#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <functional>
#include <iostream>
#include <mutex>
#include <thread>

#include "cli/cli_load.h"
#include "cli/commands.h"
#include "cli/console.h"
#include "cli/sound_options.h"
#include "cli/terminal_keys.h"
#include "platform/sdl_audio_output.h"
#include "platform/sdl_capture.h"
#include "record/capture_connection.h"
#include "record/record_format.h"
#include "record/recorder.h"
#include "record/song_end_watch.h"

namespace ondrel {

namespace {

void record_usage(std::ostream& out) {
    out << "usage: ondrel record -o OUT.wav [--mode M] [--gain N] [--seconds S] [--device NAME]\n"
           "       ondrel record --song SONG -o OUT.wav [--seconds S] [sound options]\n"
           "       ondrel record --list-devices\n"
           "Records the sound input straight to a 44100 Hz WAV file, until --seconds, q or\n"
           "Ctrl-C. With --song it plays the song on the sound device and records its own\n"
           "output instead, until the song ends (the same sound as 'ondrel render'). The file\n"
           "is put in place when the recording stops; its header keeps the recorder's 46-byte\n"
           "layout. '-o -' streams the sound to standard output. The recorder's own notes go\n"
           "to standard output (to standard error when the sound goes there).\n\n"
           "  -o OUT.wav           the file to write\n"
           "  --mode M             mono16, stereo16 (default), mono8 or stereo8; mono keeps the\n"
           "                       left channel\n"
           "  --gain N             recording gain, 0 to 512, 128 = unity; loud input above\n"
           "                       unity wraps rather than clips\n"
           "  --seconds S          stop after S seconds of sound\n"
           "  --device NAME        the capture device (default: the default input)\n"
           "  --list-devices       list the capture devices and stop\n"
           "  --song SONG          record SONG's own output\n"
           "  --quiet              no progress line\n"
        << sound_options_help()
        << "Exit status 3 means no capture device (or, with --song, no sound device) could be opened.\n";
}

// Waits until the recorder asks to stop ('stre'), or the user does; shows progress. True
// when it was the recorder.
bool run_until_stopped(Recorder& recorder, uint32_t bytes_per_second, bool progress,
                       const std::function<std::pair<double, double>()>& levels,
                       const std::function<void()>& each_round = {}) {
    StopRequests stop_requests;
    TerminalKeys keys;
    bool asked = false;
    for (;;) {
        std::this_thread::sleep_for(std::chrono::milliseconds(50));
        if (each_round) each_round();
        Message m;
        bool stop = false;
        while (recorder.poll(m)) stop = stop || m.code == kMsgStre;
        if (stop) {
            asked = true;
            break;
        }
        const int key = keys.poll();
        if (key == 'q' || key == 'Q' || key == 27 || stop_requests.asked()) break;
        if (progress) {
            const double seconds = static_cast<double>(recorder.bytes_recorded()) / bytes_per_second;
            const auto [left, right] = levels();
            std::fprintf(stderr, "\rrecording %3d:%04.1f  %7.1f MB  L %s R %s ",
                         static_cast<int>(seconds) / 60, std::fmod(seconds, 60.0),
                         static_cast<double>(recorder.bytes_recorded()) / 1e6, level_meter(left, 10).c_str(),
                         level_meter(right, 10).c_str());
            std::fflush(stderr);
        }
    }
    if (progress) std::fprintf(stderr, "\r%72s\r", "");
    return asked;
}

int report(const RecordingResult& r, const std::string& out, const RecordFormat& f, const char* ended,
           bool quiet) {
    if (r.error) {
        std::cerr << "ondrel: cannot write " << out << ": " << std::strerror(r.error)
                  << (r.file_bytes > 46 ? " (what was recorded before is kept)" : "") << "\n";
        return kExitFailed;
    }
    if (r.bytes_lost)
        std::cerr << "ondrel: warning: the disk could not keep up; " << r.bytes_lost << " bytes were lost\n";
    if (!quiet) {
        const double seconds = static_cast<double>(r.file_bytes - 46) / f.byte_rate;
        std::fprintf(stderr, "wrote %s: %.2f s, %s; stopped at %s\n", out.c_str(), seconds, f.label, ended);
    }
    return kExitOk;
}

int list_devices() {
    std::string why;
    const auto names = capture_device_names(&why);
    if (names.empty()) {
        std::cerr << "ondrel: no capture device (" << why << ")\n";
        return kExitNoDevice;
    }
    for (const auto& n : names) std::cout << n << "\n";
    return kExitOk;
}

struct RecordOptions {
    std::string out, song, device;
    int mode = 1;
    int gain = 128;
    double seconds = 0;
    bool quiet = false;
    SoundOptions sound;
};

// The recorder's notes go to standard output, unless the sound does.
std::FILE* notes_stream(const RecordOptions& o) {
    return o.out == "-" ? stderr : stdout;
}

uint64_t byte_limit(const RecordOptions& o) {
    if (!(o.seconds > 0)) return 0;
    return static_cast<uint64_t>(std::llround(o.seconds * kRecordRate)) * record_format(o.mode).block_align;
}

void set_up(Recorder& recorder, const RecordOptions& o) {
    recorder.samplermode = static_cast<uint16_t>(o.mode);
    recorder.soundrecoutput = 1;
    recorder.vrvol = static_cast<int16_t>(o.gain);
    recorder.set_d2dref(o.out);
    recorder.stop_after_bytes(byte_limit(o));
}

int record_input(const RecordOptions& o) {
    if (!o.device.empty()) {
        const auto names = capture_device_names();
        if (std::find(names.begin(), names.end(), o.device) == names.end()) {
            std::cerr << "ondrel: no capture device named '" << o.device << "'; the devices are:\n";
            for (const auto& n : names) std::cerr << "  " << n << "\n";
            return kExitNoDevice;
        }
    }
    Engine engine;
    SdlCapture input(o.device);
    SoundConsumer node;
    CaptureConnection connection(node, &input, notes_stream(o));
    Recorder recorder(engine.mixer, &engine.alert_log, &connection, notes_stream(o));
    set_up(recorder, o);
    // Monitoring first: it connects the input (and keeps the meters), so no file is made
    // when there is no input to record.
    recorder.Record(kMsgMoni);
    if (!connection.connected()) {
        std::cerr << "ondrel: no capture device could be opened; 'ondrel record --song' records a song's own "
                     "output\n";
        recorder.StopRecording();
        return kExitNoDevice;
    }
    recorder.Record(kMsgReco);
    if (!recorder.isRecording()) {
        std::cerr << "ondrel: cannot create " << o.out << "\n";
        recorder.StopRecording();
        return kExitFailed;
    }
    const RecordFormat& f = record_format(o.mode);
    const bool asked = run_until_stopped(recorder, f.byte_rate, !o.quiet && is_terminal(2), [&] {
        return std::pair<double, double>(recorder.maxg / 16.0, recorder.maxd / 16.0);
    });
    const RecordingResult r = recorder.StopRecording();
    recorder.StopRecording();  // and the monitoring
    const bool full = recorder.stop_after() && recorder.bytes_recorded() >= recorder.stop_after();
    return report(r, o.out, f,
                  !asked ? "your request"
                  : full ? "the time limit"
                         : "the end of the input",
                  o.quiet);
}

int record_song(const RecordOptions& o) {
    Engine engine;
    if (!load_for_cli(engine, o.song)) return kExitFailed;
    apply_sound_options(o.sound, engine);
    MidiSetup midi(engine);
    if (!start_midi_synth(o.sound, midi)) return kExitFailed;
    Recorder recorder(engine.mixer, &engine.alert_log, nullptr, notes_stream(o));
    const RecordFormat& f = record_format(o.mode);
    SongEndWatch watch(recorder, engine.player, engine.mixer, f.block_align);
    engine.mixer.set_recorder(nullptr);  // until the song starts
    engine.mixer.frecmusic = 1;
    Player& player = engine.player;
    SdlAudioOutput output(engine.mixer, player, engine.bank);
    std::string why;
    if (!output.open(o.sound.buffer_frames, why)) {
        std::cerr << "ondrel: " << why << "\n";
        return kExitNoDevice;
    }
    set_up(recorder, o);
    recorder.Record(kMsgReco);
    if (!recorder.isRecording()) {
        std::cerr << "ondrel: cannot create " << o.out << "\n";
        return kExitFailed;
    }
    {
        // The song and the recording start together with the next buffer, from a whole
        // tick, as an offline render starts.
        std::lock_guard<StructureLock> guard(engine.bank.structure_lock());
        engine.mixer.bpmreste = 0;
        player.tr.floop = 0;
        player.watch_for_repeats(true);
        player.start(false);
        engine.mixer.set_recorder(&watch);
    }
    const bool asked = run_until_stopped(
        recorder, f.byte_rate, !o.quiet && is_terminal(2),
        [&] { return std::pair<double, double>(engine.mixer.lmax, engine.mixer.rmax); },
        [&] {
            Message m;
            while (player.to_window.pop(m)) {
            }
        });
    const RecordingResult r = recorder.StopRecording();
    player.stoppi();
    output.close();
    engine.mixer.set_recorder(nullptr);
    const char* ended = !asked               ? "your request"
                        : watch.song_ended() ? "the end of the song"
                                             : "the time limit";
    return report(r, o.out, f, ended, o.quiet);
}

}  // namespace

int cmd_record(const Args& args) {
    RecordOptions o;
    std::string error;
    bool list = false;
    const auto number = [&](size_t& i, double lo, double hi, double& out) {
        if (i + 1 >= args.size()) return false;
        char* end = nullptr;
        const std::string& v = args[++i];
        out = std::strtod(v.c_str(), &end);
        return !v.empty() && !*end && out >= lo && out <= hi;
    };
    for (size_t i = 0; i < args.size() && error.empty(); ++i) {
        const std::string& a = args[i];
        double v = 0;
        if (a == "-h" || a == "--help") {
            record_usage(std::cout);
            return kExitOk;
        } else if (a == "-o" && i + 1 < args.size()) {
            o.out = args[++i];
        } else if (a == "--song" && i + 1 < args.size()) {
            o.song = args[++i];
        } else if (a == "--device" && i + 1 < args.size()) {
            o.device = args[++i];
        } else if (a == "--list-devices") {
            list = true;
        } else if (a == "--quiet") {
            o.quiet = true;
        } else if (a == "--mode") {
            const std::string m = i + 1 < args.size() ? args[++i] : "";
            o.mode = -1;
            for (size_t k = 0; k < kRecordFormats.size(); ++k)
                if (m == kRecordFormats[k].name) o.mode = static_cast<int>(k);
            if (o.mode < 0) error = "--mode takes mono16, stereo16, mono8 or stereo8";
        } else if (a == "--gain") {
            if (!number(i, 0, 512, v) || v != std::floor(v))
                error = "--gain takes a whole number from 0 to 512";
            o.gain = static_cast<int>(v);
        } else if (a == "--seconds") {
            if (!number(i, 0, 1e7, v) || !(v > 0)) error = "--seconds takes a positive number";
            o.seconds = v;
        } else if (parse_sound_option(args, i, o.sound, error)) {
        } else {
            error = "unexpected " + a;
        }
    }
    if (list && error.empty()) return list_devices();
    if (o.sound.max_seconds > 0 && !(o.seconds > 0)) o.seconds = o.sound.max_seconds;
    if (error.empty() && o.out.empty()) error = "-o OUT.wav is needed";
    if (!error.empty()) {
        std::cerr << "ondrel record: " << error << "\n";
        record_usage(std::cerr);
        return kExitUsage;
    }
    return o.song.empty() ? record_input(o) : record_song(o);
}

}  // namespace ondrel
