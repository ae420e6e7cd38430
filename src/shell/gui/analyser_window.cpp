#include "shell/gui/analyser_window.h"

#include <SDL.h>
#include <imgui.h>

#include <chrono>
#include <thread>

#include "shell/gui/menu_bar.h"
#include "shell/program.h"

namespace ondrel {

namespace {
constexpr auto kPeriod = std::chrono::microseconds(kAnalyserPeriodUs);
constexpr auto kStopCheck = std::chrono::milliseconds(5);  // how soon closing the window ends the thread
}  // namespace

AnalyserWindow::AnalyserWindow(SDL_Renderer* renderer)
    : texture_(renderer, kAnalyserWidth, kAnalyserHeight), wake_event_(SDL_RegisterEvents(1)) {}

AnalyserWindow::~AnalyserWindow() {
    render_thread_.stop();
}

void AnalyserWindow::refresh(const std::atomic<bool>& stop) {
    using clock = std::chrono::steady_clock;
    auto next = clock::now();
    while (!stop.load(std::memory_order_relaxed)) {
        // 75 ms after the previous wake-up, not after the previous drawing.
        next += kPeriod;
        for (auto now = clock::now(); now < next && !stop.load(std::memory_order_relaxed); now = clock::now())
            std::this_thread::sleep_for(std::min<clock::duration>(next - now, kStopCheck));
        due_.store(true, std::memory_order_release);
        if (wake_event_ != uint32_t(-1)) {
            SDL_Event wake{};
            wake.type = wake_event_;
            SDL_PushEvent(&wake);
        }
    }
}

void AnalyserWindow::draw(Program& p) {
    if (!p.windows.analyser) {
        if (open_) render_thread_.stop();
        open_ = false;
        return;
    }
    if (!open_) {
        open_ = true;
        due_.store(true, std::memory_order_relaxed);
        render_thread_.start("render_thread", [this](const std::atomic<bool>& stop) { refresh(stop); });
    }
    if (due_.exchange(false, std::memory_order_acquire)) {
        p.analyser.Draw(p.engine.mixer.Bufferfft1);
        texture_.update(p.analyser.pixels().data());
    }
    ImGui::SetNextWindowSize(ImVec2(kAnalyserWidth + 16, kAnalyserHeight * 2 + 80), ImGuiCond_FirstUseEver);
    ImGui::SetNextWindowPos(ImVec2(380, 150), ImGuiCond_FirstUseEver);
    if (ImGui::Begin("FFT Window", &p.windows.analyser,
                     ImGuiWindowFlags_MenuBar | ImGuiWindowFlags_NoSavedSettings)) {
        if (ImGui::BeginMenuBar()) {
            draw_menu_items(p, Menu::Analyser);
            ImGui::EndMenuBar();
        }
        const ImVec2 room = ImGui::GetContentRegionAvail();
        const float label_height = ImGui::GetTextLineHeightWithSpacing();
        const ImVec2 size(room.x, std::max(16.0f, room.y - label_height));
        if (texture_.id())
            ImGui::Image(texture_.id(), size);
        else
            ImGui::Dummy(size);
        ImGui::TextUnformatted("0 Hz");
        const float right = ImGui::CalcTextSize("22050 Hz").x;
        ImGui::SameLine(std::max(0.0f, room.x - right));
        ImGui::TextUnformatted("22050 Hz");
        if (p.engine.mixer.f_fftmode.load(std::memory_order_relaxed) == kAnalyseInput &&
            !p.recording.input_connected()) {
            ImGui::SameLine(room.x / 2 - 120);
            ImGui::TextDisabled("the input shows while it is monitored");
        }
    }
    ImGui::End();
}

}  // namespace ondrel
