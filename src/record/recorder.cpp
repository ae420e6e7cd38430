#include "record/recorder.h"

#include <cstdarg>
#include <cstring>
#include <new>
#include <thread>

#include "record/error_alert.h"
#include "record/frame_convert.h"
#include "record/record_format.h"

namespace ondrel {

namespace {
constexpr size_t kMonitorValues = MonitorRing::kBytes / 2;

// The capture block made the current slot's sound: the record's header written over the
// first bytes captured, the data just after it, as the program has always done.
SampleRef sound_from_capture(SampleBlock block, uint32_t length, int mode) {
    const RecordFormat& f = record_format(mode);
    SampleRef s = sample_in_place(std::move(block), length);
    s->rate = kRecordRate;
    s->bits = static_cast<int16_t>(f.bits);
    s->stereo = static_cast<uint8_t>(mode & 1);
    s->framecode = frame_code(f.bits, f.channels == 2);
    s->loopon = 0;
    s->loopstart = 0;
    s->loopend = length;
    s->refnote = 72;
    s->volume = 128;
    s->default_words[3] = 0;
    return s;
}
}  // namespace

Recorder::Recorder(Mixer& mixer, AlertSink* alerts, RecordInput* input, std::FILE* diagnostics)
    : mixer_(mixer), alerts_(alerts), input_(input), diagnostics_(diagnostics), writer_([this] {
          return writer_round();
      }) {
    mixer_.set_monitor(&monitor_);
    mixer_.set_recorder(this);
}

Recorder::~Recorder() {
    if (isRecording()) StopRecording();
    if (isMonitoring()) StopRecording();
    mixer_.set_recorder(nullptr);
    mixer_.set_monitor(nullptr);
}

void Recorder::say(const char* format, ...) {
    if (!diagnostics_) return;
    va_list args;
    va_start(args, format);
    std::vfprintf(diagnostics_, format, args);
    va_end(args);
    std::fflush(diagnostics_);
}

void Recorder::Record(uint32_t code) {
    if (code == kMsgMoni) start_monitoring();
    if (code == kMsgReco) start_recording();
}

void Recorder::start_monitoring() {
    if (isMonitoring()) return;
    monitorWrite_.store(0, std::memory_order_relaxed);
    monitor_.read.store(8192 / 2, std::memory_order_relaxed);
    say("lance vox !! \n");
    isMonitoring_.store(true, std::memory_order_seq_cst);
    mixer_.monitor.store(1, std::memory_order_release);
    if (!isRecording() && !mixer_.frecmusic.load(std::memory_order_relaxed)) connect_input();
}

void Recorder::start_recording() {
    if (isRecording()) return;
    const int mode = samplermode.load(std::memory_order_relaxed) & 3;
    const bool disk = soundrecoutput.load(std::memory_order_relaxed) == 1;
    SampleBlock block;
    try {
        block = make_sample_block(sizeof(p_s) + kCaptureBlock + kSampleSlack);
    } catch (const std::bad_alloc&) {
        return;
    }
    if (disk) {
        const int e = d2dref_.empty() ? ENOENT : disk_.start(d2dref_, mode, block.get());
        if (e) {
            ErrorAlert(alerts_, diagnostics_, "create the recording file", e);
            return;
        }
        say("ecrit entete d2D !!! \n");
    }
    recordBuffer_ = block.get();
    block_ = std::move(block);
    mode_ = mode;
    to_disk_ = disk;
    recordPos_.store(0, std::memory_order_relaxed);
    total_.store(0, std::memory_order_relaxed);
    lost_.store(0, std::memory_order_relaxed);
    error_posted_ = false;
    isRecording_.store(true, std::memory_order_seq_cst);
    mixer_.record_to_file.store(1, std::memory_order_release);
    if (!isMonitoring() && !mixer_.frecmusic.load(std::memory_order_relaxed)) connect_input();
}

bool Recorder::connect_input() {
    const int32_t e =
        input_ ? input_->MakeRecordConnection(&Recorder::RecordFile, &Recorder::NotifyRecordFile, this)
               : ENODEV;
    if (e) {
        // The recording stays on, with nothing coming in until it is stopped.
        ErrorAlert(alerts_, diagnostics_, "connect to the selected sound input", e);
        return false;
    }
    input_->start(50000);
    return true;
}

void Recorder::tear_down_input() {
    if (!input_) return;
    input_->BreakRecordConnection();
    input_->clear_hooks();
}

RecordingResult Recorder::StopRecording() {
    RecordingResult result;
    const bool frecmusic = mixer_.frecmusic.load(std::memory_order_relaxed);
    if (!isRecording()) {
        say("stoppe seulement\n");
        if (isMonitoring()) {
            isMonitoring_.store(false, std::memory_order_seq_cst);
            mixer_.monitor.store(0, std::memory_order_release);
            if (!frecmusic) tear_down_input();
        }
        return result;
    }
    isRecording_.store(false, std::memory_order_seq_cst);
    mixer_.record_to_file.store(0, std::memory_order_release);
    // A hook that saw the recording on may still be storing: wait for it to leave.
    while (gate_.load(std::memory_order_seq_cst) != 0) std::this_thread::yield();
    result.stopped = true;
    result.bytes_lost = lost_.load(std::memory_order_relaxed);
    say("stoppe enreigstre\n");
    if (!isMonitoring()) {
        say("stoppe enreigstre BREAK !!! \n");
        if (!frecmusic) tear_down_input();
    }
    const uint32_t pos = recordPos_.load(std::memory_order_acquire);
    if (pos != 0) say("stoppe enreigstre 2 !!! \n");
    if (to_disk_) {
        // Even a recording stopped before any sound came leaves a whole file.
        result.error = disk_.stop(pos, record_format(mode_).block_align);
        result.file_bytes = disk_.last_length();
        if (result.error) ErrorAlert(alerts_, diagnostics_, "write the recording file", result.error);
    } else if (pos != 0) {
        say("len %lu   \n", static_cast<unsigned long>(pos));
        say("%p pointe sur \n", static_cast<void*>(recordBuffer_));
        result.sound = sound_from_capture(std::move(block_), pos, mode_);
    }
    block_.reset();
    recordBuffer_ = nullptr;
    recordPos_.store(0, std::memory_order_relaxed);
    return result;
}

bool Recorder::poll(Message& m) {
    if (from_output_.pop(m) || from_input_.pop(m)) return true;
    if (isRecording() && to_disk_ && disk_.error() && !error_posted_) {
        error_posted_ = true;
        m = Message{kMsgStre};
        return true;
    }
    return false;
}

void Recorder::RecordFile(const int16_t* samples, size_t bytes, const AudioFormat&) {
    hook(samples, bytes, from_output_);
}

void Recorder::RecordFile(void* cookie, int64_t, const void* data, size_t bytes, const AudioFormat&) {
    auto* self = static_cast<Recorder*>(cookie);
    // The input counts only while the song's output is not the source.
    if (self->mixer_.frecmusic.load(std::memory_order_relaxed)) return;
    self->hook(static_cast<const int16_t*>(data), bytes, self->from_input_);
}

void Recorder::NotifyRecordFile(void* cookie, int32_t code, const NotifyArgs&) {
    auto* self = static_cast<Recorder*>(cookie);
    if (code == kNotifyWillStop || code == kNotifyServiceEnded) self->from_input_.push(Message{kMsgStre});
}

void Recorder::hook(const int16_t* in, size_t bytes, SpscQueue<16>& posts) {
    uint32_t free = 0;
    if (!gate_.compare_exchange_strong(free, 1, std::memory_order_seq_cst)) return;
    const size_t frames = bytes / 4;
    const double g = record_gain(vrvol.load(std::memory_order_relaxed));
    if (isMonitoring_.load(std::memory_order_seq_cst) && !mixer_.frecmusic.load(std::memory_order_relaxed)) {
        size_t w = monitorWrite_.load(std::memory_order_relaxed);
        const MonitorPeaks peaks = scale_for_monitor(g, in, frames, &monitor_.ring[w], kMonitorValues - w);
        maxg.store(meter_of(peaks.left), std::memory_order_relaxed);
        maxd.store(meter_of(peaks.right), std::memory_order_relaxed);
        w += (bytes & ~size_t{1}) / 2;
        monitorWrite_.store(w >= kMonitorValues ? 0 : w, std::memory_order_relaxed);
    }
    if (isRecording_.load(std::memory_order_seq_cst)) store(in, frames, g, posts);
    if (mixer_.f_fftmode.load(std::memory_order_relaxed) == 2) {
        const size_t n = std::min<size_t>(frames, mixer_.Bufferfft1.size());
        for (size_t i = 0; i < n; ++i)
            mixer_.Bufferfft1[i].store((in[2 * i] & ~1) * (1.0 / 32768), std::memory_order_relaxed);
    }
    gate_.store(0, std::memory_order_seq_cst);
}

void Recorder::store(const int16_t* in, size_t frames, double g, SpscQueue<16>& posts) {
    uint32_t pos = recordPos_.load(std::memory_order_relaxed);
    if (pos >= kRecordLimit) {
        if (!to_disk_) {
            posts.push(Message{kMsgStre});
            return;
        }
        pos -= kRecordLimit;
    }
    const uint64_t total = total_.load(std::memory_order_relaxed);
    const uint64_t cap = stop_after_.load(std::memory_order_relaxed);
    if (cap && total >= cap) {
        posts.push(Message{kMsgStre});
        return;
    }
    const size_t align = record_format(mode_).block_align;
    size_t n_frames = std::min<size_t>(frames, (kCaptureBlock - pos) / align);
    if (cap) n_frames = std::min<size_t>(n_frames, (cap - total) / align);
    const size_t n = n_frames * align;
    if (n == 0) return;
    if (to_disk_) {
        // Each half of the ring is filled again only once the writer has written it.
        const uint64_t last_half = (total + n - 1) / kRingHalf;
        if (last_half >= 2 && disk_.halves_written() + 1 < last_half) {
            lost_.fetch_add(n, std::memory_order_relaxed);
            return;
        }
    }
    convert_frames(mode_, to_disk_, g, in, n_frames, recordBuffer_ + pos);
    if (to_disk_ && pos + n > kRecordLimit) {
        const uint32_t overflow = static_cast<uint32_t>(pos + n - kRecordLimit);
        std::memmove(recordBuffer_, recordBuffer_ + kRecordLimit, overflow);
        wrap_overflow_.store(overflow, std::memory_order_relaxed);
        wrap_buffer_.store(recordBuffer_, std::memory_order_relaxed);
        wraps_.fetch_add(1, std::memory_order_release);
        pos = overflow;
    } else {
        pos += static_cast<uint32_t>(n);
    }
    recordPos_.store(pos, std::memory_order_release);
    total_.store(total + n, std::memory_order_release);
    if (cap && total + n >= cap) posts.push(Message{kMsgStre});
}

bool Recorder::writer_round() {
    // The hook does no output of its own: its wraps are told from here.
    const uint64_t wraps = wraps_.load(std::memory_order_acquire);
    if (wraps != wraps_told_) {
        wraps_told_ = wraps;
        const uint32_t overflow = wrap_overflow_.load(std::memory_order_relaxed);
        const uint8_t* buffer = wrap_buffer_.load(std::memory_order_relaxed);
        say("retour  %lu %p %p \n", static_cast<unsigned long>(overflow), static_cast<const void*>(buffer),
            static_cast<const void*>(buffer + overflow));
    }
    return disk_.write_due(recordPos_.load(std::memory_order_acquire));
}

void install_recorded_sound(SongBank& bank, int slot, SampleRef sound) {
    bank.replace_sound(slot, sound);
}

}  // namespace ondrel
