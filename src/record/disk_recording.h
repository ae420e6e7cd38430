#pragma once
#include <atomic>
#include <cstdint>
#include <mutex>
#include <string>

#include "record/d2d_header.h"
#include "record/recording_file.h"

namespace ondrel {

// Bytes of the recording ring (and of a memory recording): recordLimit.
inline constexpr uint32_t kRecordLimit = 705600;
inline constexpr uint32_t kRingHalf = kRecordLimit / 2;

// The disk side of a recording: the file (filed2d), its header (d2dentete) and which half of
// the ring is due next (d2dpart). The writer thread and the stop path take turns under its
// lock; the record hook only reads how many halves have been written.
class DiskRecording {
public:
    // Opens the file and writes the header for samplermode over the ring; 0 or errno.
    int start(const std::string& path, int samplermode, const uint8_t* ring);
    // One round of the writer thread with the hook's ring position: writes the half that
    // is complete, if one is due. True when it wrote.
    bool write_due(uint32_t recordPos);
    // Writes what remains of the ring, cuts the file at its position (back to a whole
    // frame after a failed write), writes the sizes into the header and puts the file in
    // place. Returns the first error of the recording, 0 when there was none.
    int stop(uint32_t recordPos, uint32_t block_align);

    bool active() const { return active_.load(std::memory_order_acquire); }
    // Halves written since the recording started; the hook never fills a half the writer
    // has not written yet.
    uint64_t halves_written() const { return halves_written_.load(std::memory_order_acquire); }
    // The first write error, 0 while all is well.
    int error() const { return error_.load(std::memory_order_acquire); }
    // The file's length when the last recording stopped.
    uint64_t last_length() const { return last_length_; }
    const D2dHeader& header() const { return d2dentete_; }

private:
    // Under mutex_.
    void write(uint32_t from, uint32_t bytes);
    void write_half(uint16_t half);

    std::mutex mutex_;
    RecordingFile file_;
    D2dHeader d2dentete_{};
    const uint8_t* ring_ = nullptr;
    uint16_t d2dpart_ = 0;
    std::atomic<bool> active_{false};
    std::atomic<uint64_t> halves_written_{0};
    std::atomic<int> error_{0};
    uint64_t last_length_ = 0;
};

}  // namespace ondrel
