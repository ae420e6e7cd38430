#include "edit/sound_edits.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <functional>
#include <optional>

#include "edit/sound_blocks.h"
#include "edit/sound_frames.h"

namespace ondrel {

namespace {

int32_t largest_value(int bits) {
    return bits == 16 ? 32767 : 127;
}

void fade(uint8_t* data, int bits, uint32_t channels, uint32_t n, bool in) {
    const int64_t den = n > 1 ? n - 1 : 1;
    for (uint32_t i = 0; i < n; ++i) {
        const int64_t num = n == 1 ? 0 : in ? i : n - 1 - i;
        for (uint32_t c = 0; c < channels; ++c) {
            const size_t k = size_t(i) * channels + c;
            set_sample_at(data, bits, k, static_cast<int32_t>(sample_at(data, bits, k) * num / den));
        }
    }
}

void normalize(uint8_t* data, int bits, size_t values) {
    int64_t peak = 0;
    for (size_t k = 0; k < values; ++k) peak = std::max<int64_t>(peak, std::abs(sample_at(data, bits, k)));
    if (peak == 0) return;
    const int64_t top = largest_value(bits);
    for (size_t k = 0; k < values; ++k) {
        const int64_t v = sample_at(data, bits, k);
        const int64_t scaled = (std::abs(v) * top * 2 + peak) / (2 * peak);
        set_sample_at(data, bits, k, static_cast<int32_t>(v < 0 ? -scaled : scaled));
    }
}

void reverse(uint8_t* data, uint32_t frame_size, uint32_t n) {
    uint8_t frame[4];
    for (uint32_t i = 0, j = n - 1; i < j; ++i, --j) {
        std::memcpy(frame, data + size_t(i) * frame_size, frame_size);
        std::memcpy(data + size_t(i) * frame_size, data + size_t(j) * frame_size, frame_size);
        std::memcpy(data + size_t(j) * frame_size, frame, frame_size);
    }
}

void invert(uint8_t* data, int bits, size_t values) {
    const int32_t top = largest_value(bits);
    for (size_t k = 0; k < values; ++k) {
        const int32_t v = sample_at(data, bits, k);
        set_sample_at(data, bits, k, v < -top ? top : -v);
    }
}

// The sound in a slot as the edit has it so far, and where a range lies in its data.
struct Located {
    const p_s* sound;
    FrameSpan span;
    size_t frame_size;
    size_t first_byte() const { return span.first * frame_size; }
    size_t end_byte() const { return span.end * frame_size; }
    const uint8_t* begin() const { return sound->data + first_byte(); }
    const uint8_t* end() const { return sound->data + end_byte(); }
};

std::optional<Located> locate(const SongTransaction& t, int slot, FrameRange range) {
    const p_s* view = t.view_sample(slot);
    const auto span = resolve_range(range, sound_frames(view));
    if (!span) return std::nullopt;
    return Located{view, *span, frame_bytes(*view)};
}

using RangeChange = std::function<void(uint8_t* data, int bits, uint32_t channels, uint32_t frames)>;

// Works change on a copy of the range and takes the sound into the edit only when the
// range came out different.
bool rewrite_range(SongTransaction& t, int slot, FrameRange range, const RangeChange& change) {
    const auto at = locate(t, slot, range);
    if (!at) return false;
    std::vector<uint8_t> bytes(at->begin(), at->end());
    change(bytes.data(), at->sound->bits, at->sound->stereo ? 2 : 1, at->span.count());
    if (std::equal(bytes.begin(), bytes.end(), at->begin())) return false;
    std::memcpy(t.sample(slot)->data + at->first_byte(), bytes.data(), bytes.size());
    return true;
}

int32_t rescale(int32_t v, int from_bits, int to_bits) {
    if (from_bits == to_bits) return v;
    return to_bits == 16 ? v * 256 : v >> 8;
}

// The clip's frames in another format.
std::vector<uint8_t> convert_clip(const SoundClip& clip, int bits, bool stereo) {
    const uint32_t n = clip.frames();
    const uint32_t from_channels = clip.stereo ? 2 : 1, to_channels = stereo ? 2 : 1;
    std::vector<uint8_t> out(size_t(n) * frame_bytes(bits, stereo));
    for (uint32_t i = 0; i < n; ++i) {
        const int32_t left = sample_at(clip.bytes.data(), clip.bits, size_t(i) * from_channels);
        const int32_t right =
            from_channels == 2 ? sample_at(clip.bytes.data(), clip.bits, size_t(i) * 2 + 1) : left;
        const int32_t values[2] = {to_channels == 1 ? (left + right) / 2 : left, right};
        for (uint32_t c = 0; c < to_channels; ++c)
            set_sample_at(out.data(), bits, size_t(i) * to_channels + c, rescale(values[c], clip.bits, bits));
    }
    return out;
}

// A record of the clip's format and rate holding only the clip, with the header of the
// record without data the slot had, if any.
bool paste_into_empty(SongTransaction& t, int slot, const p_s* record, const SoundClip& clip) {
    if (clip.bytes.size() > kMaxSampleBytes) return false;
    const uint32_t length = static_cast<uint32_t>(clip.frames() * frame_bytes(clip.bits, clip.stereo));
    SampleRef s = record ? resized_record(*record, length) : make_sample(length);
    if (!record) s->volume = 128;
    s->bits = clip.bits;
    s->stereo = clip.stereo ? 1 : 0;
    s->framecode = frame_code(clip.bits, clip.stereo);
    s->rate = clip.rate;
    s->loopon = 0;
    s->loopstart = s->loopend = 0;
    std::memcpy(s->data, clip.bytes.data(), length);
    t.set_sample(slot, std::move(s));
    // Blocks left from an earlier sound are kept where they fit.
    follow_frames(t, slot, {FrameShift::Kind::Crop, 0, clip.frames()});
    return true;
}

}  // namespace

uint32_t SoundClip::frames() const {
    return static_cast<uint32_t>(bytes.size() / frame_bytes(bits, stereo));
}

const char* sound_tool_label(SoundTool tool) {
    switch (tool) {
        case SoundTool::FadeIn: return "Fade In";
        case SoundTool::FadeOut: return "Fade Out";
        case SoundTool::Normalize: return "Normalize";
        case SoundTool::Reverse: return "Reverse";
        case SoundTool::InvertSign: return "Invert Sign";
    }
    return "";
}

bool apply_sound_tool(SongTransaction& t, int slot, SoundTool tool, FrameRange range) {
    return rewrite_range(t, slot, range, [tool](uint8_t* data, int bits, uint32_t channels, uint32_t n) {
        const size_t values = size_t(n) * channels;
        switch (tool) {
            case SoundTool::FadeIn: fade(data, bits, channels, n, true); break;
            case SoundTool::FadeOut: fade(data, bits, channels, n, false); break;
            case SoundTool::Normalize: normalize(data, bits, values); break;
            case SoundTool::Reverse: reverse(data, frame_bytes(bits, channels == 2), n); break;
            case SoundTool::InvertSign: invert(data, bits, values); break;
        }
    });
}

bool silence_frames(SongTransaction& t, int slot, FrameRange range) {
    return rewrite_range(t, slot, range, [](uint8_t* data, int bits, uint32_t channels, uint32_t n) {
        std::memset(data, 0, size_t(n) * frame_bytes(bits, channels == 2));
    });
}

SoundClip copy_frames(const SongTransaction& t, int slot, FrameRange range) {
    SoundClip clip;
    const auto at = locate(t, slot, range);
    if (!at) return clip;
    clip.bits = at->sound->bits == 16 ? 16 : 8;
    clip.stereo = at->sound->stereo != 0;
    clip.rate = at->sound->rate;
    clip.bytes.assign(at->begin(), at->end());
    return clip;
}

bool cut_frames(SongTransaction& t, int slot, FrameRange range) {
    const auto at = locate(t, slot, range);
    if (!at) return false;
    const p_s& from = *at->sound;
    SampleRef s =
        resized_record(from, static_cast<uint32_t>(from.length - (at->end_byte() - at->first_byte())));
    if (s->data) {
        std::memcpy(s->data, from.data, at->first_byte());
        std::memcpy(s->data + at->first_byte(), at->end(), from.length - at->end_byte());
    }
    t.set_sample(slot, std::move(s));
    follow_frames(t, slot, {FrameShift::Kind::Cut, at->span.first, at->span.count()});
    return true;
}

bool crop_to_frames(SongTransaction& t, int slot, FrameRange range) {
    const auto at = locate(t, slot, range);
    if (!at || at->end_byte() - at->first_byte() == at->sound->length) return false;
    SampleRef s = resized_record(*at->sound, static_cast<uint32_t>(at->end_byte() - at->first_byte()));
    std::memcpy(s->data, at->begin(), s->length);
    t.set_sample(slot, std::move(s));
    follow_frames(t, slot, {FrameShift::Kind::Crop, at->span.first, at->span.count()});
    return true;
}

bool paste_frames(SongTransaction& t, int slot, uint32_t frame, const SoundClip& clip) {
    if ((clip.bits != 8 && clip.bits != 16) || clip.frames() == 0) return false;
    const p_s* view = t.view_sample(slot);
    if (!view || !view->data) return paste_into_empty(t, slot, view, clip);
    const std::vector<uint8_t> bytes = convert_clip(clip, view->bits, view->stereo != 0);
    if (uint64_t{view->length} + bytes.size() > kMaxSampleBytes) return false;
    frame = std::min(frame, sound_frames(view));
    const size_t at = size_t(frame) * frame_bytes(*view);
    SampleRef s = resized_record(*view, static_cast<uint32_t>(view->length + bytes.size()));
    std::memcpy(s->data, view->data, at);
    std::memcpy(s->data + at, bytes.data(), bytes.size());
    std::memcpy(s->data + at + bytes.size(), view->data + at, view->length - at);
    t.set_sample(slot, std::move(s));
    follow_frames(t, slot, {FrameShift::Kind::Insert, frame, clip.frames()});
    return true;
}

}  // namespace ondrel
