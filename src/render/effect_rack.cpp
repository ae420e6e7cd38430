#include "render/effect_rack.h"

#include <algorithm>
#include <mutex>

namespace ondrel {

const char* basic_effect_label(int type) {
    switch (type) {
        case 1: return "(01) Low Pass Filter (FIR)";
        case 2: return "(02) Low Pass Filter (IIR type 1)";
        case 3: return "(03) High Pass Filter (FIR)";
        case 5: return "(05) Active Filter";
        case 9: return "(09) Reverb DHS";
        case 10: return "(10) Reverb";
        case 11: return "(11) Echo, Delay";
        case 12: return "(12) Stereo space";
        case 16: return "(16) Low Pass Filter (IIR type 2)";
        case 17: return "(17) High Pass Filter (IIR type 2)";
        default: return nullptr;
    }
}

EffectRack::EffectRack(SongBank& bank, EffectSlots& slots, EffectUnits& units, Player& player)
    : bank_(bank), slots_(slots), units_(units), player_(player) {}

std::string EffectRack::label(int slot) const {
    if (slot < 0 || slot >= kEffectSlots || !slots_.efxtype[slot]) return "";
    if (slot < kFirstClonedSlot) {
        const char* basic = basic_effect_label(slots_.efxtype[slot]);
        return basic ? basic : "";
    }
    return added_effect_label(slot, slots_.efxtype[slot]);
}

std::vector<std::pair<int, std::string>> EffectRack::list() const {
    std::vector<std::pair<int, std::string>> out;
    for (int s = 1; s < kEffectSlots; ++s)
        if (slots_.efxtype[s]) out.emplace_back(s, label(s));
    return out;
}

std::array<uint16_t, kTracks> EffectRack::routing() {
    // Command 33 rewrites the routing while a song plays: read it between buffers.
    std::lock_guard<StructureLock> guard(bank_.structure_lock());
    std::array<uint16_t, kTracks> words{};
    std::copy(std::begin(bank_.current().tracke), std::end(bank_.current().tracke), words.begin());
    return words;
}

bool EffectRack::checkbufferefx(int track, int slot) {
    const std::array<uint16_t, kTracks> tracke = routing();
    std::array<bool, kEffectSlots> seen{};
    int count = 0;
    for (int t = 0; t < kTracks; ++t) {
        const int s = t == track ? slot : tracke[t];
        if (s > 0 && s < kEffectSlots && !seen[s]) {
            seen[s] = true;
            ++count;
        }
    }
    return slots_.reserve_send_buffers(count);
}

void EffectRack::route(int track, int slot) {
    TMOD& m = bank_.current();
    // Routing words of other banks (trackg) are not read by the mixer: bank 0 only.
    if (!checkbufferefx(track, slot)) return;
    std::lock_guard<StructureLock> guard(bank_.structure_lock());
    if (m.trackg[track] == 0) m.tracke[track] = static_cast<uint16_t>(slot);
    player_.efxaffiche[track] = static_cast<int16_t>(slot);
}

int EffectRack::mnplusefx(int track) {
    if (track < 0 || track >= kTracks) return -1;
    int s = routing()[track];
    for (int tries = 0; tries < kEffectSlots; ++tries) {
        s = s >= 99 ? 1 : s + 1;
        if (slots_.efxtype[s]) {
            route(track, s);
            return s;
        }
    }
    return -1;
}

int EffectRack::mnmoinsefx(int track) {
    if (track < 0 || track >= kTracks) return -1;
    int s = routing()[track] - 1;
    if (s < 0) s = 99;
    // From slot 0 the walk goes on at 98: slot 99 is reached only by starting there.
    for (int tries = 0; tries < 2 * kEffectSlots && !slots_.efxtype[s]; ++tries) s = s == 0 ? 98 : s - 1;
    if (!slots_.efxtype[s]) return -1;
    route(track, s);
    return s;
}

int EffectRack::echo_clones() const {
    int n = 0;
    for (int s = kFirstClonedSlot; s < kEffectSlots; ++s) n += slots_.efxtype[s] == 11;
    return n;
}

int EffectRack::clone(int slot) {
    AlertSink* alerts = bank_.alerts();
    if (slot == 12) {
        if (alerts) alerts->show({"title", "You don't need to clone Efx 12", {"ok !!"}});
        return -1;
    }
    if (slot == 5 || slot == 10) {
        if (alerts) alerts->show({"title", "You can't clone these Efx", {"why ?"}});
        return -1;
    }
    if (slot <= 0 || slot >= kEffectSlots || !slots_.efxtype[slot]) return -1;
    const int16_t type = slots_.efxtype[slot];
    // The song keeps the settings of 16 echo instances.
    if (type == 11 && echo_clones() >= kEchoUnits - 1) return -1;
    for (int s = kFirstClonedSlot; s < kEffectSlots; ++s) {
        if (slots_.efxtype[s]) continue;
        std::lock_guard<StructureLock> guard(bank_.structure_lock());
        slots_.efxtype[s] = type;
        return s;
    }
    return -1;
}

bool EffectRack::remove(int slot) {
    if (slot < kFirstClonedSlot) {
        if (AlertSink* alerts = bank_.alerts())
            alerts->show({"title", "You can't remove a basic Efx, only cloned efx !!", {"ah ah !"}});
        return false;
    }
    if (slot >= kEffectSlots || !slots_.efxtype[slot]) return false;
    TMOD& m = bank_.current();
    std::lock_guard<StructureLock> guard(bank_.structure_lock());
    slots_.efxtype[slot] = 0;
    // Tracks that were routed to it go back to their dry sound.
    for (int t = 0; t < kTracks; ++t)
        if (m.tracke[t] == slot) {
            m.tracke[t] = 0;
            player_.efxaffiche[t] = 0;
        }
    return true;
}

void EffectRack::aff_echo(int value) {
    if (shown_ <= 0 || shown_ >= kEffectSlots || slots_.efxtype[shown_] != 11) return;
    const int k = units_.instance_of(shown_);
    std::lock_guard<StructureLock> guard(bank_.structure_lock());
    if (k < kEchoUnits) bank_.current().echolevel[k] = static_cast<uint32_t>(value < 0 ? 0 : value);
}

void EffectRack::delefx() {
    std::lock_guard<StructureLock> guard(bank_.structure_lock());
    units_.delefx();
}

void EffectRack::set_reverb_delay(int unit, int field, uint32_t microseconds) {
    std::lock_guard<StructureLock> guard(bank_.structure_lock());
    if (unit == 10) units_.firstreverb.set_delay_us(field, microseconds);
    if (unit == 9) units_.secreverb.set_delay_us(field, microseconds);
}

void EffectRack::set_reverb_gain(int unit, int field, int thousandths) {
    std::lock_guard<StructureLock> guard(bank_.structure_lock());
    if (unit == 10) units_.firstreverb.set_gain(field, thousandths);
    if (unit == 9) {
        if (field < ReverbDHS::kCombs)
            units_.secreverb.set_feedback(field, thousandths);
        else if (field < 2 * ReverbDHS::kCombs)
            units_.secreverb.set_tap(field - ReverbDHS::kCombs, thousandths);
        else
            units_.secreverb.set_output_gain(thousandths);
    }
}

void EffectRack::set_reverb_cutoff(int comb, int hz) {
    std::lock_guard<StructureLock> guard(bank_.structure_lock());
    units_.firstreverb.set_cutoff(comb, static_cast<float>(hz));
}

}  // namespace ondrel
