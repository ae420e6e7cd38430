#include "render/effect_slot_rules.h"

#include "song/effect_slots.h"

namespace ondrel {

namespace {
constexpr int kEchoType = 11;
}

std::optional<Alert> clone_refusal(int slot) {
    if (slot == 12) return Alert{"title", "You don't need to clone Efx 12", {"ok !!"}};
    if (slot == 5 || slot == 10) return Alert{"title", "You can't clone these Efx", {"why ?"}};
    return std::nullopt;
}

int clone_destination(const EffectTypes& efxtype, int slot) {
    if (slot <= 0 || slot >= kEffectSlots || !efxtype[slot]) return -1;
    if (efxtype[slot] == kEchoType) {
        int clones = 0;
        for (int s = kFirstClonedSlot; s < kEffectSlots; ++s) clones += efxtype[s] == kEchoType;
        if (clones >= kEchoUnits - 1) return -1;
    }
    for (int s = kFirstClonedSlot; s < kEffectSlots; ++s)
        if (!efxtype[s]) return s;
    return -1;
}

std::optional<Alert> removal_refusal(int slot) {
    if (slot < kFirstClonedSlot)
        return Alert{"title", "You can't remove a basic Efx, only cloned efx !!", {"ah ah !"}};
    return std::nullopt;
}

uint64_t remove_clone(EffectTypes& efxtype, uint16_t (&tracke)[kTracks], int slot) {
    if (slot < kFirstClonedSlot || slot >= kEffectSlots || !efxtype[slot]) return 0;
    efxtype[slot] = 0;
    uint64_t unrouted = 0;
    for (int t = 0; t < kTracks; ++t)
        if (tracke[t] == slot) {
            tracke[t] = 0;
            unrouted |= uint64_t{1} << t;
        }
    return unrouted;
}

int next_slot_up(const EffectTypes& efxtype, int current) {
    int s = current;
    for (int tries = 0; tries < kEffectSlots; ++tries) {
        s = s >= 99 || s < 0 ? 1 : s + 1;
        if (efxtype[s]) return s;
    }
    return -1;
}

int next_slot_down(const EffectTypes& efxtype, int current) {
    int s = current - 1;
    if (s < 0 || s >= kEffectSlots) s = 99;
    for (int tries = 0; tries < 2 * kEffectSlots && !efxtype[s]; ++tries) s = s == 0 ? 98 : s - 1;
    return efxtype[s] ? s : -1;
}

int effect_instance(const EffectTypes& efxtype, int slot) {
    if (slot < kFirstClonedSlot || slot >= kEffectSlots) return 0;
    int k = 0;
    for (int s = kFirstClonedSlot; s <= slot; ++s) k += efxtype[s] == efxtype[slot];
    return k;
}

}  // namespace ondrel
