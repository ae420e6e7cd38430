#pragma once
#include <atomic>
#include <cstdint>

#include "song/sample.h"
#include "song/structure_lock.h"

namespace ondrel {

// A sound heard on its own, outside the song: a file chosen in the browser, or the sound
// (or the selection) of the sample editor. The window thread hands it over in a swap
// under the structure lock; the render callback adds it to the output at its own rate.
class SoundPreview {
public:
    // Plays frames [first, end) of sound (the whole sound when end is 0) from the start.
    void play(SampleRef sound, uint32_t first, uint32_t end, StructureLock& lock);
    void stop(StructureLock& lock);
    bool playing() const { return active_.load(std::memory_order_relaxed); }

    // Audio thread: adds the next frames of the sound into the stereo output; false when
    // nothing played.
    bool mix(float* out, int frames, double frame_rate);

private:
    SampleRef sound_;
    double position_ = 0;  // frames into the sound
    uint32_t end_ = 0;
    std::atomic<bool> active_{false};
};

}  // namespace ondrel
