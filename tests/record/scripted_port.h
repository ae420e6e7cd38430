#pragma once
// A control port that answers reads from a script, for time-outs and errors on demand.
#include <condition_variable>
#include <deque>
#include <mutex>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

#include "record/control_port.h"

namespace ondrel::test {

class ScriptedPort final : public ControlPort {
public:
    // Reads answered first, in order: "T" a time-out, "E5" error 5, "M" a message (a stop
    // command). Then written commands are delivered; a held port delivers only the quit
    // command and otherwise times out at once.
    explicit ScriptedPort(const std::string& script, bool hold = false) : hold_(hold) {
        std::istringstream in(script);
        for (std::string step; in >> step;) script_.push_back(step);
    }

    Read read(PortMessage& m, int64_t timeout_us, int32_t& error) override {
        std::unique_lock<std::mutex> lock(mutex_);
        timeouts_.push_back(timeout_us);
        m = PortMessage{};
        if (!script_.empty()) {
            const std::string step = script_.front();
            script_.pop_front();
            if (step == "T") return Read::TimedOut;
            if (step == "M") m.code = kPortStop;
            if (step[0] != 'E') return Read::Ok;
            error = std::stoi(step.substr(1));
            return Read::Failed;
        }
        for (;;) {
            for (auto it = commands_.begin(); it != commands_.end(); ++it) {
                if (hold_ && it->code != kPortQuit) continue;
                m = std::move(*it);
                commands_.erase(it);
                return Read::Ok;
            }
            if (closed_) {
                error = EBADF;
                return Read::Failed;
            }
            if (hold_) return Read::TimedOut;
            wake_.wait(lock);
        }
    }
    int32_t write(PortMessage m) override {
        std::lock_guard<std::mutex> guard(mutex_);
        if (closed_) return EBADF;
        commands_.push_back(std::move(m));
        wake_.notify_all();
        return 0;
    }
    bool post_buffer(const int16_t*, size_t, int64_t) override { return false; }
    void recycle(const PortMessage&) override {}
    void close() override {
        std::lock_guard<std::mutex> guard(mutex_);
        closed_ = true;
        wake_.notify_all();
    }
    std::vector<int64_t> timeouts() {
        std::lock_guard<std::mutex> guard(mutex_);
        return timeouts_;
    }

private:
    std::mutex mutex_;
    std::condition_variable wake_;
    std::deque<std::string> script_;
    std::deque<PortMessage> commands_;
    std::vector<int64_t> timeouts_;
    bool hold_;
    bool closed_ = false;
};

}  // namespace ondrel::test
