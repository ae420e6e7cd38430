#pragma once
#include <cstdint>
#include <functional>
#include <string>

namespace ondrel {

// The file panel a command asked for. The window draws it; choosing a file posts the
// request's code with the path as the message's only ref.
struct FilePanelRequest {
    enum class Mode : uint8_t { Closed, Open, Save };
    Mode mode = Mode::Closed;
    uint32_t reply_code = 0;  // posted with the chosen path
    std::string title;
    std::string directory;
    std::string suggested_name;       // for saving
    std::function<void()> after;      // runs once the chosen file has been handled
    std::function<void()> on_cancel;  // runs when the panel is closed without a file
    bool open() const { return mode != Mode::Closed; }
    void close() { *this = FilePanelRequest{}; }
};

}  // namespace ondrel
