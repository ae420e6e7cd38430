#pragma once
#include <cstdint>

#include "song/sample.h"

namespace ondrel {

// The value of envelope kind (0..4, or 16: kind 0's points) at position of a span of
// length, as the mixer uses it: the points are laid over the span (x = 255 at its end),
// levels joined by straight lines in integer steps, 0 from the last point on. Kind 1 gives
// level x 2, kind 2 level up to 127, kind 3 the level, the others level / 128.
float envelope_value(const p_s& sound, int kind, uint64_t position, unsigned long length);

}  // namespace ondrel
