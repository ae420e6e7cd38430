#include "edit/effect_edits.h"

#include <algorithm>

#include "render/effect_slot_rules.h"

namespace ondrel {

namespace {

constexpr int kEchoType = 11;

int type_of(const SongTransaction& t, int slot) {
    return slot > 0 && slot < kEffectSlots ? t.view_effect_types()[slot] : 0;
}

// The echo instance of slot, or -1 when slot holds no echo or one the song keeps no
// settings for.
int echo_of(const SongTransaction& t, int slot) {
    if (type_of(t, slot) != kEchoType) return -1;
    const int k = effect_instance(t.view_effect_types(), slot);
    return k < kEchoUnits ? k : -1;
}

template <class T>
bool write(T& field, int64_t value) {
    const T v = static_cast<T>(value);
    if (field == v) return false;
    field = v;
    return true;
}

int route(SongTransaction& t, int track, int slot) {
    if (slot < 0) return -1;
    TMOD& m = t.record();
    // Routing words of other banks (trackg) are not read by the mixer: bank 0 only.
    if (m.trackg[track] == 0) m.tracke[track] = static_cast<uint16_t>(slot);
    return slot;
}

}  // namespace

int clone_effect(SongTransaction& t, int slot) {
    if (const auto refusal = clone_refusal(slot)) {
        if (AlertSink* alerts = t.bank().alerts()) alerts->show(*refusal);
        return -1;
    }
    const int s = clone_destination(t.view_effect_types(), slot);
    if (s >= 0) t.effect_types()[s] = t.view_effect_types()[slot];
    return s;
}

bool remove_effect(SongTransaction& t, int slot) {
    if (const auto refusal = removal_refusal(slot)) {
        if (AlertSink* alerts = t.bank().alerts()) alerts->show(*refusal);
        return false;
    }
    if (type_of(t, slot) == 0) return false;
    remove_clone(t.effect_types(), t.record().tracke, slot);
    return true;
}

int mnplusefx(SongTransaction& t, int track) {
    if (track < 0 || track >= kTracks) return -1;
    return route(t, track, next_slot_up(t.view_effect_types(), t.record().tracke[track]));
}

int mnmoinsefx(SongTransaction& t, int track) {
    if (track < 0 || track >= kTracks) return -1;
    return route(t, track, next_slot_down(t.view_effect_types(), t.record().tracke[track]));
}

uint32_t echo_delay_frames(uint32_t ms) {
    return std::clamp<uint32_t>(ms, 1, kMaxEchoDelayMs) * 441 / 10;
}

uint32_t echo_delay_ms(uint32_t frames) {
    return static_cast<uint32_t>((uint64_t{frames} * 10 + 220) / 441);
}

uint32_t beat_frames(uint32_t tempo) {
    return static_cast<uint32_t>(std::clamp<uint64_t>(uint64_t{tempo} * 441 / 10000, 1, kMaxEchoFrames));
}

bool set_echo_delay_ms(SongTransaction& t, int slot, uint32_t ms) {
    const int k = echo_of(t, slot);
    return k >= 0 && write(t.record().echolen[k], echo_delay_frames(ms));
}

bool set_echo_delay_to_beat(SongTransaction& t, int slot) {
    const int k = echo_of(t, slot);
    return k >= 0 && write(t.record().echolen[k], beat_frames(t.record().tempo));
}

bool set_echo_feedback(SongTransaction& t, int slot, int feedback) {
    const int k = echo_of(t, slot);
    return k >= 0 && write(t.record().echolevel[k], std::clamp(feedback, 0, 128));
}

bool set_echo_invert(SongTransaction& t, int slot, bool on) {
    const int k = echo_of(t, slot);
    return k >= 0 && write(t.record().echoon[k], on ? 1 : 0);
}

bool set_auto_pan(SongTransaction& t, int slot, bool on) {
    return type_of(t, slot) != 0 && write(t.record().efxflag[slot], on ? 1 : 0);
}

bool set_auto_pan_speed(SongTransaction& t, int slot, int speed) {
    if (type_of(t, slot) == 0) return false;
    int16_t& step = t.record().efxc[slot];
    const int magnitude = std::clamp(speed, 0, 255);
    return write(step, step < 0 ? -magnitude : magnitude);
}

bool set_active_filter_frequency(SongTransaction& t, int slot, int hz) {
    return type_of(t, slot) == 5 && write(t.record().efxval[slot], std::clamp(hz, 10, 20000));
}

bool set_filter_q(SongTransaction& t, int slot, int q) {
    const int type = type_of(t, slot);
    return (type == 16 || type == 17) && write(t.record().efxd[slot], std::clamp(q, 1, 255));
}

}  // namespace ondrel
