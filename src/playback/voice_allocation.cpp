#include <algorithm>

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
    uint64_t p = kind == 4 ? v.count1 : kind == 16 ? 192 : v.position;
    // Kind 16 reads the velocity envelope's points at a fixed place.
    const int k = kind == 16 ? 0 : std::clamp(kind, 0, 4);
    int x = 0;
    if (length != 0) x = static_cast<int>(std::min<uint64_t>(p * 255 / length, 255));
    int px[5], level[5];
    for (int j = 0; j < 5; ++j) {
        px[j] = env->env(k, j) >> 8;
        level[j] = env->env(k, j) & 0xff;
    }
    int value = 0;
    if (x < px[1])
        value = level[0] + (level[1] - level[0]) * x / px[1];
    else
        for (int j = 2; j <= 4; ++j)
            if (x < px[j]) {
                value = level[j - 1] + (level[j] - level[j - 1]) * (x - px[j - 1]) / (px[j] - px[j - 1]);
                break;
            }
    switch (kind) {
        case 1: return static_cast<float>(value * 2);
        case 2: return static_cast<float>(std::min(value, 127));
        case 3: return static_cast<float>(value);
        default: return static_cast<float>(value) / 128.0f;
    }
}

}  // namespace ondrel
