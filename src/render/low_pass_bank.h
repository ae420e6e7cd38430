#pragma once
// Several one-pole low passes run over a block of frames: first what their inputs give
// (no earlier output needed, so the compiler can use vectors), then the recursions side by
// side, so that the chains' latencies overlap. Each value comes out as OnePole::step
// gives it frame by frame.
#include "render/denormal.h"

namespace ondrel {

// Low pass c reads u[c][0..block) and writes y[c][0..block).
template <int N, long Chunk>
inline void low_passes(OnePole* state, const OnePoleCoefficients* k, const float (&u)[N][Chunk],
                       float* const* y, long block) {
    float drive[N][Chunk];
    for (int c = 0; c < N; ++c) {
        drive[c][0] = one_pole_drive(u[c][0], state[c].u1, k[c]);
        for (long i = 1; i < block; ++i) drive[c][i] = one_pole_drive(u[c][i], u[c][i - 1], k[c]);
    }
    float y1[N], feedback[N];
    for (int c = 0; c < N; ++c) {
        y1[c] = state[c].y1;
        feedback[c] = k[c].feedback;
    }
    for (long i = 0; i < block; ++i) {
#pragma GCC unroll 8
        for (int c = 0; c < N; ++c) {
            y1[c] = flush(feedback[c] * y1[c] + drive[c][i]);
            y[c][i] = y1[c];
        }
    }
    for (int c = 0; c < N; ++c) {
        state[c].y1 = y1[c];
        state[c].u1 = u[c][block - 1];
    }
}

}  // namespace ondrel
