#pragma once
#include <string>
#include <vector>

namespace ondrel {

// A modal alert with its exact text and buttons; the GUI draws it, the CLI prints it.
struct Alert {
    std::string title;
    std::string text;
    std::vector<std::string> buttons;
    int default_button = -1;  // what Enter chooses; -1: the last button
};

class AlertSink {
public:
    virtual ~AlertSink() = default;
    // Returns the index of the button chosen.
    virtual int show(const Alert& alert) = 0;
};

// Keeps every alert raised; answers with the first button. Used headless.
class AlertLog : public AlertSink {
public:
    int show(const Alert& alert) override {
        shown.push_back(alert);
        return 0;
    }
    std::vector<Alert> shown;
};

}  // namespace ondrel
