#include "render/pan_table.h"

#include <cmath>

namespace ondrel {

const std::array<float, 128>& tab_pan() {
    static const std::array<float, 128> table = [] {
        std::array<float, 128> t{};
        for (int i = 0; i < 128; ++i) t[i] = static_cast<float>(std::sin(i * (M_PI / 2) * (1.0 / 128)));
        return t;
    }();
    return table;
}

}  // namespace ondrel
