#include "shell/sound_pitch.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <vector>

#include "playback/note_names.h"
#include "shell/fast_fourier_transform.h"
#include "shell/fft_windows.h"

namespace ondrel {

namespace {
constexpr int kPoints = 4096;

// Frame i of the sound, its channels averaged, full scale 1.0.
double frame_value(const p_s& s, uint32_t i) {
    const int channels = s.stereo ? 2 : 1;
    double sum = 0;
    for (int c = 0; c < channels; ++c) {
        const size_t at = static_cast<size_t>(i) * channels + static_cast<size_t>(c);
        if (s.bits == 16) {
            int16_t v;
            std::memcpy(&v, s.data + 2 * at, 2);
            sum += v / 32768.0;
        } else {
            sum += static_cast<int8_t>(s.data[at]) / 128.0;
        }
    }
    return sum / channels;
}
}  // namespace

std::string note_text(int note) {
    if (note < 0) return "----";
    char text[5];
    const_midit(std::min(note, 127), text);
    return text;
}

SoundPitch calcfft(const p_s& sound) {
    SoundPitch pitch;
    if (!sound.data || sound.length == 0) return pitch;
    const int bytes_per_frame = (sound.bits == 16 ? 2 : 1) * (sound.stereo ? 2 : 1);
    const uint32_t frames =
        std::min<uint32_t>(sound.length / static_cast<uint32_t>(bytes_per_frame), kPoints);
    std::vector<double> a(kPoints, 0.0);
    for (uint32_t i = 0; i < frames; ++i) a[i] = frame_value(sound, i);
    CFastFourierTransform fft(kPoints);
    fft.SetWindow(kPoints, Hamming);
    fft.DirectFFT(a.data());

    const auto power = [&](int k) {
        return k == kPoints / 2 ? a[1] * a[1] : a[2 * k] * a[2 * k] + a[2 * k + 1] * a[2 * k + 1];
    };
    int peak = 1;
    for (int k = 2; k <= kPoints / 2; ++k)
        if (power(k) > power(peak)) peak = k;
    if (!(power(peak) > 1e-18)) return pitch;
    double offset = 0;
    if (peak < kPoints / 2) {
        const double l = std::log(power(peak - 1) + 1e-30);
        const double c = std::log(power(peak));
        const double r = std::log(power(peak + 1) + 1e-30);
        const double curve = l - 2 * c + r;
        if (curve < 0) offset = std::clamp(0.5 * (l - r) / curve, -0.5, 0.5);
    }
    const double rate = sound.rate ? sound.rate : 44100.0;
    pitch.found = true;
    pitch.frequency = (peak + offset) * rate / kPoints;
    const double exact = 69 + 12 * std::log2(pitch.frequency / 440.0);
    pitch.note = std::clamp(static_cast<int>(std::lround(exact)), 0, 127);
    pitch.cents = (exact - pitch.note) * 100;
    pitch.note_name = note_text(pitch.note);
    return pitch;
}

}  // namespace ondrel
