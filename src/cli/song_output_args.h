#pragma once
#include <functional>
#include <iosfwd>
#include <string>

#include "cli/commands.h"
#include "cli/sound_options.h"

namespace ondrel {

// The command line of a command that turns a song into a file: FILE -o OUT, --quiet, the
// sound options, and flags of the command's own.
struct SongOutputArgs {
    std::string in, out;
    bool quiet = false;
    SoundOptions sound;
};

// Parses args; own_flag takes a flag of the command's own and says whether it did.
// Returns -1 to go on, or the exit code when help was shown (kExitOk) or the command line
// was wrong (kExitUsage, said on stderr with the usage).
int parse_song_output_args(const Args& args, const char* command, const char* out_name,
                           void (*usage)(std::ostream&),
                           const std::function<bool(const std::string&)>& own_flag, SongOutputArgs& parsed);

// Loads the song into the engine with the sound options; false (said on stderr) when the
// song cannot be read.
bool load_song_with_options(const SongOutputArgs& parsed, Engine& engine);

}  // namespace ondrel
