#include "cli/song_output_args.h"

#include <iostream>

#include "cli/cli_load.h"

namespace ondrel {

int parse_song_output_args(const Args& args, const char* command, const char* out_name,
                           void (*usage)(std::ostream&),
                           const std::function<bool(const std::string&)>& own_flag, SongOutputArgs& parsed) {
    std::string error;
    for (size_t i = 0; i < args.size() && error.empty(); ++i) {
        const std::string& a = args[i];
        if (a == "-h" || a == "--help") {
            usage(std::cout);
            return kExitOk;
        } else if (a == "-o" && i + 1 < args.size()) {
            parsed.out = args[++i];
        } else if (a == "--quiet") {
            parsed.quiet = true;
        } else if (own_flag && own_flag(a)) {
        } else if (parse_sound_option(args, i, parsed.sound, error)) {
        } else if (!a.empty() && a[0] != '-' && parsed.in.empty()) {
            parsed.in = a;
        } else {
            error = "unexpected " + a;
        }
    }
    if (error.empty() && (parsed.in.empty() || parsed.out.empty()))
        error = std::string("a song and -o ") + out_name + " are needed";
    if (error.empty()) return -1;
    std::cerr << "ondrel " << command << ": " << error << "\n";
    usage(std::cerr);
    return kExitUsage;
}

bool load_song_with_options(const SongOutputArgs& parsed, Engine& engine) {
    if (!load_for_cli(engine, parsed.in)) return false;
    apply_sound_options(parsed.sound, engine);
    return true;
}

}  // namespace ondrel
