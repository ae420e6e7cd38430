#include "record/song_end_watch.h"

#include <algorithm>

namespace ondrel {

void SongEndWatch::RecordFile(const int16_t* samples, size_t bytes, const AudioFormat& format) {
    recorder_.RecordFile(samples, bytes, format);
    if (ended_.load(std::memory_order_relaxed)) return;
    if (player_.tr.playing.load(std::memory_order_relaxed) &&
        !player_.repeated.load(std::memory_order_relaxed))
        return;
    // The sequencer ends a row as the row's last tick begins: that tick is still owed.
    const double owed = mixer_.bpmreste >= 1 ? mixer_.bpmreste : 0;
    const uint64_t end =
        recorder_.bytes_recorded() + static_cast<uint64_t>(owed) * static_cast<uint64_t>(bytes_per_frame_);
    const uint64_t asked = recorder_.stop_after();
    recorder_.stop_after_bytes(asked ? std::min(asked, end) : end);
    ended_.store(true, std::memory_order_release);
}

}  // namespace ondrel
