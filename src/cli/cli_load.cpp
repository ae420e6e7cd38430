#include "cli/cli_load.h"

#include <unistd.h>

#include <filesystem>
#include <iostream>

#include "cli/commands.h"
#include "export/otm_writer.h"
#include "import/loader.h"
#include "import/sound_reader.h"
#include "platform/mime_type.h"

namespace ondrel {

FileClass classify(const std::string& path) {
    switch (returntype(path, mime_type_of(path))) {
        case kSoundFile: return FileClass::Sound;
        case kModuleFile: return FileClass::Song;
        default: return FileClass::Other;
    }
}

int save_song_for_cli(Engine& engine, const std::string& path) {
    std::string why;
    if (save_otm(path, engine.bank, engine.bank.noimod, engine.slots, why)) return kExitOk;
    std::cerr << "ondrel: " << why << "\n";
    return kExitFailed;
}

bool load_for_cli(Engine& engine, const std::string& path) {
    if (!std::filesystem::exists(path)) {
        std::cerr << "ondrel: cannot open " << path << ": No such file or directory\n";
        return false;
    }
    const FileClass kind = classify(path);
    if (kind == FileClass::Sound) {
        std::cerr << "ondrel: " << path << " is a sound, not a song (see 'ondrel set-sound')\n";
        return false;
    }
    if (kind == FileClass::Other) {
        std::cerr << "ondrel: " << path << ": I don't use this file\n";
        return false;
    }
    const LoadResult r = load(path, engine.bank, engine.slots);
    if (!r.ok) {
        std::cerr << "ondrel: " << r.error << "\n";
        return false;
    }
    if (r.truncated) std::cerr << "ondrel: warning: " << path << " ends early; what was read is kept\n";
    for (const auto& note : r.notes) std::cerr << "ondrel: " << path << ": " << note << "\n";
    return true;
}

bool is_terminal(int fd) {
    return ::isatty(fd) == 1;
}

}  // namespace ondrel
