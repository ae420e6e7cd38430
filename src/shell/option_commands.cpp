// The "Options" menu: timing, pan mode, sound quality, meters, chord entry, keyboards.
#include <mutex>

#include "shell/command_handlers.h"
#include "shell/program.h"

namespace ondrel {

namespace {
template <typename T>
void toggle(std::atomic<T>& flag) {
    flag.store(flag.load() ? 0 : 1);
}
}  // namespace

void cmd_tempo_option(Program& p, const ShellMessage&) {
    toggle(p.engine.mixer.ftemp);
}

void cmd_pan_mode(Program& p, const ShellMessage& m) {
    SongBank& bank = p.engine.bank;
    // The mixer reads the mode every buffer: change it between two.
    std::lock_guard<StructureLock> guard(bank.structure_lock());
    TMOD& song = bank.current();
    if (m.code == fourcc("Mfil")) song.mode = song.format;
    if (m.code == fourcc("Mami")) song.mode = 1;
    if (m.code == fourcc("Mpan")) song.mode = 2;
    if (m.code == fourcc("Mler")) song.mode = 3;
}

void cmd_sound_quality(Program& p, const ShellMessage& m) {
    p.engine.mixer.qual = m.code == fourcc("Mint") ? 1 : 0;
}

void cmd_full_screen(Program& p, const ShellMessage&) {
    p.windows.full_screen = !p.windows.full_screen;
}

void cmd_vumeter(Program& p, const ShellMessage&) {
    toggle(p.engine.player.tr.fvuvu);
}

void cmd_chord_entry(Program& p, const ShellMessage&) {
    toggle(p.engine.player.tr.faccedit);
}

void cmd_keyboard_layout(Program& p, const ShellMessage& m) {
    p.editor.layout = m.code == fourcc("ATRI") ? KeyboardLayout::Atari : KeyboardLayout::Amiga;
}

}  // namespace ondrel
