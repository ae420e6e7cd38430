#include "edit/edit_history.h"

namespace ondrel {

namespace {
const std::string kNothing;
}

void EditHistory::push(EditStep step) {
    if (step.empty()) return;
    for (const auto& e : redo_) bytes_ -= e.bytes;
    redo_.clear();
    const size_t bytes = step.bytes();
    bytes_ += bytes;
    undo_.push_back({std::move(step), next_id_++, bytes});
    trim();
}

void EditHistory::trim() {
    while (undo_.size() > kMinSteps && bytes_ > kBudgetBytes) {
        bytes_ -= undo_.front().bytes;
        base_state_ = undo_.front().id;
        undo_.pop_front();
    }
}

const std::string& EditHistory::undo_label() const {
    return undo_.empty() ? kNothing : undo_.back().step.label;
}

const std::string& EditHistory::redo_label() const {
    return redo_.empty() ? kNothing : redo_.back().step.label;
}

bool EditHistory::undo(SongBank& bank, EffectSlots& slots) {
    if (undo_.empty()) return false;
    Entry entry = std::move(undo_.back());
    undo_.pop_back();
    swap_with_live(entry.step, bank, slots);
    redo_.push_back(std::move(entry));
    return true;
}

bool EditHistory::redo(SongBank& bank, EffectSlots& slots) {
    if (redo_.empty()) return false;
    Entry entry = std::move(redo_.back());
    redo_.pop_back();
    swap_with_live(entry.step, bank, slots);
    undo_.push_back(std::move(entry));
    return true;
}

void EditHistory::clear() {
    undo_.clear();
    redo_.clear();
    bytes_ = 0;
    base_state_ = next_id_++;
    saved_state_ = base_state_;
}

}  // namespace ondrel
