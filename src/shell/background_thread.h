#pragma once
#include <atomic>
#include <functional>
#include <thread>

namespace ondrel {

// One worker thread at a time, named and below the window and sound threads in priority,
// that can be asked to stop. The work polls the flag it is given and returns soon after
// it is set. Owned and driven by one thread (the window's); joined on destruction.
class BackgroundThread {
public:
    BackgroundThread() = default;
    ~BackgroundThread() { stop(); }
    BackgroundThread(const BackgroundThread&) = delete;
    BackgroundThread& operator=(const BackgroundThread&) = delete;

    // Stops the work under way, then runs work on a new thread called name (15 characters
    // at most).
    void start(const char* name, std::function<void(const std::atomic<bool>& stop)> work);
    void request_stop() { stop_.store(true, std::memory_order_relaxed); }
    bool stop_requested() const { return stop_.load(std::memory_order_relaxed); }
    // Asks the work to stop and waits for it.
    void stop();

private:
    std::thread thread_;
    std::atomic<bool> stop_{false};
};

}  // namespace ondrel
