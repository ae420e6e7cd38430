#include "shell/gui/alert_popups.h"

#include <imgui.h>

#include "shell/program.h"

namespace ondrel {

void draw_alerts(Program& p) {
    const Alert* alert = p.alerts.front();
    if (!alert) return;
    constexpr const char* kId = "##alert";
    if (!ImGui::IsPopupOpen(kId)) ImGui::OpenPopup(kId);
    const ImGuiViewport* view = ImGui::GetMainViewport();
    ImGui::SetNextWindowPos(ImVec2(view->Size.x / 2, view->Size.y / 2), ImGuiCond_Always, ImVec2(0.5f, 0.5f));
    ImGui::SetNextWindowSizeConstraints(ImVec2(320, 0), ImVec2(640, 600));
    if (!ImGui::BeginPopupModal(kId, nullptr,
                                ImGuiWindowFlags_AlwaysAutoResize | ImGuiWindowFlags_NoTitleBar))
        return;
    ImGui::Spacing();
    ImGui::PushTextWrapPos(600);
    ImGui::TextUnformatted(alert->text.c_str());
    ImGui::PopTextWrapPos();
    ImGui::Spacing();
    ImGui::Separator();
    int chosen = -1;
    const int count = static_cast<int>(alert->buttons.size());
    for (int i = 0; i < count; ++i) {
        if (i) ImGui::SameLine();
        if (ImGui::Button(alert->buttons[static_cast<size_t>(i)].c_str(), ImVec2(110, 0))) chosen = i;
    }
    if (count == 0 && ImGui::Button("OK", ImVec2(110, 0))) chosen = 0;
    if (chosen < 0 && ImGui::IsKeyPressed(ImGui::GetKeyIndex(ImGuiKey_Escape)))
        chosen = escape_button(*alert);
    if (chosen < 0 && ImGui::IsKeyPressed(ImGui::GetKeyIndex(ImGuiKey_Enter))) chosen = enter_button(*alert);
    if (chosen >= 0) {
        ImGui::CloseCurrentPopup();
        ImGui::EndPopup();
        p.alerts.answer(chosen);
        return;
    }
    ImGui::EndPopup();
}

}  // namespace ondrel
