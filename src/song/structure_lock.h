#pragma once

namespace ondrel {

// Held by the GUI side for the few microseconds it swaps data that the audio thread
// reads (songs, patterns, samples). The audio driver implements it with its device lock,
// so the render callback never runs during a swap and never takes a lock itself.
class StructureLock {
public:
    virtual ~StructureLock() = default;
    virtual void lock() = 0;
    virtual void unlock() = 0;
};

class NoStructureLock final : public StructureLock {
public:
    void lock() override {}
    void unlock() override {}
};

}  // namespace ondrel
