#pragma once
#include <atomic>
#include <cstdint>

#include "shell/background_thread.h"
#include "shell/gui/streaming_texture.h"

struct SDL_Renderer;

namespace ondrel {

class Program;

// The "FFT Window": the analyser's 512 x 128 drawing scaled into the window, "0 Hz" and
// "22050 Hz" under it, the "Source" and "View" menus. While it is open its render thread
// ("render_thread") asks every 75 ms for a new drawing: it marks one due and wakes the
// frame loop with an event; the frame then draws the analyser block. Nothing else is shared.
class AnalyserWindow {
public:
    explicit AnalyserWindow(SDL_Renderer* renderer);
    ~AnalyserWindow();
    AnalyserWindow(const AnalyserWindow&) = delete;
    AnalyserWindow& operator=(const AnalyserWindow&) = delete;

    void draw(Program& p);

private:
    void refresh(const std::atomic<bool>& stop);

    StreamingTexture texture_;
    uint32_t wake_event_;
    std::atomic<bool> due_{false};
    bool open_ = false;
    BackgroundThread render_thread_;  // last: stopped before what it uses goes
};

}  // namespace ondrel
