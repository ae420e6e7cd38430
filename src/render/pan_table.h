#pragma once
#include <array>

namespace ondrel {

// Equal-power pan law: position P gives left gain tab_pan[P], right tab_pan[127 - P].
const std::array<float, 128>& tab_pan();

}  // namespace ondrel
