#pragma once
#include <imgui.h>

namespace ondrel {

// The fixed panes of the main window: no title, no moving, and no background of their own
// (they never overlap, and the frame is cleared to the panes' colour before drawing, so a
// software renderer fills each pixel once).
inline constexpr ImGuiWindowFlags kPaneFlags =
    ImGuiWindowFlags_NoDecoration | ImGuiWindowFlags_NoMove | ImGuiWindowFlags_NoSavedSettings |
    ImGuiWindowFlags_NoBringToFrontOnFocus | ImGuiWindowFlags_NoBackground;

// Begins a pane at a place of the window; end it with ImGui::End() whatever this returns.
inline bool begin_pane(const char* id, ImVec2 at, ImVec2 size, ImGuiWindowFlags extra = 0) {
    ImGui::SetNextWindowPos(at);
    ImGui::SetNextWindowSize(size);
    return ImGui::Begin(id, nullptr, kPaneFlags | extra);
}

}  // namespace ondrel
