#include "edit/edit_step.h"

#include <algorithm>
#include <cstring>
#include <mutex>

#include "render/effect_units.h"

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
    if (reverb) n += sizeof(*reverb);
    if (reverb_dhs) n += sizeof(*reverb_dhs);
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

// Lines only grow here: a longer line than a delay needs is harmless, a shorter one would
// cut the delay short until the swap.
void grow_echo_lines(const TMOD& incoming, const TMOD& live, EffectSlots& slots, StructureLock& lock) {
    for (int u = 0; u < kEchoUnits; ++u) {
        if (incoming.echolen[u] == live.echolen[u]) continue;
        const uint32_t frames = std::min(std::max(incoming.echolen[u], live.echolen[u]), kMaxEchoFrames);
        if (slots.sizeecho[u] < 4 * frames + 1024) slots.reserve_echo_line(u, frames, lock);
    }
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
    if (step.record) grow_echo_lines(*step.record, *bank.timod[step.song], slots, bank.structure_lock());
    {
        std::lock_guard<StructureLock> guard(bank.structure_lock());
        if (step.units && step.reverb) step.units->firstreverb.swap_settings(*step.reverb);
        if (step.units && step.reverb_dhs) step.units->secreverb.swap_settings(*step.reverb_dhs);
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
