#pragma once

namespace ondrel {

// The resonant band pass of type 5; one history for all its slots.
class ActiveFilter {
public:
    float entrem1 = 0, entrem2 = 0;
    float sortiem1 = 0, sortiem2 = 0;
    float fc = 0;

    // frequency is the slot's centre in Hz; control sets the gain.
    void run(const float* send, float* out, int frames, int control, unsigned frequency, float gain_left,
             float gain_right);
    void clear() { entrem1 = entrem2 = sortiem1 = sortiem2 = 0; }
};

}  // namespace ondrel
