#pragma once
#include <cstdint>
#include <functional>
#include <optional>

#include "edit/sound_edits.h"

namespace ondrel {

// What the sound edits share: where a range lies in a sound, sample values of either
// width, and records remade at another length.

// Bytes of one frame of a record's format.
uint32_t frame_bytes(int bits, bool stereo);
inline uint32_t frame_bytes(const p_s& s) {
    return frame_bytes(s.bits, s.stereo != 0);
}
// Frames of data a record holds (none when it has no data).
uint32_t sound_frames(const p_s* s);

// The frames [first, end) a range covers in a sound of frames frames: the whole sound for
// an empty range, the range cut at the sound's end otherwise; none when nothing is left.
struct FrameSpan {
    uint32_t first = 0;
    uint32_t end = 0;
    uint32_t count() const { return end - first; }
};
std::optional<FrameSpan> resolve_range(FrameRange range, uint32_t frames);

// Sample values, signed, by index (frame x channels + channel).
inline int32_t sample_at(const uint8_t* data, int bits, size_t i) {
    if (bits == 16) return reinterpret_cast<const int16_t*>(data)[i];
    return static_cast<int8_t>(data[i]);
}
inline void set_sample_at(uint8_t* data, int bits, size_t i, int32_t v) {
    if (bits == 16)
        reinterpret_cast<int16_t*>(data)[i] = static_cast<int16_t>(v);
    else
        data[i] = static_cast<uint8_t>(static_cast<int8_t>(v));
}

// A new record with the header of from and length bytes of zeroed data (no data at all
// when length is 0).
SampleRef resized_record(const p_s& from, uint32_t length);

// Changes the header of the sound in slot through change, which works on a copy; the sound
// is taken into the edit only when the header came out different. False when the slot
// has no record or nothing changed.
bool change_header(SongTransaction& t, int slot, const std::function<void(p_s&)>& change);

}  // namespace ondrel
