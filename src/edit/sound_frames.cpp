#include "edit/sound_frames.h"

#include <algorithm>
#include <cstring>

namespace ondrel {

uint32_t frame_bytes(int bits, bool stereo) {
    return (bits == 16 ? 2u : 1u) * (stereo ? 2u : 1u);
}

uint32_t sound_frames(const p_s* s) {
    return s && s->data ? s->length / frame_bytes(*s) : 0;
}

std::optional<FrameSpan> resolve_range(FrameRange range, uint32_t frames) {
    if (range.whole()) {
        if (frames == 0) return std::nullopt;
        return FrameSpan{0, frames};
    }
    const uint32_t end = std::min(range.end, frames);
    if (range.first >= end) return std::nullopt;
    return FrameSpan{range.first, end};
}

SampleRef resized_record(const p_s& from, uint32_t length) {
    SampleRef s = make_sample(length);
    uint8_t* const data = s->data;
    std::memcpy(static_cast<void*>(s.get()), &from, sizeof(p_s));
    s->data = length ? data : nullptr;
    s->length = length;
    return s;
}

bool change_header(SongTransaction& t, int slot, const std::function<void(p_s&)>& change) {
    const p_s* view = t.view_sample(slot);
    if (!view) return false;
    p_s header;
    std::memcpy(static_cast<void*>(&header), view, sizeof header);
    change(header);
    header.data = view->data;
    header.length = view->length;
    if (std::memcmp(&header, view, sizeof header) == 0) return false;
    p_s* s = t.sample(slot);
    uint8_t* const data = s->data;
    std::memcpy(static_cast<void*>(s), &header, sizeof header);
    s->data = data;
    return true;
}

}  // namespace ondrel
