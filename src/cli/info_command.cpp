#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <iostream>

#include "cli/cli_load.h"
#include "cli/commands.h"
#include "cli/song_report.h"
#include "engine/engine.h"
#include "import/loader.h"
#include "import/sound_reader.h"
#include "platform/mime_type.h"

namespace ondrel {

namespace {

// The sample record a sound file would become.
int sound_info(const std::string& path, bool json) {
    std::vector<uint8_t> bytes;
    std::string why;
    if (!read_file(path, bytes, why)) {
        std::cerr << "ondrel: " << why << "\n";
        return kExitFailed;
    }
    ByteReader file(bytes);
    SampleRef sample;
    const SoundKind kind = sound_kind(path, mime_type_of(path));
    if (!read_sound(file, kind, path, std::filesystem::path(path).filename().string(), sample, why)) {
        std::cerr << "ondrel: " << path << ": " << why << "\n";
        return kExitFailed;
    }
    std::cout << (json ? sample_json(*sample, 1) : sample_text(*sample));
    return kExitOk;
}

}  // namespace

int cmd_info(const Args& args) {
    bool json = false;
    std::string path;
    for (const auto& a : args) {
        if (a == "--json") {
            json = true;
        } else if (a == "-h" || a == "--help") {
            std::cout << "usage: ondrel info [--json] FILE\n"
                         "Prints a module: title, tempo and speed, sequence, patterns, samples\n"
                         "and effect settings; or, for a sound file (WAV, AIFF, AVR), the sample\n"
                         "record it becomes. With --json, one JSON object for scripts.\n";
            return kExitOk;
        } else if (!a.empty() && a[0] == '-') {
            std::cerr << "ondrel info: unknown option " << a << "\n";
            return kExitUsage;
        } else if (path.empty()) {
            path = a;
        } else {
            std::cerr << "ondrel info: one file at a time\n";
            return kExitUsage;
        }
    }
    if (path.empty()) {
        std::cerr << "usage: ondrel info [--json] FILE\n";
        return kExitUsage;
    }
    if (std::filesystem::exists(path) && classify(path) == FileClass::Sound) return sound_info(path, json);
    Engine engine;
    if (!load_for_cli(engine, path)) return kExitFailed;
    const int song = engine.bank.noimod;
    std::cout << (json ? song_json(engine.bank, song) : song_text(engine.bank, song, engine.slots));
    return kExitOk;
}

int cmd_set_sound(const Args& args) {
    std::vector<std::string> positional;
    std::string out;
    for (size_t i = 0; i < args.size(); ++i) {
        if (args[i] == "-o" && i + 1 < args.size()) {
            out = args[++i];
        } else if (args[i] == "-h" || args[i] == "--help") {
            std::cout << "usage: ondrel set-sound SONG SLOT SOUND -o OUT.otm\n"
                         "Puts a sound file (WAV, AIFF, AVR) into instrument slot SLOT (1 to 128)\n"
                         "of the song and saves the song as an Ondrel Tracker Module.\n";
            return kExitOk;
        } else if (!args[i].empty() && args[i][0] != '-') {
            positional.push_back(args[i]);
        } else {
            std::cerr << "ondrel set-sound: unexpected " << args[i] << "\n";
            return kExitUsage;
        }
    }
    char* end = nullptr;
    const long slot = positional.size() == 3 ? std::strtol(positional[1].c_str(), &end, 10) : 0;
    if (positional.size() != 3 || out.empty() || *end || slot < 1 || slot > kSamplesPerSong) {
        std::cerr << "usage: ondrel set-sound SONG SLOT SOUND -o OUT.otm (SLOT from 1 to 128)\n";
        return kExitUsage;
    }
    Engine engine;
    if (!load_for_cli(engine, positional[0])) return kExitFailed;
    const std::string& sound = positional[2];
    if (!std::filesystem::exists(sound) || classify(sound) != FileClass::Sound) {
        std::cerr << "ondrel: " << sound << ": I don't use this file\n";
        return kExitFailed;
    }
    const LoadResult r = loadsnd(sound, mime_type_of(sound), engine.bank, static_cast<int>(slot) - 1);
    if (!r.ok) {
        std::cerr << "ondrel: " << r.error << "\n";
        return kExitFailed;
    }
    return save_song_for_cli(engine, out);
}

int cmd_convert(const Args& args) {
    std::string in, out;
    for (size_t i = 0; i < args.size(); ++i) {
        if (args[i] == "-o" && i + 1 < args.size()) {
            out = args[++i];
        } else if (args[i] == "-h" || args[i] == "--help") {
            std::cout << "usage: ondrel convert FILE -o OUT.otm\n"
                         "Loads any module the program reads and saves it as an Ondrel Tracker\n"
                         "Module. OUT is replaced only once the new file is complete.\n";
            return kExitOk;
        } else if (in.empty() && (args[i].empty() || args[i][0] != '-')) {
            in = args[i];
        } else {
            std::cerr << "ondrel convert: unexpected " << args[i] << "\n";
            return kExitUsage;
        }
    }
    if (in.empty() || out.empty()) {
        std::cerr << "usage: ondrel convert FILE -o OUT.otm\n";
        return kExitUsage;
    }
    Engine engine;
    if (!load_for_cli(engine, in)) return kExitFailed;
    return save_song_for_cli(engine, out);
}

}  // namespace ondrel
