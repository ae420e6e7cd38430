#include <cstring>
#include <filesystem>
#include <iostream>

#include "cli/commands.h"
#include "shell/gui/desktop_program.h"

namespace {

struct Command {
    const char* name;
    const char* summary;
    int (*run)(const ondrel::Args&);
};

const Command kCommands[] = {
    {"play", "play FILE [OPTIONS]     play a song on the sound card, with a status line", ondrel::cmd_play},
    {"render", "render FILE -o OUT     render a song to a WAV file, faster than real time",
     ondrel::cmd_render},
    {"export-midi", "export-midi FILE -o OUT.mid   write what the sequencer plays as a standard MIDI file",
     ondrel::cmd_export_midi},
    {"record", "record -o OUT.wav      record the sound input, or with --song SONG a song's own output",
     ondrel::cmd_record},
    {"spectrogram", "spectrogram FILE -o OUT.png   draw the analyser's Radar view of a whole song",
     ondrel::cmd_spectrogram},
    {"info", "info [--json] FILE     show a module (tempo, sequence, patterns, samples) or a sound",
     ondrel::cmd_info},
    {"convert", "convert FILE -o OUT    save any module the program reads as a .otm module",
     ondrel::cmd_convert},
    {"set-sound", "set-sound SONG SLOT SOUND -o OUT   put a WAV/AIFF/AVR sound into a song's slot",
     ondrel::cmd_set_sound},
    {"edit-sound",
     "edit-sound SONG SLOT OP [--from F --to T] -o OUT   fade, normalize, reverse or invert a sound",
     ondrel::cmd_edit_sound},
};

void usage(std::ostream& out) {
    out << "Ondrel Tracker " ONDREL_VERSION
           "\n\n"
           "usage: ondrel [FILE...]            the desktop program, opening the files given\n"
           "       ondrel COMMAND [OPTIONS] FILE\n\n"
           "commands:\n";
    for (const auto& c : kCommands) out << "  " << c.summary << "\n";
    out << "\n'ondrel COMMAND --help' tells more about one command.\n"
           "Exit status: 0 done, 1 a file could not be read or written, 2 the command line was\n"
           "wrong, 3 no sound device could be opened.\n";
}

}  // namespace

int main(int argc, char** argv) {
    if (argc < 2) return ondrel::run_desktop({});
    const std::string first = argv[1];
    if (first == "-h" || first == "--help" || first == "help") {
        usage(std::cout);
        return ondrel::kExitOk;
    }
    if (first == "--version") {
        std::cout << "ondrel " ONDREL_VERSION "\n";
        return ondrel::kExitOk;
    }
    for (const auto& c : kCommands)
        if (first == c.name) return c.run(ondrel::Args(argv + 2, argv + argc));
    // Anything else that names a file: open it (and those after it) in the desktop program.
    std::error_code ec;
    if (std::filesystem::exists(first, ec) || first.find('/') != std::string::npos ||
        first.find('.') != std::string::npos)
        return ondrel::run_desktop(std::vector<std::string>(argv + 1, argv + argc));
    std::cerr << "ondrel: unknown command '" << first << "'\n\n";
    usage(std::cerr);
    return ondrel::kExitUsage;
}
