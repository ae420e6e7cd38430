#include "shell/gui/edit_windows.h"

#include <imgui.h>

#include "shell/gui/widgets.h"
#include "shell/program.h"

namespace ondrel {

namespace {

constexpr const char* kScopes[] = {"Block", "Track", "Pattern", "Song"};

void scope_choice(EditRange::Kind& scope) {
    int s = static_cast<int>(scope);
    for (int i = 0; i < 4; ++i) {
        if (i) ImGui::SameLine();
        ImGui::RadioButton(kScopes[i], &s, i);
    }
    scope = static_cast<EditRange::Kind>(s);
}

// One field of a mask, edited with an "any" box.
void mask_row(const char* label, std::optional<uint8_t>& field, int high) {
    bool any = !field.has_value();
    int value = field.value_or(0);
    mask_field(label, any, value, high);
    if (any)
        field.reset();
    else
        field = static_cast<uint8_t>(value);
}

void mask_editor(const char* title, CellMask& mask) {
    ImGui::TextUnformatted(title);
    ImGui::PushID(title);
    mask_row("note (1-127, 128 note-off)", mask.note, 255);
    mask_row("instrument", mask.instrument, 127);
    mask_row("volume", mask.volume, 255);
    mask_row("command", mask.command, 255);
    mask_row("parameter", mask.parameter, 255);
    ImGui::PopID();
}

}  // namespace

void draw_search_window(Program& p) {
    if (!p.windows.search) return;
    ImGui::SetNextWindowSize(ImVec2(380, 430), ImGuiCond_FirstUseEver);
    ImGui::SetNextWindowPos(ImVec2(460, 160), ImGuiCond_FirstUseEver);
    if (!ImGui::Begin("Find and Replace", &p.windows.search)) {
        ImGui::End();
        return;
    }
    SearchState& s = p.editor.search;
    scope_choice(s.scope);
    ImGui::Separator();
    mask_editor("Find cells whose", s.find);
    ImGui::Separator();
    mask_editor("Replace with", s.replace);
    ImGui::Separator();
    if (ImGui::Button("Find Next (F3)")) p.post(fourcc("Sfnd"));
    ImGui::SameLine();
    if (ImGui::Button("Replace")) p.post(fourcc("Srp1"));
    if (ImGui::IsItemHovered())
        ImGui::SetTooltip("Replaces the cell under the cursor if it is found, then finds the next");
    ImGui::SameLine();
    if (ImGui::Button("Replace All")) p.post(fourcc("Srpl"));
    ImGui::End();
}

void draw_transpose_window(Program& p) {
    if (!p.windows.transpose) return;
    ImGui::SetNextWindowPos(ImVec2(460, 200), ImGuiCond_FirstUseEver);
    if (!ImGui::Begin("Transpose", &p.windows.transpose, ImGuiWindowFlags_AlwaysAutoResize)) {
        ImGui::End();
        return;
    }
    EditRange::Kind& scope = p.editor.transpose_scope;
    scope_choice(scope);
    ImGui::Checkbox("Only the current instrument", &p.editor.transpose_current_instrument_only);
    const auto button = [&](const char* label, int semitones) {
        if (ImGui::Button(label, ImVec2(80, 0)))
            p.post(ShellMessage(fourcc("XPrn")).with("semitones", semitones).with("scope", int(scope)));
        ImGui::SameLine();
    };
    button("Octave -", -12);
    button("Semitone -", -1);
    button("Semitone +", 1);
    button("Octave +", 12);
    ImGui::NewLine();
    ImGui::End();
}

}  // namespace ondrel
