#include "render/offline_render.h"

#include <algorithm>
#include <cmath>
#include <memory>
#include <span>
#include <vector>

namespace ondrel {

RenderEnd render_offline(Mixer& mixer, Player& player, const OfflineOptions& options,
                         const RenderSink& sink) {
    const int frames = std::clamp(options.buffer_frames, 16, kMaxFramesPerCall);
    // Aligned to a cache line, so the output stage's vector passes never straddle two.
    constexpr size_t kLineFloats = 64 / sizeof(float);
    std::vector<float> storage(2 * static_cast<size_t>(frames) + kLineFloats);
    void* start = storage.data();
    size_t room = storage.size() * sizeof(float);
    std::align(64, 2 * static_cast<size_t>(frames) * sizeof(float), start, room);
    const std::span<float> buffer(static_cast<float*>(start), 2 * static_cast<size_t>(frames));
    const AudioFormat format{static_cast<float>(kOutputRate), 2, kFormatFloat};
    const uint64_t limit = options.max_seconds > 0
                               ? static_cast<uint64_t>(std::llround(options.max_seconds * kOutputRate))
                               : UINT64_MAX;
    const bool measured = mixer.measure_load.exchange(false);
    player.tr.floop = 0;
    player.watch_for_repeats(true);
    player.start(false);
    uint64_t done = 0;
    RenderEnd end = RenderEnd::TimeLimit;
    while (done < limit) {
        mixer.BufferProc(nullptr, buffer.data(), buffer.size() * sizeof(float), format);
        const int count = static_cast<int>(std::min<uint64_t>(frames, limit - done));
        done += static_cast<uint64_t>(count);
        if (!sink(buffer.data(), count, done / kOutputRate)) {
            end = RenderEnd::Aborted;
            break;
        }
        if (!player.tr.playing || player.repeated) {
            end = player.tr.playing ? RenderEnd::Repeat : RenderEnd::SongEnd;
            // The sequencer ends a row as its last half-tick begins: render that
            // half-tick to its end.
            while (mixer.bpmreste >= 1 && done < limit && end != RenderEnd::Aborted) {
                const int owed = static_cast<int>(std::min<double>(mixer.bpmreste, frames));
                mixer.BufferProc(nullptr, buffer.data(), static_cast<unsigned long>(owed) * 2 * sizeof(float),
                                 format);
                const int tail = static_cast<int>(std::min<uint64_t>(owed, limit - done));
                done += static_cast<uint64_t>(tail);
                if (!sink(buffer.data(), tail, done / kOutputRate)) end = RenderEnd::Aborted;
            }
            break;
        }
    }
    player.stoppi();
    player.watch_for_repeats(false);
    mixer.measure_load = measured;
    return end;
}

const char* render_end_text(RenderEnd end) {
    switch (end) {
        case RenderEnd::SongEnd: return "end of the song";
        case RenderEnd::Repeat: return "point where the song loops back to a row already played";
        case RenderEnd::TimeLimit: return "time limit";
        case RenderEnd::Aborted: return "stopped";
    }
    return "";
}

}  // namespace ondrel
