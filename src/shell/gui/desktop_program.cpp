#include "shell/gui/desktop_program.h"

#include <csignal>
#include <cstdio>
#include <iostream>

#include "platform/sdl_audio_output.h"
#include "platform/sdl_capture.h"
#include "shell/command_handlers.h"
#include "shell/gui/gui_host.h"
#include "shell/gui/main_window.h"
#include "shell/program.h"
#include "shell/midi_settings.h"
#include "shell/recording_settings.h"
#include "shell/user_directories.h"

namespace ondrel {

namespace {

constexpr int kDeviceFrames = 512;  // about 12 ms: notes typed are heard at once
std::atomic<bool> g_interrupted{false};

extern "C" void on_quit_signal(int) {
    g_interrupted.store(true);
}

void catch_quit_signals() {
    struct sigaction action {};
    action.sa_handler = on_quit_signal;
    sigemptyset(&action.sa_mask);
    sigaction(SIGTERM, &action, nullptr);
    sigaction(SIGINT, &action, nullptr);
}

}  // namespace

int run_desktop(const std::vector<std::string>& files) {
    Program program;
    GuiHost host;
    std::string why;
    if (!host.open(why)) {
        std::cerr << "ondrel: " << why
                  << "; 'ondrel play FILE' and 'ondrel render FILE -o OUT.wav' work without one\n";
        return 2;
    }
    catch_quit_signals();
    program.recording.set_inputs(capture_device_names(), [](const std::string& device) {
        return std::make_unique<SdlCapture>(device);
    });
    read_recording_settings(program.recording, config_directory());
    SdlAudioOutput audio(program.engine.mixer, program.engine.player, program.engine.bank);
    if (!audio.open(kDeviceFrames, why)) {
        program.audio_status = "no sound device";
        std::cerr << "ondrel: " << why << "\n";
    }
    const MidiSettings midi = read_midi_settings(config_directory());
    program.midi.soundfont = midi.soundfont;
    program.midi.start_ports(midi.input);
    if (!program.midi.ports()->available())
        program.say("No MIDI ports: " + program.midi.ports()->unavailable_reason());
    else if (!midi.output.empty() && !program.midi.choose_output(midi.output, why))
        program.say(why);
    read_info_path(program.paths, config_directory());
    program.browser = std::make_unique<FileBrowser>(program.paths.browser_directory);
    program.on_quit = [&program] {
        program.engine.player.stoppi();
        program.paths.browser_directory = program.browser_directory();
        std::string failed;
        if (!write_info_path(program.paths, config_directory(), failed))
            std::cerr << "ondrel: " << failed << "\n";
        if (!write_recording_settings(program.recording, config_directory(), failed))
            std::cerr << "ondrel: " << failed << "\n";
        if (!write_midi_settings(program.midi, config_directory(), failed))
            std::cerr << "ondrel: " << failed << "\n";
    };
    offer_recovery_copies(program);
    if (!files.empty()) {
        ShellMessage open(fourcc("refs"));
        open.refs = files;
        program.post(std::move(open));
    }
    MainWindow window(program, host.renderer());
    host.run(program, window, g_interrupted);
    audio.close();
    return 0;
}

}  // namespace ondrel
