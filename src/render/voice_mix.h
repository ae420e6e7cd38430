#pragma once
// The inner loops of the mixer, one instance per case (sample width, interpolation,
// send mode, stereo) so that no test is made per frame.
#include <cstdint>

#include "render/loop_set.h"

namespace ondrel {

typedef int16_t __attribute__((may_alias)) sample16_t;  // sample data lives in a byte block

enum class SendMode { None, First, Add };
// Set: the first voice of a piece writes the output, the others add to it.
enum class OutMode { Add, Set };

struct MixGains {
    float left;
    float right;
    float send;
};

// Mixes count frames of a mono sample from frame pos, frame i read at offset f + i x step,
// into interleaved out and the mono send buffer; returns the offset after the last frame.
using MonoMixFn = double (*)(const void* data, int64_t pos, double x, double step, int count, float* out,
                             float* send, const MixGains& g);
// Stereo samples are never interpolated and never sent.
using StereoMixFn = double (*)(const void* data, int64_t pos, double x, double step, int count, float* out,
                               const MixGains& g);

// A mono voice's passes over a piece, in one call (render/voice_passes.h). With
// SendMode::First the first pass sets the send buffer and the others add to it.
struct VoicePasses;
using VoiceMixFn = void (*)(VoicePasses& passes, const MixGains& g);

// The loop for a case; bits16 selects 16-bit data. A set the CPU cannot run gives the
// portable loops.
MonoMixFn mono_mixer(bool bits16, bool interpolate, SendMode send, OutMode out, LoopSet set = LoopSet::Best);
StereoMixFn stereo_mixer(bool bits16, OutMode out, LoopSet set = LoopSet::Best);
VoiceMixFn voice_mixer(bool bits16, bool interpolate, SendMode send, OutMode out, LoopSet set = LoopSet::Best);

}  // namespace ondrel
