#include <cstdio>
#include <iostream>

#include "cli/cli_load.h"
#include "cli/commands.h"
#include "cli/song_report.h"
#include "engine/engine.h"
#include "export/otm_writer.h"

namespace ondrel {

int cmd_info(const Args& args) {
    bool json = false;
    std::string path;
    for (const auto& a : args) {
        if (a == "--json") {
            json = true;
        } else if (a == "-h" || a == "--help") {
            std::cout << "usage: ondrel info [--json] FILE\n"
                         "Prints a module: title, tempo and speed, sequence, patterns, samples\n"
                         "and effect settings. With --json, one JSON object for scripts.\n";
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
    Engine engine;
    if (!load_for_cli(engine, path)) return kExitFailed;
    const int song = engine.bank.noimod;
    std::cout << (json ? song_json(engine.bank, song) : song_text(engine.bank, song, engine.slots));
    return kExitOk;
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
    std::string why;
    if (!save_otm(out, engine.bank, engine.bank.noimod, engine.slots, why)) {
        std::cerr << "ondrel: " << why << "\n";
        return kExitFailed;
    }
    return kExitOk;
}

}  // namespace ondrel
