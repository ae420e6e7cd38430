#pragma once
#include <chrono>
#include <functional>
#include <thread>

namespace ondrel::test {

// True as soon as done() is, false after ten seconds without.
inline bool wait_until(const std::function<bool()>& done) {
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(10);
    for (;;) {
        if (done()) return true;
        if (std::chrono::steady_clock::now() > deadline) return false;
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
    }
}

}  // namespace ondrel::test
