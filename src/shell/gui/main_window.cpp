#include "shell/gui/main_window.h"

#include <imgui.h>

#include <cstring>
#include <mutex>

#include "shell/gui/alert_popups.h"
#include "shell/gui/menu_bar.h"
#include "shell/gui/status_line.h"
#include "shell/gui/text_windows.h"
#include "shell/gui/transport_bar.h"
#include "shell/program.h"

namespace ondrel {

MainWindow::MainWindow(Program& program) : p_(program), song_(std::make_unique<TMOD>()) {}

bool MainWindow::animating() const {
    const Transport& tr = p_.engine.player.tr;
    if (tr.playing || tr.fplayonenote || tr.fplaytrack) return true;
    for (const auto& meter : tr.valvu)
        if (meter.load(std::memory_order_relaxed) > 0) return true;
    return false;
}

void MainWindow::take_song_snapshot() {
    SongBank& bank = p_.engine.bank;
    std::lock_guard<StructureLock> guard(bank.structure_lock());
    std::memcpy(static_cast<void*>(song_.get()), &bank.current(), sizeof(TMOD));
}

void MainWindow::draw() {
    take_song_snapshot();
    const ImGuiViewport* view = ImGui::GetMainViewport();
    const float menu_height = draw_menu_bar(p_);
    const float status_height = ImGui::GetFrameHeight() + 6;
    const float transport_height = draw_transport_bar(p_, *song_, menu_height);
    const float panes_top = menu_height + transport_height;
    draw_panes(panes_top, view->Size.y - panes_top - status_height);
    draw_status_line(p_, view->Size.y - status_height, status_height);
    draw_text_windows(p_);
    file_panel_.draw(p_);
    draw_alerts(p_);
}

void MainWindow::draw_panes(float top, float height) {
    const ImGuiViewport* view = ImGui::GetMainViewport();
    ImGui::SetNextWindowPos(ImVec2(0, top));
    ImGui::SetNextWindowSize(ImVec2(view->Size.x, height));
    constexpr ImGuiWindowFlags kPane = ImGuiWindowFlags_NoDecoration | ImGuiWindowFlags_NoMove |
                                       ImGuiWindowFlags_NoSavedSettings |
                                       ImGuiWindowFlags_NoBringToFrontOnFocus;
    ImGui::PushStyleVar(ImGuiStyleVar_WindowPadding, ImVec2(4, 4));
    ImGui::Begin("##panes", nullptr, kPane);
    pattern_view_.draw(p_, *song_, ImGui::GetContentRegionAvail());
    ImGui::End();
    ImGui::PopStyleVar();
}

}  // namespace ondrel
