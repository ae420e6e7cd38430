#pragma once
// Which vector instructions the render loops use: the best this CPU runs, or a lesser set
// (for tests and comparisons, so that every set is checked on a machine that has the best).

namespace ondrel {

enum class LoopSet { Best, Avx2, Portable };

// The Best and Portable sets run everywhere; Avx2 needs AVX2 and FMA.
bool cpu_runs(LoopSet set);

bool has_avx2();    // AVX2 and FMA
bool has_avx512();  // and AVX-512 F and VL

}  // namespace ondrel
