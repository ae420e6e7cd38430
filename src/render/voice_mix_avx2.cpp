// Built with -mavx2 -mfma.
#define ONDREL_SIMD_NS avx2
#include "render/voice_mix_simd.inc"
