#include "shell/background_thread.h"

#include <pthread.h>
#include <sys/resource.h>
#include <unistd.h>

#include <string>

namespace ondrel {

void BackgroundThread::start(const char* name, std::function<void(const std::atomic<bool>& stop)> work) {
    stop();
    stop_.store(false, std::memory_order_relaxed);
    thread_ = std::thread([this, label = std::string(name), work = std::move(work)] {
        pthread_setname_np(pthread_self(), label.substr(0, 15).c_str());
        // Disk and content sniffing nobody waits for: drawing and sound go first.
        setpriority(PRIO_PROCESS, static_cast<id_t>(gettid()), 10);
        work(stop_);
    });
}

void BackgroundThread::stop() {
    request_stop();
    if (thread_.joinable()) thread_.join();
}

}  // namespace ondrel
