#include "export/midi_tempo_map.h"

#include <algorithm>
#include <cmath>

namespace ondrel {

namespace {
// 1000 beats a minute at the fastest: even hours between two notes then fit the file's
// 28-bit delta times. Only steps under 56 frames, which no sane tempo gives, are slowed.
constexpr uint32_t kFastestTempo = 60000;
constexpr uint32_t kSlowestTempo = 0xFFFFFF;  // what the tempo event's three bytes hold
}  // namespace

MidiTempoMap::MidiTempoMap(double frames_per_second, int first_step_frames) : rate_(frames_per_second) {
    tempo_.push_back({0, us_per_quarter(first_step_frames)});
    start_us_.push_back(0.0);
}

uint32_t MidiTempoMap::us_per_quarter(int step_frames) const {
    const double us = std::round(kStepsPerQuarter * static_cast<double>(step_frames) * 1e6 / rate_);
    return static_cast<uint32_t>(std::clamp<double>(us, kFastestTempo, kSlowestTempo));
}

void MidiTempoMap::step_length_from(uint64_t frame, int step_frames) {
    const uint32_t us = us_per_quarter(step_frames);
    if (us == tempo_.back().us_per_quarter) return;
    const uint32_t tick = tick_at(frame);
    if (tick == tempo_.back().tick) {
        // Two changes within one tick: the later one holds.
        tempo_.back().us_per_quarter = us;
        if (tempo_.size() > 1 && tempo_[tempo_.size() - 2].us_per_quarter == us) {
            tempo_.pop_back();
            start_us_.pop_back();
        }
        return;
    }
    const MidiTempo& last = tempo_.back();
    start_us_.push_back(start_us_.back() +
                        static_cast<double>(tick - last.tick) * last.us_per_quarter / kDivision);
    tempo_.push_back({tick, us});
}

uint32_t MidiTempoMap::tick_at(uint64_t frame) const {
    const double us = static_cast<double>(frame) * 1e6 / rate_;
    const size_t i =
        static_cast<size_t>(std::upper_bound(start_us_.begin(), start_us_.end(), us) - start_us_.begin()) - 1;
    const double ticks = std::round((us - start_us_[i]) * kDivision / tempo_[i].us_per_quarter);
    return static_cast<uint32_t>(std::min<double>(tempo_[i].tick + ticks, UINT32_MAX));
}

}  // namespace ondrel
