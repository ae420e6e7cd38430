#include "edit/song_transaction.h"

#include <cstring>
#include <mutex>

#include "render/effect_units.h"

namespace ondrel {

SongTransaction::SongTransaction(SongBank& bank, EffectSlots& slots, std::string label)
    : bank_(bank), slots_(slots), label_(std::move(label)), song_(bank.noimod) {}

TMOD& SongTransaction::record() {
    if (!record_) {
        // The sequencer writes a few fields while it plays: copy between buffers.
        original_ = std::make_unique<TMOD>();
        std::lock_guard<StructureLock> guard(bank_.structure_lock());
        std::memcpy(static_cast<void*>(original_.get()), &live(), sizeof(TMOD));
        record_ = std::make_unique<TMOD>(*original_);
    }
    return *record_;
}

Pattern* SongTransaction::pattern(int local) {
    if (local < 0 || local >= kPatternsPerSong) return nullptr;
    auto it = patterns_.find(local);
    if (it == patterns_.end()) {
        const Pattern* live_pattern = bank_.pattern(song_ * kPatternsPerSong + local);
        if (!live_pattern) return nullptr;
        it = patterns_.emplace(local, copy_pattern(*live_pattern)).first;
    }
    return it->second.get();
}

const Pattern* SongTransaction::view_pattern(int local) const {
    if (local < 0 || local >= kPatternsPerSong) return nullptr;
    const auto it = patterns_.find(local);
    if (it != patterns_.end()) return it->second.get();
    return bank_.pattern(song_ * kPatternsPerSong + local);
}

void SongTransaction::set_pattern(int local, PatternRef pattern) {
    if (local < 0 || local >= kPatternsPerSong) return;
    patterns_[local] = std::move(pattern);
}

p_s* SongTransaction::sample(int local) {
    if (local < 0 || local >= kSamplesPerSong) return nullptr;
    auto it = samples_.find(local);
    if (it == samples_.end()) {
        const p_s* live_sample = bank_.sample(song_ * kSamplesPerSong + local);
        if (!live_sample) return nullptr;
        it = samples_.emplace(local, copy_sample(*live_sample)).first;
    }
    return it->second.get();
}

const p_s* SongTransaction::view_sample(int local) const {
    if (local < 0 || local >= kSamplesPerSong) return nullptr;
    const auto it = samples_.find(local);
    if (it != samples_.end()) return it->second.get();
    return bank_.sample(song_ * kSamplesPerSong + local);
}

void SongTransaction::set_sample(int local, SampleRef sample) {
    if (local < 0 || local >= kSamplesPerSong) return;
    samples_[local] = std::move(sample);
}

std::array<int16_t, kEffectSlots>& SongTransaction::effect_types() {
    if (!effect_types_) effect_types_ = slots_.efxtype;
    return *effect_types_;
}

const std::array<int16_t, kEffectSlots>& SongTransaction::view_effect_types() const {
    return effect_types_ ? *effect_types_ : slots_.efxtype;
}

ReverbSettings& SongTransaction::reverb(EffectUnits& units) {
    units_ = &units;
    if (!reverb_) reverb_ = units.firstreverb.settings();
    return *reverb_;
}

ReverbDHSSettings& SongTransaction::reverb_dhs(EffectUnits& units) {
    units_ = &units;
    if (!reverb_dhs_) reverb_dhs_ = units.secreverb.settings();
    return *reverb_dhs_;
}

bool SongTransaction::reverbs_changed() const {
    return (reverb_ && *reverb_ != units_->firstreverb.settings()) ||
           (reverb_dhs_ && *reverb_dhs_ != units_->secreverb.settings());
}

bool SongTransaction::changed() const {
    if (!patterns_.empty() || !samples_.empty()) return true;
    if (effect_types_ && *effect_types_ != slots_.efxtype) return true;
    if (reverbs_changed()) return true;
    return record_ && std::memcmp(record_.get(), original_.get(), sizeof(TMOD)) != 0;
}

EditStep SongTransaction::commit() {
    EditStep step;
    step.label = label_;
    step.song = song_;
    if (!changed()) return step;
    const bool record_changed = record_ && std::memcmp(record_.get(), original_.get(), sizeof(TMOD)) != 0;
    if (record_changed) step.record = std::move(record_);
    for (auto& [local, pattern] : patterns_) step.patterns.emplace_back(local, std::move(pattern));
    for (auto& [local, sample] : samples_) step.samples.emplace_back(local, std::move(sample));
    if (effect_types_ && *effect_types_ != slots_.efxtype) step.effect_types = effect_types_;
    if (reverb_ && *reverb_ != units_->firstreverb.settings()) step.reverb = reverb_;
    if (reverb_dhs_ && *reverb_dhs_ != units_->secreverb.settings()) step.reverb_dhs = reverb_dhs_;
    if (step.reverb || step.reverb_dhs) step.units = units_;
    patterns_.clear();
    samples_.clear();
    swap_with_live(step, bank_, slots_, record_changed ? original_.get() : nullptr);
    record_.reset();
    return step;
}

}  // namespace ondrel
