#include "edit/reverb_edits.h"

namespace ondrel {

namespace {
constexpr int kReverb = 10;
constexpr int kReverbDHS = 9;

template <class Settings, class Change>
bool change_settings(Settings& s, Change change) {
    const Settings before = s;
    change(s);
    return !(s == before);
}

// Applies change to the edit's copy of unit's settings; false for another unit or when
// the settings came out the same.
template <class Change>
bool change_reverb(SongTransaction& t, EffectUnits& units, int unit, Change change) {
    if (unit == kReverb) return change_settings(t.reverb(units), change);
    if (unit == kReverbDHS) return change_settings(t.reverb_dhs(units), change);
    return false;
}
}  // namespace

bool set_reverb_delay(SongTransaction& t, EffectUnits& units, int unit, int field, uint32_t microseconds) {
    return change_reverb(t, units, unit, [&](auto& s) { s.set_delay_us(field, microseconds); });
}

bool set_reverb_gain(SongTransaction& t, EffectUnits& units, int unit, int field, int thousandths) {
    return change_reverb(t, units, unit, [&](auto& s) { s.set_gain(field, thousandths); });
}

bool set_reverb_cutoff(SongTransaction& t, EffectUnits& units, int comb, int hz) {
    return change_settings(t.reverb(units),
                           [&](ReverbSettings& s) { s.set_cutoff(comb, static_cast<float>(hz)); });
}

uint32_t reverb_delay_shown(const EffectUnits& units, int unit, int field) {
    if (unit == kReverb && field >= 0 && field < ReverbSettings::kLines)
        return reverb_microseconds(units.firstreverb.settings().length[field]);
    if (unit != kReverbDHS) return 0;
    const ReverbDHSSettings& s = units.secreverb.settings();
    if (field >= 0 && field < ReverbDHSSettings::kCombs) return reverb_microseconds(s.length[field]);
    if (field == ReverbDHSSettings::kDelayField && s.delay_length) return reverb_microseconds(s.delay_length);
    return 0;
}

int reverb_gain_shown(const EffectUnits& units, int unit, int field) {
    if (unit == kReverb) return gain_thousandths(units.firstreverb.settings().gain(field));
    if (unit == kReverbDHS) return gain_thousandths(units.secreverb.settings().gain(field));
    return 0;
}

int reverb_cutoff_shown(const EffectUnits& units, int comb) {
    if (comb < 0 || comb >= ReverbSettings::kCombs) return 0;
    return static_cast<int>(units.firstreverb.settings().cutoff[comb]);
}

}  // namespace ondrel
