#include "song/tmod.h"

#include <cstring>

namespace ondrel {

void reset_track_tables(TMOD& m) {
    for (int t = 0; t < kTracks; ++t) {
        m.trackword1[t] = 0;
        m.nbvoice[t] = 1;
        m.trackpan[t] = 128;
        m.trackpan2[t] = 128;
        m.trackvol[t] = 64;
        m.trackc[t] = 128;
        m.trackd[t] = 128;
        m.tracke[t] = 0;
        m.trackf[t] = 0;
        m.trackg[t] = 0;
    }
}

void set_new_song_defaults(TMOD& m, int song) {
    std::memset(&m, 0, sizeof m);
    std::memset(m.patflag, 1, sizeof m.patflag);
    for (auto& pattern : m.patmark)
        for (auto& mark : pattern) mark = {kEmptyMark, 0};
    for (int i = 0; i < kEchoUnits; ++i) {
        m.echolen[i] = 44100;
        m.echolevel[i] = 75;
    }
    for (int s = 0; s < kEffectSlots; ++s) {
        m.efxa[s] = 64;
        m.efxb[s] = 192;
        m.efxc[s] = 4;
        m.efxd[s] = 10;
        m.efxval[s] = s < 64 ? 1000 : 0;
    }
    for (auto& r : m.rows) r = 64;
    m.globalvol = 64;
    reset_track_tables(m);
    m.format = 0;
    m.mode = 2;
    m.tempo = 480000;
    m.speed = 6;
    m.patbase = static_cast<int16_t>(song * kPatternsPerSong);
    m.sndbase = static_cast<int16_t>(song * kSamplesPerSong);
    m.nbtrack = 8;
    m.nbpos = 1;
    m.repeat = 0;
}

}  // namespace ondrel

namespace ondrel {

void bound_record(TMOD& m) {
    for (int t = 0; t < kTracks; ++t) {
        if (m.trackvol[t] > 127) m.trackvol[t] = 127;
        if (m.tracke[t] >= kEffectSlots) m.tracke[t] = 0;
        if (m.nbvoice[t] < 1) m.nbvoice[t] = 1;
        if (m.nbvoice[t] > 127) m.nbvoice[t] = 127;
    }
    for (int s = 0; s < kEffectSlots; ++s) {
        m.efxa[s] = static_cast<int16_t>(m.efxa[s] < 0 ? 0 : m.efxa[s] > 255 ? 255 : m.efxa[s]);
        m.efxb[s] = static_cast<int16_t>(m.efxb[s] < 0 ? 0 : m.efxb[s] > 255 ? 255 : m.efxb[s]);
    }
    for (auto& r : m.rows) {
        if (r < 1) r = 1;
        if (r > kMaxRows) r = kMaxRows;
    }
    if (m.nbtrack < 1) m.nbtrack = 1;
    if (m.nbtrack > kTracks) m.nbtrack = kTracks;
    if (m.tempo == 0) m.tempo = 480000;
    if (m.mode < 1 || m.mode > 3) m.mode = 2;
    m.name[sizeof m.name - 1] = 0;
    m.path[sizeof m.path - 1] = 0;
}

}  // namespace ondrel
