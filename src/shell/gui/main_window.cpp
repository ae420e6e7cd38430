#include "shell/gui/main_window.h"

#include <imgui.h>

#include <algorithm>
#include <cstring>
#include <mutex>

#include "shell/gui/alert_popups.h"
#include "shell/gui/arrangement_window.h"
#include "shell/gui/edit_windows.h"
#include "shell/gui/effect_editor.h"
#include "shell/gui/instrument_editor.h"
#include "shell/gui/instrument_list_window.h"
#include "shell/gui/menu_bar.h"
#include "shell/gui/midi_window.h"
#include "shell/gui/pane.h"
#include "shell/gui/record_panel.h"
#include "shell/gui/song_pane.h"
#include "shell/gui/status_line.h"
#include "shell/gui/text_windows.h"
#include "shell/gui/transport_bar.h"
#include "shell/program.h"

namespace ondrel {

MainWindow::MainWindow(Program& program, SDL_Renderer* renderer)
    : p_(program), song_(std::make_unique<TMOD>()), analyser_window_(renderer) {}

bool MainWindow::animating() const {
    const Transport& tr = p_.engine.player.tr;
    if (tr.playing || tr.fplayonenote || tr.fplaytrack || p_.recording.busy()) return true;
    for (const auto& meter : tr.valvu)
        if (meter.load(std::memory_order_relaxed) > 0) return true;
    return false;
}

std::string MainWindow::title() const {
    const TMOD& song = p_.engine.bank.current();
    std::string text = std::string("Ondrel Tracker - ") + (song.name[0] ? song.name : "No name");
    if (p_.history().dirty()) text += " *";
    return text;
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
    draw_arrangement_window(p_, *song_);
    draw_instrument_list_window(p_);
    draw_search_window(p_);
    draw_transpose_window(p_);
    draw_midi_channel_window(p_, *song_);
    draw_midi_window(p_);
    draw_text_windows(p_);
    analyser_window_.draw(p_);
    file_panel_.draw(p_);
    draw_alerts(p_);
}

namespace {
constexpr float kSideWidth = 300;
constexpr float kEditorsHeight = 290;
}  // namespace

void MainWindow::draw_panes(float top, float height) {
    const ImGuiViewport* view = ImGui::GetMainViewport();
    if (begin_pane("##side", ImVec2(0, top), ImVec2(kSideWidth, height)) &&
        ImGui::BeginTabBar("##side tabs")) {
        if (ImGui::BeginTabItem("Browser")) {
            browser_pane_.draw(p_);
            ImGui::EndTabItem();
        }
        if (ImGui::BeginTabItem("Song")) {
            draw_song_pane(p_, *song_);
            ImGui::EndTabItem();
        }
        ImGui::EndTabBar();
    }
    ImGui::End();
    const float width = view->Size.x - kSideWidth;
    const float editors = std::min(kEditorsHeight, height * 0.45f);
    ImGui::PushStyleVar(ImGuiStyleVar_WindowPadding, ImVec2(4, 4));
    if (begin_pane("##pattern", ImVec2(kSideWidth, top), ImVec2(width, height - editors),
                   ImGuiWindowFlags_NoScrollWithMouse))
        pattern_view_.draw(p_, *song_, ImGui::GetContentRegionAvail());
    ImGui::End();
    ImGui::PopStyleVar();
    draw_editors(kSideWidth, top + height - editors, width, editors);
}

void MainWindow::draw_editors(float left, float top, float width, float height) {
    if (begin_pane("##editors", ImVec2(left, top), ImVec2(width, height)) &&
        ImGui::BeginTabBar("##editor tabs")) {
        if (ImGui::BeginTabItem("Instrument")) {
            draw_instrument_editor(p_);
            ImGui::EndTabItem();
        }
        if (ImGui::BeginTabItem("Sample")) {
            sample_editor_.draw(p_);
            ImGui::EndTabItem();
        }
        if (ImGui::BeginTabItem("Envelope")) {
            envelope_editor_.draw(p_);
            ImGui::EndTabItem();
        }
        if (ImGui::BeginTabItem("Effects")) {
            draw_effect_editor(p_, *song_);
            ImGui::EndTabItem();
        }
        if (ImGui::BeginTabItem("Record")) {
            draw_record_panel(p_);
            ImGui::EndTabItem();
        }
        ImGui::EndTabBar();
    }
    ImGui::End();
}

}  // namespace ondrel
