#pragma once
#include <array>
#include <atomic>
#include <cstdint>
#include <memory>
#include <string>

#include "song/structure_lock.h"
#include "song/tmod.h"

namespace ondrel {

inline constexpr int kSendBufferBytes = 20480;
inline constexpr int kSendBufferFloats = kSendBufferBytes / 4;
inline constexpr int kFirstClonedSlot = 20;
inline constexpr uint32_t kMaxEchoFrames = 441000;  // 10 s: bound for lengths from files

// The effect-slot tables shared by all songs, and the memory the audio thread uses for
// them. Everything here is reserved on the GUI side before the audio thread can need it.
struct EffectSlots {
    EffectSlots();

    // Unit type of each slot 0..99 (1, 2, 3, 5, 9, 10, 11, 12, 16, 17; 0 = none): slots 1..19
    // hold the basic units at their own number, 20..99 the clones ("Clone efx", the "efx."
    // chunk, which may bring other numbers: kept and routed, but run by no unit); written by
    // the rack and the native reader, read by the mixer and command 33.
    std::array<int16_t, kEffectSlots> efxtype{};
    // Send buffers by compact number - 1, 20480 bytes (kSendBufferFloats floats) each, all
    // made with the slots, so that routing never waits on memory; the mixer sums the voices
    // of a routed slot into one per piece.
    std::array<std::unique_ptr<float[]>, kEffectSlots> pbufferefx;
    // Echo lines by echo instance, 4 x length + 1024 bytes, and their sizes in bytes;
    // replaced under the structure lock, run by the echo unit on the audio thread.
    std::array<std::unique_ptr<float[]>, kEchoUnits> echoefx;
    std::array<uint32_t, kEchoUnits> sizeecho{};

    // Makes echo unit's line hold length frames (4 x length + 1024 bytes); the new line
    // is swapped in under lock, since the audio thread may be running the old one.
    bool reserve_echo_line(int unit, uint32_t length, StructureLock& lock);
};

// Label of a slot in the menu of added effects, e.g. "(21) Echo, Delay".
std::string added_effect_label(int slot, int type);

}  // namespace ondrel
