#pragma once
#include <cstdint>
#include <deque>
#include <string>

#include "edit/edit_step.h"

namespace ondrel {

// The undo and redo stacks of one song, and whether the song differs from its file.
class EditHistory {
public:
    // Steps kept at the least, whatever they weigh; beyond that the oldest go once the
    // history holds more than kBudgetBytes.
    static constexpr size_t kMinSteps = 256;
    static constexpr size_t kBudgetBytes = size_t{512} << 20;

    // Records a step just made; the redo stack is dropped.
    void push(EditStep step);
    bool can_undo() const { return !undo_.empty(); }
    bool can_redo() const { return !redo_.empty(); }
    const std::string& undo_label() const;
    const std::string& redo_label() const;
    // Swap the last step out again (undo) or back in (redo); false when there is none.
    bool undo(SongBank& bank, EffectSlots& slots);
    bool redo(SongBank& bank, EffectSlots& slots);
    size_t undo_depth() const { return undo_.size(); }

    // Forgets every step (a song loaded over this one, or killed).
    void clear();
    // The song now matches its file / has changes the file lacks.
    void mark_saved() { saved_state_ = state(); }
    void mark_changed_outside_history() { saved_state_ = kNeverSaved; }
    bool dirty() const { return saved_state_ != state(); }

private:
    struct Entry {
        EditStep step;
        uint64_t id;
        size_t bytes;  // weighed when made; the two versions it swaps weigh about the same
    };
    static constexpr uint64_t kNeverSaved = ~uint64_t{0};
    uint64_t state() const { return undo_.empty() ? base_state_ : undo_.back().id; }
    void trim();

    std::deque<Entry> undo_, redo_;
    uint64_t next_id_ = 1;
    uint64_t base_state_ = 0;  // the state below the oldest step kept
    uint64_t saved_state_ = 0;
    size_t bytes_ = 0;
};

}  // namespace ondrel
