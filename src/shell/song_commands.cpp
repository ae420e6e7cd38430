// The songs in memory: "Multiple Music Loading", "Kill current Music", "New Music" and the
// song menu.
#include "shell/command_handlers.h"
#include "shell/program.h"

namespace ondrel {

void cmd_multiple_loading(Program& p, const ShellMessage&) {
    p.engine.bank.fmulload = p.engine.bank.fmulload ? 0 : 1;
}

void cmd_kill_song(Program& p, const ShellMessage&) {
    p.unless_changes_lost([&p] {
        p.engine.player.stoppi();
        SongBank& bank = p.engine.bank;
        const int song = bank.noimod;
        const bool last = bank.nbimod <= 1;
        bank.killmusic();
        if (last)
            p.song_replaced(0);
        else
            p.song_removed(song);
        p.engine.player.tr.nopat = 0;
        p.engine.player.cursor.poscurv = 0;
        p.say("Kill current Music");
    });
}

void cmd_new_music(Program& p, const ShellMessage&) {
    SongBank& bank = p.engine.bank;
    p.engine.player.stoppi();
    if (!bank.newmusic()) return;  // the bank said "Can't create new music"
    bank.patcreate(bank.current().patbase, bank.current().nbtrack);
    bank.nbvoie = bank.current().nbtrack;
    p.song_added();
    p.engine.player.tr.nopat = 0;
    p.engine.player.cursor.poscurv = 0;
}

void cmd_select_song(Program& p, const ShellMessage& m) {
    const int song = static_cast<int>(m.code - fourcc("ZI00"));
    if (song < 0 || song >= p.engine.bank.nbimod || song == p.engine.bank.noimod) return;
    p.engine.player.stoppi();
    p.engine.bank.select(song);
    p.engine.player.tr.nopat = 0;
    p.engine.player.cursor.poscurv = 0;
}

}  // namespace ondrel
