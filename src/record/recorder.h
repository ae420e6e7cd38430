#pragma once
#include <atomic>
#include <cstdint>
#include <cstdio>
#include <memory>
#include <string>

#include "playback/messages.h"
#include "record/capture_hooks.h"
#include "record/d2d_writer_thread.h"
#include "record/disk_recording.h"
#include "record/record_input.h"
#include "render/mixer.h"
#include "render/output_taps.h"
#include "song/alerts.h"
#include "song/sample.h"
#include "song/song_bank.h"

namespace ondrel {

inline constexpr uint32_t kMsgMoni = fourcc("moni");
inline constexpr uint32_t kMsgReco = fourcc("reco");
inline constexpr uint32_t kMsgStre = fourcc("stre");

// Bytes of the capture block: the recording ring, plus room for the last buffer that runs
// past its end.
inline constexpr uint32_t kCaptureBlock = 722640;

// What stopping a recording gives back.
struct RecordingResult {
    bool stopped = false;  // a recording was running (not only monitoring)
    // Memory mode: the new sound record for the current slot, to be installed by the caller
    // (install_recorded_sound, or the shell's undoable edit). Empty when nothing was taken.
    SampleRef sound;
    // Disk mode: the file's length, and the first error (its alert has been shown).
    uint64_t file_bytes = 0;
    int error = 0;
    // Bytes the hook could not store because the writer had fallen a whole ring behind.
    uint64_t bytes_lost = 0;
};

// The recorder: the record hook for the audio input and for the song's own output, the
// monitor, memory recording, and disk recording through the ring and the writer thread.
//
// Threads: the window thread sets the options and calls Record, StopRecording and poll; the
// hook runs on the capture node's service thread (input) or the audio thread (output) and
// never allocates, locks, waits or writes; the writer thread "velmorad2d" writes the ring.
class Recorder final : public OutputRecorder {
public:
    // The recorder installs itself and its monitor ring in the mixer. input is how the audio
    // input is reached; none when there is no capture device.
    Recorder(Mixer& mixer, AlertSink* alerts, RecordInput* input = nullptr, std::FILE* diagnostics = stdout);
    ~Recorder() override;
    Recorder(const Recorder&) = delete;
    Recorder& operator=(const Recorder&) = delete;

    // Options of the recording panel. The format and destination are taken when a recording
    // starts; the gain counts at once.
    std::atomic<uint16_t> samplermode{1};
    std::atomic<uint16_t> soundrecoutput{0};  // 0 memory (a new sound), 1 disk file
    std::atomic<int16_t> vrvol{128};
    // Peak meters of the monitored input, left and right, 0-15.
    std::atomic<int16_t> maxg{0};
    std::atomic<int16_t> maxd{0};

    void set_input(RecordInput* input) { input_ = input; }
    // The file a disk recording goes to (d2dref).
    void set_d2dref(const std::string& path) { d2dref_ = path; }
    const std::string& d2dref() const { return d2dref_; }
    // For "NewSound:N" names (NewTempName).
    int& temp_name_counter() { return temp_counter_; }

    // 'moni' starts monitoring the input, 'reco' recording; other codes are ignored.
    void Record(uint32_t code);
    // Stop, or 'stre': ends the recording, else the monitoring.
    RecordingResult StopRecording();
    // The window's side of the hook's requests: 'stre' when the memory is full, the capture
    // node has stopped, a disk write failed, or the length asked for is reached.
    bool poll(Message& m);

    bool isRecording() const { return isRecording_.load(std::memory_order_acquire); }
    bool isMonitoring() const { return isMonitoring_.load(std::memory_order_acquire); }
    // The bytes stored in the current (or last) recording.
    uint64_t bytes_recorded() const { return total_.load(std::memory_order_acquire); }
    // The bytes of the current disk recording the writer has written (whole halves).
    uint64_t bytes_written() const { return disk_.halves_written() * kRingHalf; }
    // For a command line: the hook stores no more than this many bytes (0: no limit) and
    // then asks to stop. Set before the recording starts, or from the hook's own thread.
    void stop_after_bytes(uint64_t bytes) { stop_after_.store(bytes, std::memory_order_release); }
    uint64_t stop_after() const { return stop_after_.load(std::memory_order_acquire); }

    // The hook, from the mixer: the song's own output.
    void RecordFile(const int16_t* samples, size_t bytes, const AudioFormat& format) override;
    // The hooks given to the capture node, with the recorder as cookie.
    static void RecordFile(void* cookie, int64_t when, const void* data, size_t bytes,
                           const AudioFormat& format);
    static void NotifyRecordFile(void* cookie, int32_t code, const NotifyArgs& args);

private:
    void start_recording();
    void start_monitoring();
    bool connect_input();
    void tear_down_input();
    void hook(const int16_t* in, size_t bytes, SpscQueue<16>& posts);
    void store(const int16_t* in, size_t frames, double gain, SpscQueue<16>& posts);
    bool writer_round();
    void say(const char* format, ...) __attribute__((format(printf, 2, 3)));

    Mixer& mixer_;
    AlertSink* alerts_;
    RecordInput* input_;
    std::FILE* diagnostics_;
    std::string d2dref_;
    int temp_counter_ = 0;

    std::atomic<bool> isRecording_{false};
    std::atomic<bool> isMonitoring_{false};
    // Held by the hook while it runs: the two sources never run it together, and stopping
    // waits for a running hook to leave before it takes the capture block away.
    std::atomic<uint32_t> gate_{0};
    SpscQueue<16> from_output_;  // the audio thread's requests
    SpscQueue<16> from_input_;   // the capture node's
    bool error_posted_ = false;  // window thread

    // The recording, set by the window thread while no hook runs on it.
    SampleBlock block_;
    uint8_t* recordBuffer_ = nullptr;
    int mode_ = 1;
    bool to_disk_ = false;
    std::atomic<uint32_t> recordPos_{0};
    std::atomic<uint64_t> total_{0};
    std::atomic<uint64_t> stop_after_{0};
    std::atomic<uint64_t> lost_{0};
    // Ring wraps, told by the writer thread ("retour").
    std::atomic<uint64_t> wraps_{0};
    std::atomic<uint32_t> wrap_overflow_{0};
    std::atomic<const uint8_t*> wrap_buffer_{nullptr};
    uint64_t wraps_told_ = 0;  // writer thread

    MonitorRing monitor_;
    std::atomic<size_t> monitorWrite_{0};

    DiskRecording disk_;
    D2dWriterThread writer_;  // last: it stops before what it uses goes
};

// Puts a recorded sound into sound slot (0-based) of the current song, the render callback
// kept off it meanwhile; the slot's old record is freed.
void install_recorded_sound(SongBank& bank, int slot, SampleRef sound);

}  // namespace ondrel
