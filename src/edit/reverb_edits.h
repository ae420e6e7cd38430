#pragma once
#include <cstdint>

#include "edit/song_transaction.h"
#include "render/effect_units.h"

namespace ondrel {

// The two reverb panels as undoable edits of the shared units: unit 10 is the Reverb,
// unit 9 the Reverb DHS; field numbers as in ReverbSettings and ReverbDHSSettings. A delay
// is typed in microseconds ("Delay (µs)", "First Delay (µs)": frames = us x 441 / 10000,
// at least 4, at most 11049 for the Reverb's lines 0..5, 44099 for its line 6 and for the
// DHS output delay, 16383 for the DHS combs); a gain in thousandths ("Gain1 ()", "Gain2 ()",
// "Gain ()"); a Reverb comb cutoff in Hz ("Lpf (Hz)", 10..11050). The units use a new value
// from their next buffer on; their lines are not cleared. False when nothing changed.
bool set_reverb_delay(SongTransaction& t, EffectUnits& units, int unit, int field, uint32_t microseconds);
bool set_reverb_gain(SongTransaction& t, EffectUnits& units, int unit, int field, int thousandths);
bool set_reverb_cutoff(SongTransaction& t, EffectUnits& units, int comb, int hz);

// What the panels show: a delay as the fewest microseconds that give its frames (0 for a
// DHS output delay that is off), a gain as thousandths truncated, a cutoff in whole Hz.
uint32_t reverb_delay_shown(const EffectUnits& units, int unit, int field);
int reverb_gain_shown(const EffectUnits& units, int unit, int field);
int reverb_cutoff_shown(const EffectUnits& units, int comb);

}  // namespace ondrel
