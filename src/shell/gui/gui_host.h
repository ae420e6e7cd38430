#pragma once
#include <atomic>
#include <string>

struct SDL_Window;
struct SDL_Renderer;
union SDL_Event;

namespace ondrel {

class Program;
class MainWindow;

// The SDL window, its renderer and the Dear ImGui context: opens them, runs the frame loop
// until the program has quit, and closes them.
class GuiHost {
public:
    GuiHost() = default;
    ~GuiHost();
    GuiHost(const GuiHost&) = delete;
    GuiHost& operator=(const GuiHost&) = delete;

    // False with why set (one line) when there is no display.
    bool open(std::string& why);
    // Runs frames until program's quit is done; interrupted tells a signal asked to end.
    void run(Program& program, MainWindow& window, const std::atomic<bool>& interrupted);
    // One frame: takes in the queued commands, draws and presents.
    void frame(Program& program, MainWindow& window);
    // Writes what the window shows now as a BMP file.
    bool screenshot(const std::string& path) const;
    const char* renderer_name() const;
    SDL_Renderer* renderer() const { return renderer_; }

private:
    void handle_event(Program& program, const SDL_Event& event);
    void apply_full_screen(bool on);

    SDL_Window* window_ = nullptr;
    SDL_Renderer* renderer_ = nullptr;
    bool imgui_ready_ = false;
    bool full_screen_ = false;
    std::string title_;
};

}  // namespace ondrel
