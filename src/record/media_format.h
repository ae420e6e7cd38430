#pragma once
#include <cstdint>

namespace ondrel {

// A connection's media format, as the capture node negotiates it: raw audio, each field 0
// when any value will do.
enum class MediaType { Unspecified, RawAudio, Other };

struct MediaFormat {
    MediaType type = MediaType::Unspecified;
    float frame_rate = 0;
    uint32_t channel_count = 0;
    uint32_t format = 0;  // kFormatShort, kFormatFloat
};

// Each field equal, or a wildcard on either side.
inline bool raw_formats_compatible(const MediaFormat& a, const MediaFormat& b) {
    const auto fits = [](auto x, auto y) { return x == 0 || y == 0 || x == y; };
    return fits(a.frame_rate, b.frame_rate) && fits(a.channel_count, b.channel_count) &&
           fits(a.format, b.format);
}

}  // namespace ondrel
