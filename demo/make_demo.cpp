// Builds the demo song "Ondrel Morning": its samples are synthesised here and its
// patterns written note by note, then it is saved as a native module.
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <random>
#include <string>

#include "engine/engine.h"
#include "export/otm_writer.h"

using namespace ondrel;

namespace {

constexpr double kRate = 44100.0;
constexpr double kTwoPi = 6.283185307179586;
// One waveform cycle of 168 frames: 262.5 Hz at 44100 Hz, heard as note 72.
constexpr int kCycle = 168;

p_s& add_sample(Engine& e, int slot, const char* name, uint32_t frames, int volume) {
    SampleRef s = make_sample(frames * 2);
    s->rate = 44100;
    s->bits = 16;
    s->framecode = 1;
    s->volume = static_cast<int16_t>(volume);
    set_sample_name(*s, name, 31);
    p_s& ref = *s;
    e.bank.t_sound[e.bank.current().sndbase + slot] = std::move(s);
    return ref;
}

void put(p_s& s, uint32_t i, double v) {
    v = std::fmax(-1.0, std::fmin(1.0, v));
    const int16_t x = static_cast<int16_t>(std::lround(v * 32000));
    s.data[2 * i] = static_cast<uint8_t>(x & 0xff);
    s.data[2 * i + 1] = static_cast<uint8_t>((x >> 8) & 0xff);
}

void loop_whole(p_s& s, uint32_t first_frame) {
    s.loopon = 1;
    s.loopstart = first_frame * 2;
    s.loopend = s.length;
}

void make_samples(Engine& e) {
    std::mt19937 rng(1234);
    std::uniform_real_distribution<double> noise(-1.0, 1.0);

    p_s& kick = add_sample(e, 0, "kick", 9000, 128);
    double phase = 0;
    for (uint32_t i = 0; i < 9000; ++i) {
        const double t = i / kRate;
        phase += kTwoPi * (45.0 + 110.0 * std::exp(-t * 30.0)) / kRate;
        put(kick, i, std::sin(phase) * std::exp(-t * 9.0) * 1.1);
    }

    p_s& snare = add_sample(e, 1, "snare", 8000, 110);
    for (uint32_t i = 0; i < 8000; ++i) {
        const double t = i / kRate;
        put(snare, i, (noise(rng) * 0.7 + std::sin(kTwoPi * 190 * t) * 0.4) * std::exp(-t * 22.0));
    }

    p_s& hat = add_sample(e, 2, "hihat", 2500, 70);
    double prev = 0;
    for (uint32_t i = 0; i < 2500; ++i) {
        const double n = noise(rng);
        put(hat, i, (n - prev) * 0.5 * std::exp(-i / kRate * 60.0));
        prev = n;
    }

    // Bass: a saw cycle softened by a little low pass, looped.
    const uint32_t bass_frames = kCycle * 32;
    p_s& bass = add_sample(e, 3, "bass", bass_frames, 120);
    for (uint32_t i = 0; i < bass_frames; ++i) {
        const double x = (i % kCycle) / double(kCycle);
        put(bass, i, (2.0 * x - 1.0) * 0.6 + std::sin(kTwoPi * x) * 0.3);
    }
    loop_whole(bass, kCycle * 16);

    // Lead: a pulse with a decaying bright attack, looped on its steady part.
    const uint32_t lead_frames = kCycle * 64;
    p_s& lead = add_sample(e, 4, "lead", lead_frames, 90);
    for (uint32_t i = 0; i < lead_frames; ++i) {
        const double x = (i % kCycle) / double(kCycle);
        const double attack = i < kCycle * 32 ? 1.0 - i / double(kCycle * 32) : 0.0;
        put(lead, i, ((x < 0.3 ? 0.5 : -0.5) + std::sin(kTwoPi * 2 * x) * 0.25 * attack) * 0.8);
    }
    loop_whole(lead, kCycle * 32);

    // Pad: three detuned sines over a long loop.
    const uint32_t pad_frames = kCycle * 200;
    p_s& pad = add_sample(e, 5, "pad", pad_frames, 64);
    for (uint32_t i = 0; i < pad_frames; ++i) {
        const double x = i / double(kCycle);
        put(pad, i,
            (std::sin(kTwoPi * x) + std::sin(kTwoPi * x * 1.0035) * 0.8 + std::sin(kTwoPi * x * 2.0) * 0.3) *
                0.35);
    }
    loop_whole(pad, 0);
}

TNOTE& cell(Engine& e, int pattern, int row, int track) {
    return e.bank.song_pattern(pattern)->col[track][row];
}

void note(Engine& e, int pattern, int row, int track, int n, int instrument, int volume = 0, int command = 0,
          int parameter = 0) {
    cell(e, pattern, row, track) = {
        static_cast<uint8_t>(n),          static_cast<uint8_t>(volume),  0,
        static_cast<uint8_t>(instrument), static_cast<uint8_t>(command), static_cast<uint8_t>(parameter)};
}

void drums(Engine& e, int p, bool full) {
    for (int r = 0; r < 64; r += 8) note(e, p, r, 0, 72, 1);
    if (full) note(e, p, 58, 0, 72, 1, 80);
    for (int r = 4; r < 64; r += 8) note(e, p, r, 1, 72, 2);
    if (full) note(e, p, 62, 1, 74, 2, 60);
    for (int r = 0; r < 64; r += 2) note(e, p, r, 2, 72, 3, r % 4 ? 40 : 0, 14, 0xC2);
}

void bassline(Engine& e, int p, const int (&roots)[4]) {
    for (int bar = 0; bar < 4; ++bar)
        for (int step = 0; step < 16; step += 2) {
            const int r = bar * 16 + step;
            const int n = roots[bar] + (step == 6 || step == 14 ? 12 : 0);
            note(e, p, r, 3, n, 4, step == 0 ? 0 : 96);
        }
}

void build_patterns(Engine& e) {
    TMOD& m = e.bank.current();
    set_text(m.name, "Ondrel Morning");
    m.nbtrack = 6;
    m.speed = 6;
    m.tempo = 60000000 / 125;
    m.format = 2;
    m.globalvol = 96;
    const int seq[] = {0, 1, 2, 1, 2, 3};
    m.nbpos = sizeof seq / sizeof seq[0];
    for (int i = 0; i < m.nbpos; ++i) m.sequence[i] = static_cast<uint8_t>(seq[i]);
    // Pan positions: drums centred, bass a little left, lead right, pad wide left.
    const int pans[] = {64, 60, 80, 50, 88, 36};
    for (int t = 0; t < 6; ++t) m.trackvol[t] = static_cast<uint16_t>(pans[t]);
    m.nbvoice[5] = 3;  // the pad plays chords
    for (int p = 0; p < 4; ++p) e.bank.patcreate(m.patbase + p, m.nbtrack);

    const int roots_a[] = {48, 44, 46, 43};
    const int roots_b[] = {41, 43, 48, 48};
    // 0: intro, drums and bass fading in.
    drums(e, 0, false);
    bassline(e, 0, roots_a);
    note(e, 0, 0, 3, 48, 4, 20);
    note(e, 0, 1, 3, 0, 0, 0, 10, 0x20);
    // 1: the tune.
    drums(e, 1, true);
    bassline(e, 1, roots_a);
    const int tune[] = {72, 0, 75, 0, 79, 0, 77, 75, 74, 0, 72, 0, 70, 0, 72, 0};
    for (int i = 0; i < 16; ++i)
        if (tune[i]) note(e, 1, i * 4, 4, tune[i], 5, 0, i % 4 == 2 ? 4 : 0, 0x46);
    note(e, 1, 60, 4, 79, 5, 0, 3, 0x08);
    note(e, 1, 62, 4, 0, 0, 0, 10, 0x04);
    for (int bar = 0; bar < 4; ++bar) {
        note(e, 1, bar * 16, 5, roots_a[bar] + 12, 6, 64);
        note(e, 1, bar * 16 + 8, 5, roots_a[bar] + 19, 6, 48);
    }
    // 2: second half, arpeggiated pad chords.
    drums(e, 2, true);
    bassline(e, 2, roots_b);
    for (int bar = 0; bar < 4; ++bar) {
        note(e, 2, bar * 16, 5, roots_b[bar] + 12, 6, 72, 0, 0x47);
        for (int r = 1; r < 16; ++r) note(e, 2, bar * 16 + r, 5, 0, 0, 0, 0, 0x47);
    }
    const int answer[] = {84, 82, 79, 77, 79, 0, 75, 77};
    for (int i = 0; i < 8; ++i)
        if (answer[i]) note(e, 2, i * 8, 4, answer[i], 5, 80, 4, 0x34);
    // 3: outro; the last row slows down before the song ends.
    drums(e, 3, false);
    note(e, 3, 0, 3, 48, 4);
    note(e, 3, 0, 5, 60, 6, 80);
    note(e, 3, 16, 5, 67, 6, 64);
    note(e, 3, 32, 4, 72, 5, 64, 10, 0x01);
    note(e, 3, 48, 5, 0, 0, 0, 15, 100);
    note(e, 3, 56, 3, 0, 0, 0, 10, 0x04);
}

}  // namespace

int main(int argc, char** argv) {
    if (argc != 2) {
        std::fprintf(stderr, "usage: make_demo OUT.otm\n");
        return 2;
    }
    Engine e;
    make_samples(e);
    build_patterns(e);
    std::string why;
    if (!save_otm(argv[1], e.bank, e.bank.noimod, e.slots, why)) {
        std::fprintf(stderr, "make_demo: %s\n", why.c_str());
        return 1;
    }
    return 0;
}
