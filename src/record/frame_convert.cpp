#include "record/frame_convert.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>

namespace ondrel {

int16_t scale_wrapped(int x, double g) {
    return static_cast<int16_t>(static_cast<uint16_t>(std::lround(x * g)));
}

namespace {
inline uint8_t byte_wrapped(int x, double g) {
    return static_cast<uint8_t>(std::lround(x * g));
}
inline uint8_t* put16(uint8_t* out, int16_t v) {
    out[0] = static_cast<uint8_t>(v);
    out[1] = static_cast<uint8_t>(static_cast<uint16_t>(v) >> 8);
    return out + 2;
}
}  // namespace

size_t convert_frames(int samplermode, bool disk, double g, const int16_t* in, size_t frames, uint8_t* out) {
    const uint8_t sign = disk ? 0x80 : 0x00;
    uint8_t* o = out;
    switch (samplermode) {
        case 1:
            for (size_t i = 0; i < frames; ++i) {
                o = put16(o, scale_wrapped(in[2 * i], g));
                o = put16(o, scale_wrapped(in[2 * i + 1], g));
            }
            break;
        case 2:
            for (size_t i = 0; i < frames; ++i) *o++ = byte_wrapped(in[2 * i] >> 8, g) ^ sign;
            break;
        case 3:
            for (size_t i = 0; i < frames; ++i) {
                *o++ = byte_wrapped(in[2 * i] >> 8, g) ^ sign;
                *o++ = byte_wrapped(in[2 * i + 1] >> 8, g) ^ sign;
            }
            break;
        default:
            for (size_t i = 0; i < frames; ++i) o = put16(o, scale_wrapped(in[2 * i] & ~1, g));
            break;
    }
    return static_cast<size_t>(o - out);
}

MonitorPeaks scale_for_monitor(double g, const int16_t* in, size_t frames, std::atomic<int16_t>* out,
                               size_t room) {
    MonitorPeaks p;
    for (size_t i = 0; i < frames; ++i) {
        const int16_t l = scale_wrapped(in[2 * i], g);
        const int16_t r = scale_wrapped(in[2 * i + 1], g);
        if (2 * i + 1 < room) {
            out[2 * i].store(l, std::memory_order_relaxed);
            out[2 * i + 1].store(r, std::memory_order_relaxed);
        }
        p.left = std::max(p.left, std::abs(int{l}));
        p.right = std::max(p.right, std::abs(int{r}));
    }
    return p;
}

}  // namespace ondrel
