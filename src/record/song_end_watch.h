#pragma once
#include <cstdint>

#include "playback/player.h"
#include "record/recorder.h"
#include "render/mixer.h"

namespace ondrel {

// Sits between the mixer and the recorder while a song's own output is recorded to be kept
// as the song: when the song ends, or comes back to a row it has already played, the
// recording takes only the rest of the tick being played, and so stops where an offline
// render of the song stops. Runs on the audio thread.
class SongEndWatch final : public OutputRecorder {
public:
    SongEndWatch(Recorder& recorder, const Player& player, const Mixer& mixer, int bytes_per_frame)
        : recorder_(recorder), player_(player), mixer_(mixer), bytes_per_frame_(bytes_per_frame) {}

    void RecordFile(const int16_t* samples, size_t bytes, const AudioFormat& format) override;
    bool song_ended() const { return ended_.load(std::memory_order_acquire); }

private:
    Recorder& recorder_;
    const Player& player_;
    const Mixer& mixer_;
    int bytes_per_frame_;
    std::atomic<bool> ended_{false};
};

}  // namespace ondrel
