#pragma once
#include <deque>
#include <functional>

#include "song/alerts.h"

namespace ondrel {

// The button a key chooses: Escape takes "Cancel" where there is one, else the first;
// Enter takes the alert's default.
int escape_button(const Alert& alert);
int enter_button(const Alert& alert);

// The alerts waiting for the user, drawn one at a time as modal popups. The engine raises
// its alerts synchronously (AlertSink::show): they only inform, so they are queued and the
// first button is taken. Questions from the program's own commands carry what to do with
// the answer.
class AlertQueue final : public AlertSink {
public:
    using Answer = std::function<void(int button)>;

    int show(const Alert& alert) override;
    void ask(Alert alert, Answer then);

    bool empty() const { return pending_.empty(); }
    const Alert* front() const { return pending_.empty() ? nullptr : &pending_.front().alert; }
    // The user chose button of the front alert; its answer runs after it is removed.
    void answer(int button);
    size_t size() const { return pending_.size(); }

private:
    struct Pending {
        Alert alert;
        Answer then;
    };
    std::deque<Pending> pending_;
};

}  // namespace ondrel
