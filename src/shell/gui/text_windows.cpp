#include "shell/gui/text_windows.h"

#include <imgui.h>

#include <sstream>
#include <string>

#include "shell/program.h"

namespace ondrel {

namespace {

constexpr const char* kAboutText =
    "Ondrel Tracker " ONDREL_VERSION
    "\n\n"
    "A music tracker for Linux: songs are patterns of rows and tracks over sampled\n"
    "instruments, played through effect units and reverbs, mirrored to MIDI, recorded\n"
    "and analysed.\n\n"
    "Made by the Ondrel Tracker developers.\n\n"
    "Built with SDL2 (zlib licence), Dear ImGui (MIT licence), FluidSynth (LGPL 2.1),\n"
    "RtMidi (MIT-style licence) and libmagic (BSD licence). The General MIDI sounds\n"
    "come from the TimGM6mb SoundFont (GPL 2).";

// Markdown, lightly: headings stand out, the rest is shown as written.
void show_document(const char* text) {
    std::istringstream lines(text);
    std::string line;
    while (std::getline(lines, line)) {
        if (line.rfind("#", 0) == 0) {
            const size_t level = line.find_first_not_of('#');
            ImGui::Spacing();
            ImGui::TextColored(level <= 2 ? ImVec4(1, 0.85f, 0.45f, 1) : ImVec4(0.6f, 0.85f, 1, 1), "%s",
                               line.c_str() + (level == std::string::npos ? line.size() : level + 1));
            continue;
        }
        ImGui::TextUnformatted(line.c_str());
    }
}

void text_window(const char* title, bool& open, const char* text, ImVec2 size) {
    if (!open) return;
    ImGui::SetNextWindowSize(size, ImGuiCond_Appearing);
    const ImGuiViewport* view = ImGui::GetMainViewport();
    ImGui::SetNextWindowPos(ImVec2(view->Size.x / 2, view->Size.y / 2), ImGuiCond_Appearing,
                            ImVec2(0.5f, 0.5f));
    if (ImGui::Begin(title, &open, ImGuiWindowFlags_NoSavedSettings)) show_document(text);
    ImGui::End();
}

}  // namespace

void draw_text_windows(Program& p) {
    text_window("About Ondrel Tracker", p.windows.about, kAboutText, ImVec2(560, 300));
    text_window("Documentation", p.windows.documentation, kDocumentationText, ImVec2(760, 620));
}

}  // namespace ondrel
