#pragma once
#include <array>

namespace ondrel {

// The 15-tap FIR low and high pass (types 1 and 3). All FIR slots share the taps, the
// history ring and the last cutoff.
class FirFilter {
public:
    static constexpr int kMaxFrames = 4096;  // the mixer's longest buffer

    std::array<float, 15> coefc{};
    std::array<float, 15> tourne{};
    float fc = 0;

    // Designs the taps for fc; type 3 gives the high pass.
    void calcfilter(int type);
    // Adds the filtered send into both channels; control sets the cutoff.
    void run(int type, const float* send, float* out, int frames, int control);
    void clear() { tourne.fill(0.0f); }
};

}  // namespace ondrel
