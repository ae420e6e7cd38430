#include "platform/fluid_synthesiser.h"

#include <fluidsynth.h>

#include <algorithm>
#include <filesystem>

namespace ondrel {

namespace {

// FluidSynth reports through a log function; the last error is what the user is told.
std::string& last_fluid_error() {
    static std::string text;
    return text;
}

void keep_error(int, const char* message, void*) {
    last_fluid_error() = message ? message : "";
}

MidiEvent event_of(uint8_t status, uint8_t data1, uint8_t data2, uint8_t size, uint32_t delay) {
    MidiEvent e;
    e.bytes = {status, data1, data2};
    e.size = size;
    e.delay_frames = delay;
    return e;
}

}  // namespace

std::string FluidSynthesiser::default_soundfont() {
    // Debian's General MIDI SoundFonts, the one the project installs first.
    for (const char* path : {"/usr/share/sounds/sf2/TimGM6mb.sf2", "/usr/share/sounds/sf2/default-GM.sf2",
                             "/usr/share/sounds/sf2/FluidR3_GM.sf2", "/usr/share/soundfonts/default.sf2"}) {
        std::error_code ec;
        if (std::filesystem::is_regular_file(path, ec)) return path;
    }
    return "";
}

std::unique_ptr<FluidSynthesiser> FluidSynthesiser::open(const std::string& path, double frame_rate,
                                                         MidiEventQueue& events, std::string& why) {
    fluid_set_log_function(FLUID_PANIC, keep_error, nullptr);
    fluid_set_log_function(FLUID_ERR, keep_error, nullptr);
    fluid_set_log_function(FLUID_WARN, nullptr, nullptr);
    fluid_set_log_function(FLUID_INFO, nullptr, nullptr);
    fluid_set_log_function(FLUID_DBG, nullptr, nullptr);
    const std::string soundfont = path.empty() ? default_soundfont() : path;
    if (soundfont.empty()) {
        why = "no General MIDI SoundFont is installed (package timgm6mb-soundfont)";
        return nullptr;
    }
    std::error_code ec;
    if (!std::filesystem::is_regular_file(soundfont, ec)) {
        why = "no SoundFont at " + soundfont;
        return nullptr;
    }
    std::unique_ptr<FluidSynthesiser> s(new FluidSynthesiser(events));
    // What was sent while no synthesiser listened is not played now.
    MidiEvent stale;
    while (events.pop(stale)) {
    }
    s->frame_rate_ = frame_rate;
    s->settings_ = new_fluid_settings();
    if (!s->settings_) {
        why = "FluidSynth could not start";
        return nullptr;
    }
    fluid_settings_setnum(s->settings_, "synth.sample-rate", frame_rate);
    // Only the audio thread plays it; its own mutex would be a lock in the callback.
    fluid_settings_setint(s->settings_, "synth.threadsafe-api", 0);
    fluid_settings_setint(s->settings_, "synth.cpu-cores", 1);
    // The mixer's headroom (a quarter) applies to the synthesiser too.
    fluid_settings_setnum(s->settings_, "synth.gain", 1.0);
    s->synth_ = new_fluid_synth(s->settings_);
    if (!s->synth_) {
        why = "FluidSynth could not start";
        return nullptr;
    }
    last_fluid_error().clear();
    if (fluid_synth_sfload(s->synth_, soundfont.c_str(), 1) == FLUID_FAILED) {
        why = "cannot load the SoundFont " + soundfont +
              (last_fluid_error().empty() ? std::string() : ": " + last_fluid_error());
        return nullptr;
    }
    s->soundfont_ = soundfont;
    return s;
}

FluidSynthesiser::~FluidSynthesiser() {
    if (synth_) delete_fluid_synth(synth_);
    if (settings_) delete_fluid_settings(settings_);
}

void FluidSynthesiser::queue_test_phrase() {
    const auto ms = [this](int n) { return static_cast<uint32_t>(frame_rate_ * n / 1000); };
    const MidiEvent phrase[] = {
        event_of(0xC0, 0, 0, 2, 0),           event_of(0x90, 48, 100, 3, 0),
        event_of(0x90, 52, 100, 3, ms(100)),  event_of(0x80, 48, 100, 3, ms(100)),
        event_of(0x90, 55, 100, 3, ms(200)),  event_of(0x80, 52, 100, 3, ms(200)),
        event_of(0x80, 55, 100, 3, ms(300)),
    };
    for (const MidiEvent& e : phrase) events_.push(e);
}

void FluidSynthesiser::apply(const MidiEvent& e) {
    const int channel = e.bytes[0] & 0x0F;
    const int data1 = e.bytes[1] & 0x7F, data2 = e.bytes[2] & 0x7F;
    switch (e.bytes[0] & 0xF0) {
        case 0x80: fluid_synth_noteoff(synth_, channel, data1); break;
        case 0x90:
            if (data2)
                fluid_synth_noteon(synth_, channel, data1, data2);
            else
                fluid_synth_noteoff(synth_, channel, data1);
            break;
        case 0xA0: fluid_synth_key_pressure(synth_, channel, data1, data2); break;
        case 0xB0: fluid_synth_cc(synth_, channel, data1, data2); break;
        case 0xC0: fluid_synth_program_change(synth_, channel, data1); break;
        case 0xD0: fluid_synth_channel_pressure(synth_, channel, data1); break;
        case 0xE0: fluid_synth_pitch_bend(synth_, channel, data1 | data2 << 7); break;
        default: break;  // system messages mean nothing to the synthesiser here
    }
}

bool FluidSynthesiser::render_add(float* out, int frames) {
    frames = std::min(frames, kMaxFramesPerCall);
    MidiEvent e;
    while (events_.pop(e)) {
        if (e.delay_frames == 0)
            apply(e);
        else if (delayed_count_ < kMaxDelayed)
            delayed_[delayed_count_++] = e;
    }
    // Delayed messages play at the start of the piece in which they fall due.
    for (int i = 0; i < delayed_count_;) {
        MidiEvent& d = delayed_[i];
        if (d.delay_frames <= static_cast<uint32_t>(frames)) {
            apply(d);
            d = delayed_[--delayed_count_];
        } else {
            d.delay_frames -= static_cast<uint32_t>(frames);
            ++i;
        }
    }
    // Nothing sounding: nothing to render (what is left of the reverb's tail is dropped).
    if (fluid_synth_get_active_voice_count(synth_) == 0) return false;
    fluid_synth_write_float(synth_, frames, left_.data(), 0, 1, right_.data(), 0, 1);
    for (int i = 0; i < frames; ++i) {
        out[2 * i] += left_[i];
        out[2 * i + 1] += right_[i];
    }
    return true;
}

}  // namespace ondrel
