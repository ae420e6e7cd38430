#pragma once

namespace ondrel {

// The one-pole low pass of type 2; one history for all its slots.
class Iir1Filter {
public:
    float flm1 = 0;  // previous input
    float fdm1 = 0;  // previous output

    void run(const float* send, float* out, int frames, int control);
    void clear() { flm1 = fdm1 = 0; }
};

}  // namespace ondrel
