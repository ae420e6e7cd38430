#pragma once
#include <string>
#include <vector>

#include "import/loader.h"
#include "song/effect_slots.h"
#include "song/song_bank.h"

namespace ondrel {

// Songs saved when the program was ended with unsaved changes and no one to ask (SIGTERM),
// kept in the state directory until a later start has offered them back. Call these from
// the window thread (after the signal handler has only raised a flag), never from a handler.

struct RecoveryCopy {
    std::string song_file;      // the saved song, native format: DIR/recovery-N.otm
    std::string original_path;  // the file the song came from; empty when it had none
};

// Saves song with its effect slots as a new copy in dir (created when missing), beside any
// copies already waiting there; the song's own path is left as it is. False with why set.
bool write_recovery_copy(const std::string& dir, const SongBank& bank, int song, const EffectSlots& slots,
                         std::string& why);

// The copies waiting in dir, oldest number first.
std::vector<RecoveryCopy> find_recovery_copies(const std::string& dir);

// Loads the copy the way a module is opened (into the current song, or a new one with
// "Multiple Music Loading") and gives the song back its original path, so saving goes where
// the user's song lives. The copy stays until discarded.
LoadResult reopen_recovery_copy(const RecoveryCopy& copy, SongBank& bank, EffectSlots& slots);

// Removes the copy (after it was reopened, or refused).
void discard_recovery_copy(const RecoveryCopy& copy);

}  // namespace ondrel
