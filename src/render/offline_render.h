#pragma once
#include <functional>

#include "render/mixer.h"

namespace ondrel {

struct OfflineOptions {
    int buffer_frames = 1024;
    double max_seconds = 0;  // 0: no limit
};

enum class RenderEnd { SongEnd, Repeat, TimeLimit, Aborted };

// Receives each rendered buffer (interleaved stereo) and the seconds rendered so far;
// returning false stops the render.
using RenderSink = std::function<bool(const float* frames, int count, double seconds)>;

// Plays the current song from its start through the mixer, faster than real time, until
// it ends, comes back to a row it has played, or reaches the time limit.
RenderEnd render_offline(Mixer& mixer, Player& player, const OfflineOptions& options, const RenderSink& sink);

const char* render_end_text(RenderEnd end);

}  // namespace ondrel
