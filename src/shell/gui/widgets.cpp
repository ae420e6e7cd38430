#include "shell/gui/widgets.h"

#include <imgui.h>

#include <algorithm>
#include <cstdio>
#include <map>

#include "shell/command_table.h"
#include "shell/program.h"

namespace ondrel {

namespace {
// What the user is typing, by widget, until the field is left.
std::map<ImGuiID, int>& drafts() {
    static std::map<ImGuiID, int> values;
    return values;
}
std::map<ImGuiID, std::string>& text_drafts() {
    static std::map<ImGuiID, std::string> values;
    return values;
}
}  // namespace

// Draws an integer control fed from the draft while it is being edited; true with value
// set once the edit ended on a new value.
template <typename Draw>
bool committed_int(const char* label, int current, int& value, int low, int high, float width, Draw draw) {
    const ImGuiID id = ImGui::GetID(label);
    auto& draft = drafts();
    const auto it = draft.find(id);
    int shown = it != draft.end() ? it->second : current;
    ImGui::SetNextItemWidth(width);
    draw(&shown);
    if (ImGui::IsItemActive()) draft[id] = shown;
    const bool done = ImGui::IsItemDeactivatedAfterEdit();
    if (!ImGui::IsItemActive()) draft.erase(id);
    if (!done) return false;
    value = std::clamp(shown, low, high);
    return value != current;
}

bool number_field(const char* label, int current, int& value, int low, int high, float width) {
    return committed_int(label, current, value, low, high, width,
                         [&](int* v) { ImGui::InputInt(label, v, 0, 0); });
}

bool slider_field(const char* label, int current, int& value, int low, int high, float width) {
    return committed_int(label, current, value, low, high, width,
                         [&](int* v) { ImGui::SliderInt(label, v, low, high); });
}

bool text_field(const char* label, const std::string& current, std::string& text, size_t max_len,
                float width) {
    const ImGuiID id = ImGui::GetID(label);
    auto& draft = text_drafts();
    if (!draft.count(id)) draft[id] = current;
    std::string& shown = draft[id];
    char buffer[256];
    std::snprintf(buffer, sizeof buffer, "%s", shown.c_str());
    ImGui::SetNextItemWidth(width);
    ImGui::InputText(label, buffer, std::min(sizeof buffer, max_len + 1));
    shown = buffer;
    const bool active = ImGui::IsItemActive();
    const bool done = ImGui::IsItemDeactivatedAfterEdit();
    if (done) text = shown;
    if (!active) draft.erase(id);
    return done && text != current;
}

bool mask_field(const char* label, bool& any, int& value, int high) {
    ImGui::PushID(label);
    bool changed = ImGui::Checkbox("any", &any);
    ImGui::SameLine();
    ImGui::BeginDisabled(any);
    ImGui::SetNextItemWidth(60);
    changed |= ImGui::InputInt(label, &value, 0, 0);
    value = std::clamp(value, 0, high);
    ImGui::EndDisabled();
    ImGui::PopID();
    return changed;
}

void command_button(Program& p, uint32_t code, const char* label, bool lit) {
    const CommandInfo* c = find_command(code);
    const bool can = c && c->handler && (!c->enabled || c->enabled(p));
    if (lit) ImGui::PushStyleColor(ImGuiCol_Button, ImVec4(0.20f, 0.45f, 0.25f, 1));
    ImGui::BeginDisabled(!can);
    if (ImGui::Button(label)) p.post(code);
    ImGui::EndDisabled();
    if (lit) ImGui::PopStyleColor();
    if (c && !c->shortcut.empty() && ImGui::IsItemHovered())
        ImGui::SetTooltip("%s", chord_text(c->shortcut).c_str());
}

void level_meter(const char* label, float value, float width) {
    ImGui::TextUnformatted(label);
    ImGui::SameLine();
    const ImVec4 colour = value >= 1.0f ? ImVec4(0.9f, 0.2f, 0.2f, 1) : ImVec4(0.3f, 0.8f, 0.35f, 1);
    ImGui::PushStyleColor(ImGuiCol_PlotHistogram, colour);
    ImGui::ProgressBar(std::clamp(value, 0.0f, 1.0f), ImVec2(width, ImGui::GetTextLineHeight()), "");
    ImGui::PopStyleColor();
}

}  // namespace ondrel
