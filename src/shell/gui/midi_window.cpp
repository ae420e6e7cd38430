#include "shell/gui/midi_window.h"

#include <imgui.h>

#include "shell/gui/widgets.h"
#include "shell/program.h"

namespace ondrel {

namespace {

// One radio button per port and one for none; choosing posts code with the port's index.
void port_choice(Program& p, const char* id, const std::vector<std::string>& names, const std::string& open,
                 uint32_t code) {
    ImGui::PushID(id);
    if (ImGui::RadioButton("None", open.empty())) p.post(ShellMessage(code).with("port", -1));
    for (size_t i = 0; i < names.size(); ++i) {
        ImGui::PushID(static_cast<int>(i));
        if (ImGui::RadioButton(names[i].c_str(), names[i] == open))
            p.post(ShellMessage(code).with("port", static_cast<int64_t>(i)));
        ImGui::PopID();
    }
    ImGui::PopID();
}

}  // namespace

void draw_midi_window(Program& p) {
    if (!p.windows.midi_ports) return;
    if (!ImGui::Begin("Midi Ports", &p.windows.midi_ports, ImGuiWindowFlags_AlwaysAutoResize)) {
        ImGui::End();
        return;
    }
    if (ImGui::IsWindowAppearing()) p.midi.refresh_port_lists();
    MidiSetup& midi = p.midi;
    command_button(p, fourcc("MSYN"), midi.synth_open() ? "Close Internal Midi Synth" : "Internal Midi Synth",
                   midi.synth_open());
    ImGui::SameLine();
    command_button(p, fourcc("MSF2"), "Choose SoundFont...");
    const std::string soundfont =
        midi.synth_open() ? midi.synth()->soundfont()
                          : (midi.soundfont.empty() ? FluidSynthesiser::default_soundfont() : midi.soundfont);
    ImGui::TextDisabled("SoundFont: %s", soundfont.empty() ? "none installed" : soundfont.c_str());
    ImGui::Separator();
    const MidiPorts* ports = midi.ports();
    if (!ports || !ports->available()) {
        ImGui::TextWrapped("No MIDI ports: %s",
                           ports ? ports->unavailable_reason().c_str() : "the program has not looked for them");
    } else {
        ImGui::TextUnformatted("Output (tracks with a MIDI channel play there too)");
        port_choice(p, "out", midi.output_ports, ports->output_name(), fourcc("MOsl"));
        ImGui::Separator();
        ImGui::TextUnformatted("Input (notes are entered at the cursor)");
        port_choice(p, "in", midi.input_ports, ports->input_name(), fourcc("MIsl"));
        if (ImGui::Button("Refresh")) midi.refresh_port_lists();
    }
    ImGui::End();
}

}  // namespace ondrel
