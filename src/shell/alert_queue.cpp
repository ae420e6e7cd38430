#include "shell/alert_queue.h"

#include <utility>

namespace ondrel {

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
