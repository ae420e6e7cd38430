// The file browser's menus: the views, "Find all audio files", "Refresh", and the paths
// menu with its favourite directories.
#include "import/sound_reader.h"
#include "platform/mime_type.h"
#include "shell/command_handlers.h"
#include "shell/program.h"

namespace ondrel {

void cmd_browser_menu(Program& p, const ShellMessage& m) {
    if (p.browser) p.browser->handle(m.code);
}

void cmd_browser_go(Program& p, const ShellMessage& m) {
    if (!p.browser || m.refs.empty()) return;
    if (!p.browser->open_directory(m.refs.front())) p.say("Cannot read " + m.refs.front());
}

void cmd_preview_sound(Program& p, const ShellMessage& m) {
    StructureLock& lock = p.engine.bank.structure_lock();
    if (m.refs.empty()) {
        p.engine.preview.stop(lock);
        return;
    }
    SampleRef sound;
    std::string why;
    if (!read_sound_file(m.refs.front(), mime_type_of(m.refs.front()), sound, why)) {
        p.say(why);
        return;
    }
    p.engine.preview.play(std::move(sound), 0, 0, lock);
}

void cmd_paths_item(Program& p, const ShellMessage& m) {
    // A fixed item is known by its own code; a directory item by its index in the menu.
    const int64_t fixed = static_cast<int64_t>(m.code - fourcc("GO00"));
    const auto index = static_cast<size_t>(m.get("index", fixed));
    p.paths.browser_directory = p.browser_directory();
    switch (p.paths.choose(index)) {
        case PathsChoice::AddedDirectory:
            p.say("Added " + p.paths.browser_directory + " to the paths");
            break;
        case PathsChoice::RemovedDirectory:
            p.say("Removed " + p.paths.browser_directory + " from the paths");
            break;
        case PathsChoice::OpenedDirectory:
            if (p.browser) p.browser->open_directory(p.paths.browser_directory);
            break;
        case PathsChoice::MissingDirectory: p.say(p.paths.menu[index].label + " is no longer there"); break;
        case PathsChoice::Nothing: break;
    }
}

}  // namespace ondrel
