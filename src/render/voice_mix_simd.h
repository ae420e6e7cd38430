#pragma once
// The vector mix loops, one set per instruction set; voice_mix picks the set the CPU runs.
#include "render/voice_mix.h"

namespace ondrel {

namespace avx2 {  // AVX2 and FMA
MonoMixFn mono_mixer(bool bits16, bool interpolate, SendMode send, OutMode out);
StereoMixFn stereo_mixer(bool bits16, OutMode out);
VoiceMixFn voice_mixer(bool bits16, bool interpolate, SendMode send, OutMode out);
}  // namespace avx2

namespace avx512 {  // the same with AVX-512VL's two-source permutes
MonoMixFn mono_mixer(bool bits16, bool interpolate, SendMode send, OutMode out);
StereoMixFn stereo_mixer(bool bits16, OutMode out);
VoiceMixFn voice_mixer(bool bits16, bool interpolate, SendMode send, OutMode out);
}  // namespace avx512

}  // namespace ondrel
