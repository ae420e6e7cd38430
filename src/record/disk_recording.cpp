#include "record/disk_recording.h"

namespace ondrel {

int DiskRecording::start(const std::string& path, int samplermode, const uint8_t* ring) {
    std::lock_guard<std::mutex> guard(mutex_);
    if (const int e = file_.open(path)) return e;
    begin_d2d_header(d2dentete_, samplermode);
    D2dHeader written = d2dentete_;
    // A stream never gets its sizes written at the end: it says "to the end of the data".
    if (!file_.seekable()) unknown_d2d_sizes(written);
    if (const int e = file_.append(written.data(), written.size())) {
        file_.abandon();
        return e;
    }
    ring_ = ring;
    d2dpart_ = 0;
    halves_written_.store(0, std::memory_order_relaxed);
    error_.store(0, std::memory_order_relaxed);
    active_.store(true, std::memory_order_release);
    return 0;
}

void DiskRecording::write(uint32_t from, uint32_t bytes) {
    if (error_.load(std::memory_order_relaxed) || bytes == 0) return;
    if (const int e = file_.append(ring_ + from, bytes)) error_.store(e, std::memory_order_release);
}

void DiskRecording::write_half(uint16_t half) {
    write(half ? kRingHalf : 0, kRingHalf);
    d2dpart_ = half ? 0 : 1;
    halves_written_.fetch_add(1, std::memory_order_release);
}

bool DiskRecording::write_due(uint32_t recordPos) {
    std::lock_guard<std::mutex> guard(mutex_);
    if (!active_.load(std::memory_order_relaxed) || error_.load(std::memory_order_relaxed)) return false;
    if (recordPos < kRingHalf && d2dpart_ == 1) {
        write_half(1);
        return true;
    }
    if (recordPos > kRingHalf && d2dpart_ == 0) {
        write_half(0);
        return true;
    }
    return false;
}

int DiskRecording::stop(uint32_t recordPos, uint32_t block_align) {
    std::lock_guard<std::mutex> guard(mutex_);
    if (!active_.load(std::memory_order_relaxed)) return 0;
    if (recordPos < kRingHalf && d2dpart_ == 1) write_half(1);
    if (recordPos > kRingHalf && d2dpart_ == 0) write_half(0);
    if (d2dpart_ == 1) {
        write(kRingHalf, recordPos - kRingHalf);
        d2dpart_ = 0;
    } else {
        write(0, recordPos);
        d2dpart_ = 1;
    }
    // A failed write may have left part of a frame: the file keeps whole frames only.
    uint64_t length = file_.position();
    if (error_.load(std::memory_order_relaxed) && length > kD2dHeaderBytes && block_align > 1)
        length -= (length - kD2dHeaderBytes) % block_align;
    end_d2d_header(d2dentete_, static_cast<uint32_t>(length));
    const int finished = file_.finish(length, d2dentete_.data(), d2dentete_.size());
    if (finished && !error_.load(std::memory_order_relaxed))
        error_.store(finished, std::memory_order_release);
    last_length_ = length;
    ring_ = nullptr;
    active_.store(false, std::memory_order_release);
    return error_.load(std::memory_order_relaxed);
}

}  // namespace ondrel
