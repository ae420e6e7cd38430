#include "edit/edit_step.h"

#include <cstring>
#include <mutex>

namespace ondrel {

size_t EditStep::bytes() const {
    size_t n = sizeof(EditStep) + label.size();
    if (record) n += sizeof(TMOD);
    for (const auto& [local, pattern] : patterns)
        if (pattern)
            n += sizeof(Pattern) +
                 size_t(pattern->allocated_tracks()) * size_t(pattern->nrows) * sizeof(TNOTE);
    for (const auto& [local, sample] : samples)
        if (sample) n += sizeof(p_s) + sample->length + kSampleSlack;
    if (effect_types) n += sizeof(*effect_types);
    return n;
}

namespace {
void lay_changes_over(TMOD& edited, const TMOD& base, const TMOD& live) {
    TMOD merged;
    std::memcpy(static_cast<void*>(&merged), &live, sizeof(TMOD));
    auto* out = reinterpret_cast<unsigned char*>(&merged);
    const auto* mine = reinterpret_cast<const unsigned char*>(&edited);
    const auto* from = reinterpret_cast<const unsigned char*>(&base);
    for (size_t i = 0; i < sizeof(TMOD); ++i)
        if (mine[i] != from[i]) out[i] = mine[i];
    std::memcpy(static_cast<void*>(&edited), &merged, sizeof(TMOD));
}
}  // namespace

void swap_with_live(EditStep& step, SongBank& bank, EffectSlots& slots, const TMOD* merge_base) {
    if (step.song < 0 || step.song >= bank.nbimod) return;
    const int pattern_base = step.song * kPatternsPerSong;
    const int sample_base = step.song * kSamplesPerSong;
    if (step.record) {
        step.record->patbase = static_cast<int16_t>(pattern_base);
        step.record->sndbase = static_cast<int16_t>(sample_base);
    }
    {
        std::lock_guard<StructureLock> guard(bank.structure_lock());
        if (step.record) {
            if (merge_base) lay_changes_over(*step.record, *merge_base, *bank.timod[step.song]);
            bank.timod[step.song].swap(step.record);
        }
        for (auto& [local, pattern] : step.patterns) bank.p_pat[pattern_base + local].swap(pattern);
        for (auto& [local, sample] : step.samples) bank.t_sound[sample_base + local].swap(sample);
        if (step.effect_types) std::swap(slots.efxtype, *step.effect_types);
    }
    if (step.song == bank.noimod) bank.nbvoie = bank.current().nbtrack;
}

}  // namespace ondrel
