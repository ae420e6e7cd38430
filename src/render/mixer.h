#pragma once
#include <array>
#include <atomic>
#include <cstdint>

#include "playback/player.h"
#include "render/audio_format.h"
#include "render/effect_processor.h"
#include "render/output_taps.h"
#include "render/sound_preview.h"
#include "render/voice_mix.h"
#include "song/effect_slots.h"
#include "song/song_bank.h"

namespace ondrel {

inline constexpr int kMaxFramesPerCall = 4096;  // larger buffers are rendered in such parts

// The render callback and the mixer's options and meters. BufferProc runs on the audio
// thread; the options are set from the window thread.
class Mixer {
public:
    Mixer(SongBank& bank, EffectSlots& slots, Player& player);

    // Options ("Tempo", "Sound Quality", global pitch, mute) and the analyser switch.
    std::atomic<uint8_t> ftemp{1};       // "Tempo": 1 = a sequencer step per half-tick, 0 = per buffer
    std::atomic<int16_t> qual{0};        // "Sound Quality": 0 "Normal", 1 "Interpolation"
    std::atomic<int16_t> valpitch{128};  // global pitch, 1..255, 128 = normal
    std::array<std::atomic<uint8_t>, kTracks> mute{};  // non-zero: the track is not heard
    std::atomic<int16_t> f_fftmode{0};                 // 1: the analyser takes the output (Bufferfft1)
    std::atomic<uint8_t> frecmusic{0};                 // 1: the song's own output is being recorded
    std::atomic<uint8_t> record_to_file{0};            // 1: that recording goes to the recorder tap
    std::atomic<uint8_t> monitor{0};                   // 1: the monitored input is mixed into the output
    std::atomic<bool> measure_load{true};              // powermusic; offline renders have no deadline to meet

    // Meters and counters, read by the window thread.
    std::atomic<float> lmax{0};        // peak of the left channel in the last buffer, 0..1
    std::atomic<float> rmax{0};        // peak of the right channel
    std::atomic<float> powermusic{0};  // time spent over the buffer's duration (1 = all of it)
    std::atomic<uint32_t> nbpass{0};   // render calls so far
    std::atomic<uint32_t> pass{0};     // effect stages run so far
    std::array<std::atomic<double>, 512> Bufferfft1{};  // mono copy of the output for the analyser

    double bpmreste = 0;  // frames of the current tick still owed; audio thread only

    void set_effects(EffectProcessor* units) { units_ = units; }
    void set_recorder(OutputRecorder* recorder) { recorder_ = recorder; }
    void set_monitor(MonitorRing* ring) { monitor_ring_ = ring; }
    void set_preview(SoundPreview* preview) { preview_ = preview; }
    // The synthesiser may be swapped while the callback runs; the old one must outlive
    // the callback in progress (the caller takes the structure lock before freeing it).
    void set_synth(SynthSource* synth) { synth_.store(synth, std::memory_order_release); }
    SynthSource* synth() const { return synth_.load(std::memory_order_acquire); }

    // Frames rendered since the mixer was made: the clock of the sequencer's steps.
    uint64_t frames_rendered() const { return frames_rendered_; }

    // The callback: fills size bytes of interleaved stereo float at buffer.
    void BufferProc(void* cookie, void* buffer, unsigned long size, const AudioFormat& format);

    // The tick length in frames for the song's tempo and the global pitch.
    double tick_frames() const;

private:
    // What every voice of a piece shares, read once a piece rather than once a voice.
    struct PieceSettings {
        double frame_rate;
        double pitch_factor;  // the global pitch's effect on every step; 1 at 128
        bool interpolate;     // "Interpolation" chosen for every sample
        float master;         // globalvol / 64
        int mode;             // pan mode
    };

    void render_call(float* out, int frames, const AudioFormat& format);
    void number_routed_slots(const TMOD& m);
    void render_piece(float* out, int c0, int n, const TMOD& m, double frame_rate);
    void render_voice(int vi, float* out, int c0, int n, const TMOD& m, const PieceSettings& piece);
    // Runs the routed slots' units; true when one ran (and may have added sound).
    bool effect_stage(float* out, int frames, TMOD& m);
    // Headroom and clip (skipped for a buffer known to be silent), then the output taps.
    void output_stage(float* out, int frames, const AudioFormat& format, bool silent);

    SongBank& bank_;
    EffectSlots& slots_;
    Player& player_;
    const std::array<float, 128>& tab_pan_;
    const std::array<float, 128>& floatnote_;
    // The mix loops this CPU runs, picked once: [16-bit][interpolated][SendMode][OutMode].
    VoiceMixFn voice_loops_[2][2][3][2]{};
    StereoMixFn stereo_loops_[2][2]{};  // [16-bit][OutMode]
    EffectProcessor* units_ = nullptr;
    OutputRecorder* recorder_ = nullptr;
    MonitorRing* monitor_ring_ = nullptr;
    SoundPreview* preview_ = nullptr;
    std::atomic<SynthSource*> synth_{nullptr};
    uint64_t frames_rendered_ = 0;  // audio thread

    // Per piece: the control value of each slot, its compact number, and whether a voice
    // has written its send buffer yet.
    std::array<int16_t, kEffectSlots> control_{};
    std::array<int16_t, kEffectSlots> compact_{};
    std::array<uint8_t, kEffectSlots + 1> written_{};  // by compact number
    std::array<int16_t, kEffectSlots> routed_{};       // slots numbered, in order
    int routed_count_ = 0;
    std::array<int16_t, kEffectSlots> routed_by_slot_{};  // the same, by slot number
    int routed_by_slot_count_ = 0;
    std::array<int16_t, 8192> bufferrecmusic_{};
    bool piece_has_setter_ = false;  // a voice has set the current piece's frames
};

}  // namespace ondrel
