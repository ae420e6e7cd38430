#pragma once
#include <array>
#include <cstdint>
#include <optional>

#include "song/alerts.h"
#include "song/tmod.h"

namespace ondrel {

// The rules of the effect panel and the track buttons, on any copy of the slot types and
// routing words: the live ones (EffectRack) or an edit's (the undoable effect edits).
using EffectTypes = std::array<int16_t, kEffectSlots>;

// The alert "Clone efx" shows for slot, none when it may clone.
std::optional<Alert> clone_refusal(int slot);
// Where a clone of slot goes: the first free slot from 20 up; -1 when slot holds no unit,
// no slot is free, or slot is an echo and 15 echo clones exist already (the song keeps
// the settings of 16 echo instances), which is refused without a message.
int clone_destination(const EffectTypes& efxtype, int slot);
// The alert "Remove efx" shows for slot, none when it may remove.
std::optional<Alert> removal_refusal(int slot);
// Takes the clone in slot out and sends the tracks routed to it back to their dry sound;
// a bit per such track. Nothing for a slot without a clone.
uint64_t remove_clone(EffectTypes& efxtype, uint16_t (&tracke)[kTracks], int slot);

// The routing buttons: the next slot with a unit above current, wrapping from 99 to 1
// (slot 0 is never chosen so); below it, where from slot 0 the walk goes on at 98, so that
// slot 99 is reached only when the walk starts there. -1 when no slot has a unit.
int next_slot_up(const EffectTypes& efxtype, int current);
int next_slot_down(const EffectTypes& efxtype, int current);

// The instance of a slot's unit (echo line, stereo-space line): 0 for the basic slot, then
// 1, 2... for the clones of the same type in slot order.
int effect_instance(const EffectTypes& efxtype, int slot);

}  // namespace ondrel
