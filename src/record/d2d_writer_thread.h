#pragma once
#include <chrono>
#include <condition_variable>
#include <functional>
#include <mutex>
#include <thread>

namespace ondrel {

// The disk writer thread "velmorad2d" (D2DREADWRITE): started once, it runs a round of
// work, at once again when the round wrote something, else 50 ms later; until destroyed.
class D2dWriterThread {
public:
    using Round = std::function<bool()>;  // true when it wrote

    explicit D2dWriterThread(Round round,
                             std::chrono::microseconds period = std::chrono::microseconds(50000));
    ~D2dWriterThread();
    D2dWriterThread(const D2dWriterThread&) = delete;
    D2dWriterThread& operator=(const D2dWriterThread&) = delete;

private:
    void run();

    Round round_;
    std::chrono::microseconds period_;
    std::mutex mutex_;
    std::condition_variable wake_;
    bool quit_ = false;
    std::thread thread_;
};

}  // namespace ondrel
