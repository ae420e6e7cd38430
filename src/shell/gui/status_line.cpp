#include "shell/gui/status_line.h"

#include <imgui.h>

#include "shell/gui/pane.h"
#include "shell/program.h"

namespace ondrel {

namespace {
constexpr uint64_t kSayingLastsUs = 8'000'000;
}

void draw_status_line(Program& p, float top, float height) {
    const ImGuiViewport* view = ImGui::GetMainViewport();
    begin_pane("##status", ImVec2(0, top), ImVec2(view->Size.x, height));
    ImGui::TextUnformatted(p.engine.player.status);
    ImGui::SameLine(0, 20);
    if (p.editor.edit_mode)
        ImGui::TextColored(ImVec4(1.0f, 0.4f, 0.4f, 1), "EDIT MODE");
    else
        ImGui::TextDisabled("edit mode off (Space)");
    ImGui::SameLine(0, 20);
    if (!p.audio_status.empty()) {
        ImGui::TextColored(ImVec4(1.0f, 0.7f, 0.3f, 1), "%s", p.audio_status.c_str());
        ImGui::SameLine(0, 20);
    }
    if (p.history().dirty()) {
        ImGui::TextUnformatted("modified");
        ImGui::SameLine(0, 20);
    }
    if (!p.last_said().empty() && system_time_us() - p.said_at_us() < kSayingLastsUs)
        ImGui::TextUnformatted(p.last_said().c_str());
    ImGui::End();
}

}  // namespace ondrel
