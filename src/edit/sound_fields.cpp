#include "edit/sound_fields.h"

#include <algorithm>
#include <bit>

#include "edit/sound_frames.h"
#include "playback/envelope.h"

namespace ondrel {

namespace {

template <class Field>
bool set_field(SongTransaction& t, int slot, Field p_s::*field, int64_t value, int64_t low, int64_t high) {
    return change_header(t, slot,
                         [&](p_s& s) { s.*field = static_cast<Field>(std::clamp(value, low, high)); });
}

}  // namespace

bool set_sound_name(SongTransaction& t, int slot, const std::string& name) {
    return change_header(t, slot, [&](p_s& s) { set_sample_name(s, name.c_str(), name.size()); });
}

bool set_sound_volume(SongTransaction& t, int slot, int volume) {
    return set_field(t, slot, &p_s::volume, volume, 0, 128);
}

bool set_sound_finetune(SongTransaction& t, int slot, int finetune) {
    return set_field(t, slot, &p_s::finetune, finetune, 0, 15);
}

bool set_sound_refnote(SongTransaction& t, int slot, int note) {
    return set_field(t, slot, &p_s::refnote, note, 0, 127);
}

bool set_sound_rate(SongTransaction& t, int slot, uint32_t rate) {
    return set_field(t, slot, &p_s::rate, rate, 1, 65535);
}

bool set_sound_loop(SongTransaction& t, int slot, bool on, uint32_t start, uint32_t end) {
    const p_s* view = t.view_sample(slot);
    if (!view || start >= end || end > sound_frames(view)) return false;
    return change_header(t, slot, [&](p_s& s) {
        const int shift = std::countr_zero(frame_bytes(s));
        s.loopon = on ? 1 : 0;
        s.loopstart = start << shift;
        s.loopend = end << shift;
    });
}

bool set_envelope_point(SongTransaction& t, int slot, int kind, int point, int x, int level) {
    if (kind < 0 || kind >= kEnvelopeKinds || point < 0 || point >= kEnvelopePoints) return false;
    return change_header(t, slot, [&](p_s& s) {
        int at = s.env(kind, point) >> 8;
        if (point > 0) {
            const int before = point > 1 ? s.env(kind, point - 1) >> 8 : 0;
            const int after = point < kEnvelopePoints - 1 ? s.env(kind, point + 1) >> 8 : 255;
            at = std::clamp(x, before, std::max(before, after));
        }
        s.env(kind, point) = static_cast<uint16_t>(at << 8 | std::clamp(level, 0, 255));
    });
}

bool set_envelope_enabled(SongTransaction& t, int slot, int kind, bool on) {
    if (kind < 0 || kind >= kEnvelopeKinds) return false;
    return change_header(t, slot, [&](p_s& s) {
        const auto bit = static_cast<uint16_t>(1u << kind);
        s.flagword = static_cast<uint16_t>(on ? s.flagword | bit : s.flagword & ~bit);
    });
}

std::vector<float> envelope_curve(const p_s& sound, int kind, int count) {
    std::vector<float> curve(static_cast<size_t>(std::max(count, 0)));
    // The mixer's lengths: the sound's frames, or the fade length for the fade envelope.
    const uint64_t length =
        kind == 4 ? sound.setting : sound.length >> std::clamp<int>(sound.framecode, 0, 2);
    for (size_t i = 0; i < curve.size(); ++i)
        curve[i] = envelope_value(sound, kind, i * length / curve.size(), static_cast<unsigned long>(length));
    return curve;
}

}  // namespace ondrel
