#pragma once
// The render callback on a thread of its own, as the sound card runs it.
#include <atomic>
#include <chrono>
#include <mutex>
#include <thread>
#include <vector>

#include "engine/engine.h"

namespace ondrel::test {

// Runs the callback under a device mutex, as SDL does, and is the bank's structure lock.
class FakeDevice final : public StructureLock {
public:
    explicit FakeDevice(Engine& e) : engine_(e) {}
    ~FakeDevice() override { stop(); }
    void lock() override { mutex_.lock(); }
    void unlock() override { mutex_.unlock(); }

    void start() {
        engine_.bank.set_structure_lock(this);
        engine_.player.audio_running = true;
        thread_ = std::thread([this] {
            std::vector<float> buffer(2 * 512);
            while (!quit_) {
                {
                    std::lock_guard<std::mutex> guard(mutex_);
                    engine_.mixer.BufferProc(nullptr, buffer.data(), buffer.size() * 4, AudioFormat{});
                }
                ++buffers;
                std::this_thread::sleep_for(std::chrono::microseconds(300));
            }
        });
    }
    void stop() {
        if (!thread_.joinable()) return;
        quit_ = true;
        thread_.join();
        engine_.player.audio_running = false;
        engine_.bank.set_structure_lock(nullptr);
    }
    std::atomic<int> buffers{0};

private:
    Engine& engine_;
    std::mutex mutex_;
    std::thread thread_;
    std::atomic<bool> quit_{false};
};

}  // namespace ondrel::test
