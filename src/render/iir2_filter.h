#pragma once
#include <array>
#include <cstdint>

namespace ondrel {

// The two-pole low pass with resonance (type 16) and its high pass, input minus the low
// pass (type 17). Each slot of a type uses the next row of that type's histories, counted
// from 0 in every buffer in slot order; each slot keeps its own ring index.
class Iir2Filter {
public:
    static constexpr int kRows = 100;
    std::array<std::array<float, 4>, kRows> tournex{}, tourney{};    // type 16
    std::array<std::array<float, 4>, kRows> tournex2{}, tourney2{};  // type 17
    std::array<int16_t, 100> lesind{};

    void begin_buffer() { row16_ = row17_ = 0; }
    void run(int type, int slot, const float* send, float* out, int frames, int control, int q,
             float gain_left, float gain_right);
    void clear();

private:
    int row16_ = 0, row17_ = 0;
    int used16_ = 0, used17_ = 0;  // rows run since the last clear, so clearing is cheap
};

}  // namespace ondrel
