#pragma once
// Tiny songs and hand-set voices for exact checks of the mixer's output.
#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <vector>

#include "engine/engine.h"
#include "playback/tables.h"

namespace ondrel::test {

class MixerFixture : public ::testing::Test {
protected:
    Engine engine;
    Mixer& mixer = engine.mixer;
    Player& player = engine.player;
    TMOD& song() { return engine.bank.current(); }

    // A sample in instrument slot instrument (1-based) holding values, 8 or 16 bits.
    template <typename S>
    p_s& sample(int instrument, const std::vector<S>& values, bool stereo = false) {
        SampleRef s = make_sample(static_cast<uint32_t>(values.size() * sizeof(S)));
        std::memcpy(s->data, values.data(), values.size() * sizeof(S));
        s->bits = static_cast<int16_t>(8 * sizeof(S));
        s->rate = 44100;
        s->stereo = stereo;
        s->framecode = frame_code(s->bits, stereo);
        s->refnote = 48;
        p_s& ref = *s;
        engine.bank.t_sound[song().sndbase + instrument - 1] = std::move(s);
        return ref;
    }
    p_s& sample8(int instrument, const std::vector<int8_t>& values) { return sample(instrument, values); }
    // Starts voice on instrument at a step of step frames per output frame, which the
    // sample's rate gives exactly (the period plays the sample at its own rate).
    Voice& start_voice(int voice, int instrument, double step = 1.0, int track = 0) {
        if (p_s* s = engine.bank.song_sample(instrument - 1)) s->rate = static_cast<uint32_t>(44100 * step);
        Voice& v = player.nlist[voice];
        player.activate(voice);
        v.instrument = static_cast<uint16_t>(instrument);
        v.volume = 128;
        v.period = floatnote()[48];
        v.position = 0;
        v.fraction = 0;
        player.polytotrack[voice] = static_cast<int16_t>(track);
        return v;
    }
    // The buffer starts with a value no frame should keep: the mixer writes every frame.
    std::vector<float> render(int frames, uint32_t format = kFormatFloat) {
        std::vector<float> out(2 * static_cast<size_t>(frames), 9.0f);
        mixer.BufferProc(nullptr, out.data(), out.size() * 4, AudioFormat{44100.0f, 2, format});
        return out;
    }
    static float left(const std::vector<float>& b, int i) { return b[2 * i]; }
    static float right(const std::vector<float>& b, int i) { return b[2 * i + 1]; }
    // Pan position P gives the left side sin(P pi / 256) and the right sin((127 - P) pi / 256).
    static float pan_gain(int p) { return static_cast<float>(std::sin(p * M_PI / 256)); }
    // Output of an 8-bit value at unity gains and pan position 64, after the mixer's
    // headroom of a quarter.
    static float centred(int value) { return 0.25f * (value / 128.0f) * pan_gain(64); }
    static float centred_right(int value) { return 0.25f * (value / 128.0f) * pan_gain(63); }
};

}  // namespace ondrel::test
