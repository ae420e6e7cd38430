#include "render/sound_preview.h"

#include <algorithm>
#include <mutex>

namespace ondrel {

namespace {
constexpr float kGain = 2.0f;  // about as loud as a note, once the output stage's quarter is taken

float sample_at(const p_s& s, uint32_t frame, int channel) {
    const uint32_t index = s.stereo ? frame * 2 + uint32_t(channel) : frame;
    if (s.bits == 16) return float(reinterpret_cast<const int16_t*>(s.data)[index]) * (1.0f / 32768.0f);
    return float(reinterpret_cast<const int8_t*>(s.data)[index]) * (1.0f / 128.0f);
}
}  // namespace

void SoundPreview::play(SampleRef sound, uint32_t first, uint32_t end, StructureLock& lock) {
    const uint32_t frames = sound && sound->data ? sound->frames() : 0;
    end = end == 0 ? frames : std::min(end, frames);
    first = std::min(first, end);
    {
        std::lock_guard<StructureLock> guard(lock);
        sound_.swap(sound);
        position_ = first;
        end_ = end;
        active_.store(first < end, std::memory_order_relaxed);
    }
    // The sound that played before is freed here, outside the swap.
}

void SoundPreview::stop(StructureLock& lock) {
    SampleRef old;
    std::lock_guard<StructureLock> guard(lock);
    active_.store(false, std::memory_order_relaxed);
    sound_.swap(old);
}

bool SoundPreview::mix(float* out, int frames, double frame_rate) {
    if (!active_.load(std::memory_order_relaxed) || !sound_ || !sound_->data) return false;
    const p_s& s = *sound_;
    const double step = double(s.rate ? s.rate : 44100) / frame_rate;
    for (int i = 0; i < frames; ++i) {
        const auto frame = static_cast<uint32_t>(position_);
        if (frame >= end_) {
            active_.store(false, std::memory_order_relaxed);
            return true;
        }
        const float left = sample_at(s, frame, 0);
        out[2 * i] += left * kGain;
        out[2 * i + 1] += (s.stereo ? sample_at(s, frame, 1) : left) * kGain;
        position_ += step;
    }
    return true;
}

}  // namespace ondrel
