#include "shell/gui/arrangement_window.h"

#include <imgui.h>

#include <algorithm>
#include <cstdio>

#include "shell/gui/widgets.h"
#include "shell/program.h"

namespace ondrel {

void draw_arrangement_window(Program& p, const TMOD& song) {
    if (!p.windows.arrangement) return;
    ImGui::SetNextWindowSize(ImVec2(300, 460), ImGuiCond_FirstUseEver);
    ImGui::SetNextWindowPos(ImVec2(900, 120), ImGuiCond_FirstUseEver);
    if (!ImGui::Begin("Arrangement", &p.windows.arrangement)) {
        ImGui::End();
        return;
    }
    const int current = std::clamp<int>(p.engine.player.tr.nopat, 0, kPositions - 1);
    const auto post_at = [&](const char(&code)[5], int position) {
        p.post(ShellMessage(fourcc(code)).with("position", position));
    };
    if (ImGui::Button("Insert")) p.post(fourcc("Tins"));
    ImGui::SameLine();
    if (ImGui::Button("Delete")) p.post(fourcc("Tdel"));
    ImGui::SameLine();
    if (ImGui::Button("Duplicate")) post_at("ARdu", current);
    ImGui::SameLine();
    if (ImGui::Button("Set Repeat")) post_at("ARrp", current);
    int pattern = song.sequence[current];
    if (number_field("Pattern of this position", pattern, pattern, 0, kPatternsPerSong - 1, 60))
        p.post(ShellMessage(fourcc("ARpt")).with("position", current).with("pattern", pattern));
    ImGui::Text("Repeat from position %d", int(song.repeat));
    ImGui::Separator();

    const bool follow = p.windows.arrangement_follow;
    p.windows.arrangement_follow = false;
    ImGui::BeginChild("##positions");
    for (int i = 0; i < song.nbpos; ++i) {
        char label[48];
        std::snprintf(label, sizeof label, "%03d   Pattern %03d%s", i, song.sequence[i],
                      i == song.repeat ? "  <" : "");
        ImGui::PushID(i);
        if (ImGui::Selectable(label, i == current)) post_at("ARsl", i);
        if ((follow || p.engine.player.tr.playing) && i == current) ImGui::SetScrollHereY();
        // Dragging a position onto another moves it there.
        if (ImGui::BeginDragDropSource()) {
            ImGui::SetDragDropPayload("position", &i, sizeof i);
            ImGui::Text("Position %d", i);
            ImGui::EndDragDropSource();
        }
        if (ImGui::BeginDragDropTarget()) {
            if (const ImGuiPayload* payload = ImGui::AcceptDragDropPayload("position"))
                p.post(ShellMessage(fourcc("ARmv"))
                           .with("position", *static_cast<const int*>(payload->Data))
                           .with("to", i));
            ImGui::EndDragDropTarget();
        }
        ImGui::PopID();
    }
    ImGui::EndChild();
    ImGui::End();
}

}  // namespace ondrel
