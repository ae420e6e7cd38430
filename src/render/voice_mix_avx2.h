#pragma once
// The AVX2 mix loops, for CPUs that have AVX2 and FMA (the caller checks).
#include "render/voice_mix.h"

namespace ondrel {

MonoMixFn mono_mixer_avx2(bool bits16, bool interpolate, SendMode send, OutMode out);
StereoMixFn stereo_mixer_avx2(bool bits16, OutMode out);

}  // namespace ondrel
