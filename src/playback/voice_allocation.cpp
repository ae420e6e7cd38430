#include <algorithm>

#include "playback/envelope.h"
#include "playback/player.h"

namespace ondrel {

int Player::track_to_poly(int track) {
    const TMOD& m = bank_.current();
    constexpr int kAuto = 127;
    int base = 0;
    int total = 0;
    for (int t = 0; t < m.nbtrack; ++t) {
        const int voices = m.nbvoice[t] == kAuto ? 1 : std::max<int>(m.nbvoice[t], 1);
        if (t < track) base += voices;
        total += voices;
    }
    if (track >= m.nbtrack) base = total;
    const int own = track >= 0 && track < kTracks ? m.nbvoice[track] : 1;
    int voice = base;
    if (own != kAuto) {
        voice = base + polytour[track];
        if (++polytour[track] >= std::max(own, 1)) polytour[track] = 0;
    } else {
        // Auto: the highest free voice above every track's reserved ones, else the
        // track's own slot.
        for (int v = kVoices - 1; v > total; --v) {
            if (!nlist[v].active) {
                voice = v;
                break;
            }
        }
    }
    voice = std::min(voice, kVoices - 1);
    polytotrack[voice] = static_cast<int16_t>(track);
    return voice;
}

float Player::compute_adsr(int kind, unsigned voice, unsigned long length, const p_s* env) const {
    if (!env || voice >= kVoices) return 0.0f;
    const Voice& v = nlist[voice];
    const uint64_t p = kind == 4 ? v.count1 : kind == 16 ? 192 : v.position;
    return envelope_value(*env, kind, p, length);
}

}  // namespace ondrel
