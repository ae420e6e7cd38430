#pragma once
// A voice's passes over one piece. A pass mixes frames until the piece or the sample (or
// its loop) ends; a loop starts the next pass again at its start, at the last pass's
// fraction. The pass loop is shared by every set of mix loops and by the mixer's own
// stereo and muted voices, and each set runs it around its mixing in one call: a loop of
// a few frames makes a pass every few dozen frames, and one call a pass costs more than
// the mixing.
#include <cstdint>

#include "render/pass_arithmetic.h"

namespace ondrel {

// What a voice's passes over a piece read, and what they leave.
struct VoicePasses {
    const void* data;    // the sample's frames
    int64_t loop_start;  // where a pass after a wrap starts
    int64_t end;         // the frame passes stop before: the loop's end, a mark's or the sample's
    double step;         // source frames a frame, 0 or more
    bool loop;           // the sample loops: reaching the end wraps rather than ends the voice
    bool loops;          // ... and the loop is not empty: a pass that reaches it is followed
    int64_t pos;         // in and out: the whole source position
    double f;            // in and out: its fraction, in [0, 1)
    float* out;          // in and out: where the next frame goes (interleaved)
    float* send;         // in and out: the send buffer at the same frame, or null
    int frames;          // frames of the piece to fill
    int64_t position;    // in and out: the voice's stored position (the caller's, reset on a wrap)
    bool keeps = true;   // out: pos and f are the voice's to keep (false when ended or stalled)
    bool ended = false;  // out: the voice played to its end
    uint32_t advanced = 0;  // out: each pass's whole advance, summed (the release fade's clock)
};

// Runs the passes, each through mix(pos, f, count, out, send).
template <typename MixPass>
inline void run_voice_passes(VoicePasses& r, MixPass&& mix) {
    const double step = r.step;
    const int64_t loop_start = r.loop_start, end = r.end;
    const PassArithmetic passes(step);
    int64_t pos = r.pos;
    double f = r.f;
    float* out = r.out;
    float* send = r.send;
    int frames_left = r.frames;
    for (;;) {
        const int64_t adv = static_cast<int64_t>(step * frames_left + f);
        if (pos >= end) {
            pos = loop_start;
            r.position = pos;
        }
        auto frames_until_end = [&]() -> int64_t {
            if (pos + adv < end) return frames_left;
            if (step <= 0) return pos < end ? frames_left : 0;
            return passes.frames_before(static_cast<double>(end - pos), f);
        };
        int64_t count = frames_until_end();
        if (count < 1) {
            if (!r.loop) {
                r.ended = true;
                r.keeps = false;
                break;
            }
            if (count == 0) {
                pos = loop_start;
                r.position = pos;
                count = frames_until_end();
            }
            if (count < 1) {  // stalled for this piece
                r.keeps = false;
                break;
            }
        }
        const int cnt = static_cast<int>(count);
        mix(pos, f, cnt, out, send);
        // The offset after the pass is never negative: its whole part is its floor.
        const OffsetParts parts = split_offset(f + cnt * step, end - pos);
        pos += parts.whole;
        f = parts.fraction;
        out += 2 * cnt;
        if (send) send += cnt;
        r.advanced += static_cast<uint32_t>(adv);
        if (frames_left - cnt != 0 && r.loops) {
            frames_left -= cnt;
            pos = loop_start;
            continue;
        }
        if (end <= pos && !r.loop) r.ended = true;
        break;
    }
    r.pos = pos;
    r.f = f;
    r.out = out;
    r.send = send;
    if (r.keeps) r.position = pos;
}

}  // namespace ondrel
