#pragma once
#include <atomic>
#include <cstddef>
#include <cstdint>

namespace ondrel {

// The recording gain vrvol in 1/128 steps (128 = unity).
inline double record_gain(int vrvol) {
    return vrvol * 0.0078125;
}

// x times g, rounded, kept to 16 bits without clamping: a gain above unity wraps.
int16_t scale_wrapped(int x, double g);

// Largest bytes one frame of any recording format takes.
inline constexpr size_t kMaxBytesPerFrame = 4;

// Converts frames of interleaved 16-bit stereo into samplermode's bytes at out: mono keeps
// the left channel with its lowest bit cleared (the right one is not mixed in), 8 bits keep
// the high bytes; each value is scaled by g, rounded and stored without clamping. 8-bit
// values are made unsigned (XOR 0x80) for a disk file and stay signed in memory. Returns
// the bytes stored.
size_t convert_frames(int samplermode, bool disk, double g, const int16_t* in, size_t frames, uint8_t* out);

struct MonitorPeaks {
    int left = 0;
    int right = 0;
};

// The monitor copy: both channels scaled by g and rounded into out, of which only the first
// room values are kept; returns the largest magnitude of each channel over all frames.
MonitorPeaks scale_for_monitor(double g, const int16_t* in, size_t frames, std::atomic<int16_t>* out,
                               size_t room);

// A peak meter reading (maxg, maxd) of a peak: 0 to 15 for 16-bit values.
inline int16_t meter_of(int peak) {
    return static_cast<int16_t>(peak / 2048);
}

}  // namespace ondrel
