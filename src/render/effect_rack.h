#pragma once
#include <array>
#include <string>
#include <utility>
#include <vector>

#include "playback/player.h"
#include "render/effect_units.h"
#include "song/alerts.h"
#include "song/effect_slots.h"
#include "song/song_bank.h"

namespace ondrel {

// The effect slots as the effect panel and the track buttons work them: the list of
// slots, routing a track up or down the slots, cloning and removing, and the settings of
// the unit shown. Runs on the window thread; changes the audio thread reads are made under
// the structure lock.
class EffectRack {
public:
    EffectRack(SongBank& bank, EffectSlots& slots, EffectUnits& units, Player& player);

    static constexpr const char* kListTitle = "Click here to select an EFX";
    // Slot numbers and labels of the effect list, basic units then clones.
    std::vector<std::pair<int, std::string>> list() const;
    std::string label(int slot) const;

    // Routes the track to the next slot with a unit above (wrapping 99 to 1) or below it.
    int mnplusefx(int track);
    int mnmoinsefx(int track);
    // "Clone efx" and "Remove efx" on a slot: the new slot, or -1 (with the alert when refused).
    int clone(int slot);
    bool remove(int slot);

    void affsousefx(int slot) { shown_ = slot; }
    int shown() const { return shown_; }
    // Stores value as the feedback of the echo instance of the slot shown.
    void aff_echo(int value);
    void delefx();

    // Reverb panels: unit 10 (Reverb) or 9 (Reverb DHS).
    void set_reverb_delay(int unit, int field, uint32_t microseconds);
    void set_reverb_gain(int unit, int field, int thousandths);
    void set_reverb_cutoff(int comb, int hz);

private:
    std::array<uint16_t, kTracks> routing();
    void route(int track, int slot);

    SongBank& bank_;
    EffectSlots& slots_;
    EffectUnits& units_;
    Player& player_;
    int shown_ = 0;
};

const char* basic_effect_label(int type);

}  // namespace ondrel
