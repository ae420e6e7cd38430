// Built with -mavx2 -mfma -mavx512f -mavx512vl.
#define ONDREL_SIMD_NS avx512
#include "render/voice_mix_simd.inc"
