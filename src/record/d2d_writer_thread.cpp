#include "record/d2d_writer_thread.h"

#include <pthread.h>

namespace ondrel {

D2dWriterThread::D2dWriterThread(Round round, std::chrono::microseconds period)
    : round_(std::move(round)), period_(period), thread_([this] { run(); }) {}

D2dWriterThread::~D2dWriterThread() {
    {
        std::lock_guard<std::mutex> guard(mutex_);
        quit_ = true;
    }
    wake_.notify_all();
    thread_.join();
}

void D2dWriterThread::run() {
    // Its priority stays the default: raising it needs privileges the program does not ask for.
    pthread_setname_np(pthread_self(), "velmorad2d");
    std::unique_lock<std::mutex> lock(mutex_);
    while (!quit_) {
        lock.unlock();
        const bool wrote = round_();
        lock.lock();
        if (!wrote) wake_.wait_for(lock, period_, [this] { return quit_; });
    }
}

}  // namespace ondrel
