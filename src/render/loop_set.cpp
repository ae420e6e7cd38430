#include "render/loop_set.h"

namespace ondrel {

bool has_avx2() {
    static const bool yes = __builtin_cpu_supports("avx2") && __builtin_cpu_supports("fma");
    return yes;
}

bool has_avx512() {
    static const bool yes =
        has_avx2() && __builtin_cpu_supports("avx512f") && __builtin_cpu_supports("avx512vl");
    return yes;
}

bool cpu_runs(LoopSet set) {
    switch (set) {
        case LoopSet::Best:
        case LoopSet::Portable: return true;
        case LoopSet::Avx2: return has_avx2();
    }
    return false;
}

}  // namespace ondrel
