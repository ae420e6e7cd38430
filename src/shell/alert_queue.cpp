#include "shell/alert_queue.h"

#include <utility>

namespace ondrel {

int escape_button(const Alert& alert) {
    for (size_t i = 0; i < alert.buttons.size(); ++i)
        if (alert.buttons[i] == "Cancel") return static_cast<int>(i);
    return 0;
}

int enter_button(const Alert& alert) {
    const int count = static_cast<int>(alert.buttons.size());
    if (alert.default_button >= 0 && alert.default_button < count) return alert.default_button;
    return count > 0 ? count - 1 : 0;
}

int AlertQueue::show(const Alert& alert) {
    pending_.push_back({alert, nullptr});
    return 0;
}

void AlertQueue::ask(Alert alert, Answer then) {
    pending_.push_back({std::move(alert), std::move(then)});
}

void AlertQueue::answer(int button) {
    if (pending_.empty()) return;
    Pending done = std::move(pending_.front());
    pending_.pop_front();
    if (done.then) done.then(button);
}

}  // namespace ondrel
