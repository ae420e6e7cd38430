#pragma once
#include <map>
#include <memory>
#include <optional>
#include <string>

#include "edit/edit_step.h"

namespace ondrel {

// One edit of the current song, made on copies: the first time an object is asked for, the
// live one is copied; commit() swaps every copy in at once and hands back the step that
// undoes it. The audio thread thus never sees a half-made edit, and playing on while the
// user edits is safe.
class SongTransaction {
public:
    SongTransaction(SongBank& bank, EffectSlots& slots, std::string label);
    SongTransaction(const SongTransaction&) = delete;
    SongTransaction& operator=(const SongTransaction&) = delete;

    SongBank& bank() { return bank_; }
    int song() const { return song_; }
    // The live record, for reading what the edit starts from.
    const TMOD& live() const { return *bank_.timod[song_]; }

    // The record to change. At commit only the bytes the edit changed are written over
    // the live record, so values the sequencer set meanwhile (speed, tempo...) are kept.
    TMOD& record();
    // The record as the edit leaves it so far (copy or live), for reading.
    const TMOD& view_record() const { return record_ ? *record_ : live(); }
    // The pattern with local number local, to change; null when the song has none there.
    Pattern* pattern(int local);
    // The pattern as the edit leaves it so far (copy or live), for reading; may be null.
    const Pattern* view_pattern(int local) const;
    // Puts a new pattern (or none) at local.
    void set_pattern(int local, PatternRef pattern);
    // The sample with local number local, to change (its data copied); null when empty.
    p_s* sample(int local);
    const p_s* view_sample(int local) const;
    void set_sample(int local, SampleRef sample);
    // The effect types of the slots (shared by all songs).
    std::array<int16_t, kEffectSlots>& effect_types();
    const std::array<int16_t, kEffectSlots>& view_effect_types() const;
    // The effect slots' memory, for reserving what a change needs before it is swapped in.
    EffectSlots& slots() { return slots_; }
    // The settings of units' two reverbs (shared by all songs), to change.
    ReverbSettings& reverb(EffectUnits& units);
    ReverbDHSSettings& reverb_dhs(EffectUnits& units);

    bool changed() const;
    // Swaps the changes in; the returned step undoes them (empty when nothing changed).
    EditStep commit();

private:
    bool reverbs_changed() const;

    SongBank& bank_;
    EffectSlots& slots_;
    std::string label_;
    int song_;
    std::unique_ptr<TMOD> original_, record_;
    std::map<int, PatternRef> patterns_;
    std::map<int, SampleRef> samples_;
    std::optional<std::array<int16_t, kEffectSlots>> effect_types_;
    EffectUnits* units_ = nullptr;
    std::optional<ReverbSettings> reverb_;
    std::optional<ReverbDHSSettings> reverb_dhs_;
};

}  // namespace ondrel
