#pragma once
#include <array>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "render/reverb.h"
#include "render/reverb_dhs.h"
#include "song/effect_slots.h"
#include "song/song_bank.h"

namespace ondrel {

class EffectUnits;

// One undoable change: every object of a song it replaced, each entry holding the version
// that is not live. After the change is made the entries hold the old versions; after it
// is undone, the new ones. Undo and redo are therefore the same swap.
struct EditStep {
    std::string label;
    int song = 0;
    std::unique_ptr<TMOD> record;                      // null: the record is not part of it
    std::vector<std::pair<int, PatternRef>> patterns;  // local number, other version (null: none)
    std::vector<std::pair<int, SampleRef>> samples;    // local number, other version (null: none)
    std::optional<std::array<int16_t, kEffectSlots>> effect_types;
    // The settings of the two reverbs, which all songs share, and the units they belong to
    // (the engine's, which outlive every history).
    EffectUnits* units = nullptr;
    std::optional<ReverbSettings> reverb;
    std::optional<ReverbDHSSettings> reverb_dhs;

    bool empty() const {
        return !record && patterns.empty() && samples.empty() && !effect_types && !reverb && !reverb_dhs;
    }
    // Memory the step keeps alive, for the history's budget.
    size_t bytes() const;
};

// Exchanges the step's versions with the live ones of its song in one swap under the
// structure lock. Echo lines are grown first to hold both versions' delays, so the audio
// thread finds each delay's line ready whichever version it runs. The song's base indices are rewritten, so a
// record taken from a song that has since moved in the bank lands where the song is now. With merge_base, the
// step's record holds an edit of merge_base: only the bytes that differ from it are laid
// over the live record, inside the same swap, so what the sequencer wrote meanwhile stays.
void swap_with_live(EditStep& step, SongBank& bank, EffectSlots& slots, const TMOD* merge_base = nullptr);

}  // namespace ondrel
