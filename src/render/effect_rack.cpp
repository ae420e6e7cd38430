#include "render/effect_rack.h"

#include <algorithm>
#include <mutex>

#include "render/effect_slot_rules.h"

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

void EffectRack::route(int track, int slot) {
    TMOD& m = bank_.current();
    // Routing words of other banks (trackg) are not read by the mixer: bank 0 only.
    std::lock_guard<StructureLock> guard(bank_.structure_lock());
    if (m.trackg[track] == 0) m.tracke[track] = static_cast<uint16_t>(slot);
    player_.efxaffiche[track] = static_cast<int16_t>(slot);
}

int EffectRack::mnplusefx(int track) {
    if (track < 0 || track >= kTracks) return -1;
    const int s = next_slot_up(slots_.efxtype, routing()[track]);
    if (s >= 0) route(track, s);
    return s;
}

int EffectRack::mnmoinsefx(int track) {
    if (track < 0 || track >= kTracks) return -1;
    const int s = next_slot_down(slots_.efxtype, routing()[track]);
    if (s >= 0) route(track, s);
    return s;
}

int EffectRack::clone(int slot) {
    if (const auto refusal = clone_refusal(slot)) {
        if (AlertSink* alerts = bank_.alerts()) alerts->show(*refusal);
        return -1;
    }
    const int s = clone_destination(slots_.efxtype, slot);
    if (s < 0) return -1;
    std::lock_guard<StructureLock> guard(bank_.structure_lock());
    slots_.efxtype[s] = slots_.efxtype[slot];
    return s;
}

bool EffectRack::remove(int slot) {
    if (const auto refusal = removal_refusal(slot)) {
        if (AlertSink* alerts = bank_.alerts()) alerts->show(*refusal);
        return false;
    }
    if (slot >= kEffectSlots || !slots_.efxtype[slot]) return false;
    std::lock_guard<StructureLock> guard(bank_.structure_lock());
    const uint64_t unrouted = remove_clone(slots_.efxtype, bank_.current().tracke, slot);
    for (int t = 0; t < kTracks; ++t)
        if (unrouted >> t & 1) player_.efxaffiche[t] = 0;
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
    if (unit == 9) units_.secreverb.set_gain(field, thousandths);
}

void EffectRack::set_reverb_cutoff(int comb, int hz) {
    std::lock_guard<StructureLock> guard(bank_.structure_lock());
    units_.firstreverb.set_cutoff(comb, static_cast<float>(hz));
}

}  // namespace ondrel
