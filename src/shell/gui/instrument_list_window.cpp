#include "shell/gui/instrument_list_window.h"

#include <imgui.h>

#include <algorithm>
#include <cstdio>

#include "shell/gui/widgets.h"
#include "shell/program.h"

namespace ondrel {

void draw_instrument_list_window(Program& p) {
    if (!p.windows.instrument_list) return;
    ImGui::SetNextWindowSize(ImVec2(420, 520), ImGuiCond_FirstUseEver);
    ImGui::SetNextWindowPos(ImVec2(440, 120), ImGuiCond_FirstUseEver);
    if (!ImGui::Begin("Instrument List", &p.windows.instrument_list)) {
        ImGui::End();
        return;
    }
    if (ImGui::Button("Find instruments not used in the music")) p.post(fourcc("FIIT"));
    ImGui::SameLine();
    if (ImGui::Button("Find current instrument")) p.post(fourcc("CUIT"));
    const int current = p.engine.player.cursor.cursnd + 1;
    const p_s* sound = p.engine.bank.song_sample(current - 1);
    std::string name;
    if (sound && text_field("Name of the current one", sound->name, name, 31, 220)) {
        ShellMessage m(fourcc("ILnm"));
        m.fields.emplace_back("instrument", current);
        m.refs.push_back(name);
        p.post(m);
    }
    ImGui::Separator();
    const auto& unused = p.editor.unused_instruments;
    ImGui::BeginChild("##slots");
    for (int i = 1; i <= kSamplesPerSong; ++i) {
        const p_s* s = p.engine.bank.song_sample(i - 1);
        const bool marked = std::find(unused.begin(), unused.end(), i) != unused.end() && s;
        char label[96];
        std::snprintf(label, sizeof label, "%03d  %-32s %9u%s", i, s ? s->name : "",
                      s && s->data ? s->length : 0u, marked ? "  not used" : "");
        ImGui::PushID(i);
        if (marked) ImGui::PushStyleColor(ImGuiCol_Text, ImVec4(1, 0.6f, 0.4f, 1));
        if (!s) ImGui::PushStyleColor(ImGuiCol_Text, ImVec4(0.5f, 0.5f, 0.55f, 1));
        if (ImGui::Selectable(label, i == current))
            p.post(ShellMessage(fourcc("ILsl")).with("instrument", i));
        if (!s || marked) ImGui::PopStyleColor();
        ImGui::PopID();
    }
    ImGui::EndChild();
    ImGui::End();
}

}  // namespace ondrel
