#pragma once
// Tiny songs and hand-set voices for exact checks of the mixer's output.
#include <gtest/gtest.h>

#include <cstring>
#include <vector>

#include "engine/engine.h"
#include "playback/tables.h"
#include "render/pan_table.h"

namespace ondrel::test {

class MixerFixture : public ::testing::Test {
protected:
    Engine engine;
    Mixer& mixer = engine.mixer;
    Player& player = engine.player;
    TMOD& song() { return engine.bank.current(); }

    // An 8-bit mono sample in instrument slot instrument (1-based) holding values.
    p_s& sample8(int instrument, const std::vector<int8_t>& values, int rate = 44100) {
        SampleRef s = make_sample(static_cast<uint32_t>(values.size()));
        std::copy(values.begin(), values.end(), reinterpret_cast<int8_t*>(s->data));
        s->bits = 8;
        s->rate = static_cast<uint32_t>(rate);
        s->refnote = 48;
        p_s& ref = *s;
        engine.bank.t_sound[song().sndbase + instrument - 1] = std::move(s);
        return ref;
    }
    p_s& sample16(int instrument, const std::vector<int16_t>& values, bool stereo = false) {
        SampleRef s = make_sample(static_cast<uint32_t>(values.size() * 2));
        std::memcpy(s->data, values.data(), values.size() * 2);
        s->bits = 16;
        s->stereo = stereo;
        s->framecode = frame_code(16, stereo);
        s->rate = 44100;
        s->refnote = 48;
        p_s& ref = *s;
        engine.bank.t_sound[song().sndbase + instrument - 1] = std::move(s);
        return ref;
    }
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
    static constexpr float kStale = 9.0f;
    std::vector<float> render(int frames, uint32_t format = kFormatFloat) {
        std::vector<float> out(2 * static_cast<size_t>(frames), kStale);
        mixer.BufferProc(nullptr, out.data(), out.size() * 4, AudioFormat{44100.0f, 2, format});
        return out;
    }
    static float left(const std::vector<float>& b, int i) { return b[2 * i]; }
    static float right(const std::vector<float>& b, int i) { return b[2 * i + 1]; }
    // Output of an 8-bit value at unity gains and pan position 64, after the mixer's
    // headroom: the left side reads tab_pan[64], the right side tab_pan[127 - 64].
    static float centred(int value) { return 0.25f * (value / 128.0f) * tab_pan()[64]; }
    static float centred_right(int value) { return 0.25f * (value / 128.0f) * tab_pan()[63]; }
};

}  // namespace ondrel::test
