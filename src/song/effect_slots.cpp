#include "song/effect_slots.h"

#include <algorithm>
#include <cstdio>
#include <mutex>
#include <new>

namespace ondrel {

namespace {
constexpr int kBasicTypes[] = {1, 2, 3, 5, 9, 10, 11, 12, 16, 17};
}

EffectSlots::EffectSlots() {
    for (int t : kBasicTypes) efxtype[t] = static_cast<int16_t>(t);
    for (auto& buffer : pbufferefx) buffer = std::make_unique<float[]>(kSendBufferFloats);
}

bool EffectSlots::reserve_echo_line(int unit, uint32_t length, StructureLock& lock) {
    if (unit < 0 || unit >= kEchoUnits) return false;
    length = std::min(length, kMaxEchoFrames);
    const uint32_t bytes = 4 * length + 1024;
    if (echoefx[unit] && sizeecho[unit] == bytes) return true;
    std::unique_ptr<float[]> line(new (std::nothrow) float[bytes / 4]());
    const bool ok = line != nullptr;
    {
        std::lock_guard<StructureLock> guard(lock);
        echoefx[unit].swap(line);
        sizeecho[unit] = ok ? bytes : 0;
    }
    return ok;
}

std::string added_effect_label(int slot, int type) {
    const char* name = nullptr;
    switch (type) {
        case 1: name = "Low Pass Filter (FIR)"; break;
        case 3: name = "High Pass Filter (FIR)"; break;
        case 11: name = "Echo, Delay"; break;
        case 16: name = "Low Pass Filter (IIR)"; break;
        case 17: name = "High Pass Filter (IIR)"; break;
        default: break;
    }
    char text[64];
    if (name)
        std::snprintf(text, sizeof text, "(%02d) %s", slot, name);
    else
        std::snprintf(text, sizeof text, "(%02d)", slot);  // unnamed types show the slot alone
    return text;
}

}  // namespace ondrel
