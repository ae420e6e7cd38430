#include <cstdio>
#include <memory>

#include "shell/command_handlers.h"
#include "shell/program.h"
#include "shell/recovery_copy.h"
#include "shell/user_directories.h"

namespace ondrel {

namespace {
std::string song_label(const RecoveryCopy& copy) {
    return copy.original_path.empty() ? "a song never saved" : "\"" + copy.original_path + "\"";
}

void offer_copy(Program& p, std::shared_ptr<std::vector<RecoveryCopy>> copies, size_t i) {
    if (i >= copies->size()) return;
    const RecoveryCopy copy = (*copies)[i];
    const Alert question{
        "Recovery",
        "The program was ended with unsaved changes to " + song_label(copy) + ". Reopen them?",
        {"Reopen", "Discard"},
        0};  // Enter keeps the copy: discarding it cannot be undone
    p.alerts.ask(question, [&p, copies, i, copy](int button) {
        if (button == 0) {
            SongBank& bank = p.engine.bank;
            const int songs_before = bank.nbimod;
            // The first copy takes the empty song of the start; the others get songs of their own.
            const uint8_t multiple = bank.fmulload;
            if (i > 0) bank.fmulload = 1;
            const LoadResult r = reopen_recovery_copy(copy, bank, p.engine.slots);
            bank.fmulload = multiple;
            if (r.ok) {
                if (bank.nbimod > songs_before)
                    p.song_added();
                else
                    p.song_replaced(r.song);
                bank.select(r.song);
                p.history().mark_changed_outside_history();  // it differs from its file
                discard_recovery_copy(copy);
                p.say("Reopened the recovery copy of " + song_label(copy));
            } else {
                p.say("Cannot reopen " + copy.song_file + ": " + r.error);
            }
        } else {
            discard_recovery_copy(copy);
        }
        offer_copy(p, copies, i + 1);
    });
}
}  // namespace

void keep_recovery_copies(Program& p) {
    const std::string dir = state_directory();
    for (int song = 0; song < p.engine.bank.nbimod; ++song) {
        if (!p.song_dirty(song)) continue;
        std::string why;
        if (write_recovery_copy(dir, p.engine.bank, song, p.engine.slots, why))
            std::fprintf(stderr, "ondrel: unsaved changes kept in %s\n", dir.c_str());
        else
            std::fprintf(stderr, "ondrel: cannot keep unsaved changes: %s\n", why.c_str());
    }
}

void offer_recovery_copies(Program& p) {
    auto copies = std::make_shared<std::vector<RecoveryCopy>>(find_recovery_copies(state_directory()));
    offer_copy(p, copies, 0);
}

}  // namespace ondrel
