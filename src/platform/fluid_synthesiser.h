#pragma once
#include <array>
#include <memory>
#include <string>

#include "playback/midi_event_queue.h"
#include "render/mixer.h"
#include "render/output_taps.h"

struct _fluid_synth_t;
struct _fluid_hashtable_t;

namespace ondrel {

// The General MIDI software synthesiser: FluidSynth with a SoundFont, rendered by the
// mixer inside the audio callback, so its sound goes through the meters, the recorder and
// the analyser like the song's own. Messages reach it through its queue from any thread;
// the audio thread applies them before each piece it renders. FluidSynth's own locking is
// off: only the audio thread touches the synthesiser once it is handed over. The queue
// belongs to the caller and outlives the synthesiser, so a sender that still holds it
// when the synthesiser is closed writes into memory that is still there.
class FluidSynthesiser final : public SynthSource {
public:
    // Loads the SoundFont at path (the default General MIDI one when empty). Null with why
    // set when FluidSynth or the SoundFont cannot be had.
    static std::unique_ptr<FluidSynthesiser> open(const std::string& path, double frame_rate,
                                                  MidiEventQueue& events, std::string& why);
    ~FluidSynthesiser() override;
    FluidSynthesiser(const FluidSynthesiser&) = delete;
    FluidSynthesiser& operator=(const FluidSynthesiser&) = delete;

    // The first General MIDI SoundFont installed on the system, or empty.
    static std::string default_soundfont();

    const std::string& soundfont() const { return soundfont_; }

    // Queues the short phrase that tells the user the synthesiser is there: program 0 on
    // channel 1, then notes 48, 52 and 55, each 100 ms after the one before.
    void queue_test_phrase();

    bool render_add(float* out, int frames) override;

private:
    explicit FluidSynthesiser(MidiEventQueue& events) : events_(events) {}
    void apply(const MidiEvent& e);

    _fluid_hashtable_t* settings_ = nullptr;
    _fluid_synth_t* synth_ = nullptr;
    std::string soundfont_;
    double frame_rate_ = 44100;
    MidiEventQueue& events_;
    // Messages waiting for their delay, counted down by the frames rendered.
    static constexpr int kMaxDelayed = 32;
    std::array<MidiEvent, kMaxDelayed> delayed_{};
    int delayed_count_ = 0;
    std::array<float, kMaxFramesPerCall> left_{};
    std::array<float, kMaxFramesPerCall> right_{};
};

}  // namespace ondrel
