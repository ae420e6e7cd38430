#include "shell/gui/effect_editor.h"

#include <imgui.h>

#include <algorithm>

#include "edit/effect_edits.h"
#include "edit/reverb_edits.h"
#include "render/effect_slot_rules.h"
#include "shell/gui/widgets.h"
#include "shell/program.h"

namespace ondrel {

namespace {

constexpr int kEcho = 11, kActiveFilter = 5, kReverbDHS = 9, kReverb = 10, kIir2Low = 16, kIir2High = 17;

void post_setting(Program& p, const char (&code)[5], int slot, int64_t value) {
    p.post(ShellMessage(fourcc(code)).with("slot", slot).with("value", value));
}

void auto_pan_controls(Program& p, const TMOD& song, int slot) {
    bool on = song.efxflag[slot] != 0;
    if (ImGui::Checkbox("Auto Pan D", &on)) post_setting(p, "FXap", slot, on);
    ImGui::SameLine();
    int value = 0;
    if (slider_field("Speed", std::abs(song.efxc[slot]), value, 0, 255)) post_setting(p, "FXsp", slot, value);
}

void echo_controls(Program& p, const TMOD& song, int slot) {
    const int k = effect_instance(p.engine.slots.efxtype, slot);
    if (k < 0 || k >= kEchoUnits) return;
    int value = 0;
    if (number_field("Echo Delay (ms)", int(echo_delay_ms(song.echolen[k])), value, 1, int(kMaxEchoDelayMs)))
        post_setting(p, "FXdl", slot, value);
    ImGui::SameLine();
    if (ImGui::Button("Set To BPM")) post_setting(p, "FXbp", slot, 0);
    if (slider_field("Feedback", int(song.echolevel[k]), value, 0, 128)) post_setting(p, "FXfb", slot, value);
    ImGui::SameLine();
    bool invert = song.echoon[k] != 0;
    if (ImGui::Checkbox("Invert Phase", &invert)) post_setting(p, "FXiv", slot, invert);
}

void reverb_row(Program& p, int unit, const char* label, int delay_field, int gain_field,
                const char* gain_label, int cutoff_comb, const char* second_gain = nullptr,
                int second_field = -1) {
    const EffectUnits& units = p.engine.units;
    ImGui::PushID(label);
    ImGui::TextUnformatted(label);
    ImGui::SameLine(90);
    int value = 0;
    const auto post = [&](const char(&code)[5], int field) {
        p.post(ShellMessage(fourcc(code)).with("unit", unit).with("field", field).with("value", value));
    };
    const char* delay_label =
        delay_field == 6 || delay_field == ReverbDHSSettings::kDelayField ? "First Delay (µs)" : "Delay (µs)";
    if (number_field(delay_label, int(reverb_delay_shown(units, unit, delay_field)), value, 0, 10000000, 80))
        post("RVdl", delay_field);
    if (gain_field >= 0) {
        ImGui::SameLine();
        if (number_field(gain_label, reverb_gain_shown(units, unit, gain_field), value, 0, 10000, 60))
            post("RVgn", gain_field);
    }
    if (second_gain) {
        ImGui::SameLine();
        if (number_field(second_gain, reverb_gain_shown(units, unit, second_field), value, 0, 10000, 60))
            post("RVgn", second_field);
    }
    if (cutoff_comb >= 0) {
        ImGui::SameLine();
        if (number_field("Lpf (Hz)", reverb_cutoff_shown(units, cutoff_comb), value, 10, 11050, 70))
            post("RVlp", cutoff_comb);
    }
    ImGui::PopID();
}

void reverb_panel(Program& p) {
    static const char* const kComb[] = {"Comb 1", "Comb 2", "Comb 3", "Comb 4"};
    for (int c = 0; c < 4; ++c) reverb_row(p, kReverb, kComb[c], c, c, "Gain1 ()", c);
    reverb_row(p, kReverb, "All-pass 1", 4, 4, "Gain2 ()", -1);
    reverb_row(p, kReverb, "All-pass 2", 5, 5, "Gain2 ()", -1);
    reverb_row(p, kReverb, "Output", 6, 6, "Gain ()", -1);
}

void reverb_dhs_panel(Program& p) {
    static const char* const kComb[] = {"Comb 1", "Comb 2", "Comb 3", "Comb 4", "Comb 5"};
    for (int c = 0; c < ReverbDHSSettings::kCombs; ++c)
        reverb_row(p, kReverbDHS, kComb[c], c, c, "Gain1 ()", -1, "Gain2 ()", 5 + c);
    reverb_row(p, kReverbDHS, "Output delay", ReverbDHSSettings::kDelayField, 10, "Gain ()", -1);
}

void unit_panel(Program& p, const TMOD& song, int slot) {
    const int type = p.engine.slots.efxtype[size_t(slot)];
    ImGui::Text("%s", p.engine.rack.label(slot).c_str());
    ImGui::SameLine(0, 20);
    if (ImGui::Button("Clone efx")) p.post(ShellMessage(fourcc("FXcl")).with("slot", slot));
    ImGui::SameLine();
    if (ImGui::Button("Remove efx")) p.post(ShellMessage(fourcc("FXrm")).with("slot", slot));
    ImGui::PushItemWidth(120);
    if (type == kEcho) echo_controls(p, song, slot);
    if (type == kActiveFilter) {
        int value = 0;
        if (number_field("Freq (Hz)", int(song.efxval[slot]), value, 10, 20000))
            post_setting(p, "FXfq", slot, value);
    }
    if (type == kIir2Low || type == kIir2High) {
        int value = 0;
        if (slider_field("Q", song.efxd[slot], value, 1, 255)) post_setting(p, "FXq ", slot, value);
    }
    if (type == kReverb) reverb_panel(p);
    if (type == kReverbDHS) reverb_dhs_panel(p);
    auto_pan_controls(p, song, slot);
    ImGui::PopItemWidth();
}

}  // namespace

void draw_effect_editor(Program& p, const TMOD& song) {
    const int shown = p.editor.shown_effect;
    ImGui::BeginChild("##slots", ImVec2(260, 0), true);
    ImGui::TextDisabled("%s", EffectRack::kListTitle);
    for (const auto& [slot, label] : p.engine.rack.list()) {
        ImGui::PushID(slot);
        if (ImGui::Selectable(label.c_str(), slot == shown))
            p.post(ShellMessage(fourcc("FXsh")).with("slot", slot));
        ImGui::PopID();
    }
    ImGui::EndChild();
    ImGui::SameLine();
    ImGui::BeginChild("##unit", ImVec2(0, 0), false);
    const int track = std::clamp<int>(p.engine.player.cursor.track, 0, kTracks - 1);
    ImGui::Text("Track %d goes to", track + 1);
    ImGui::SameLine();
    if (ImGui::ArrowButton("##down", ImGuiDir_Left))
        p.post(ShellMessage(fourcc("TKf-")).with("track", track));
    ImGui::SameLine();
    const int routed = song.tracke[track];
    ImGui::Text("%s", routed ? p.engine.rack.label(routed).c_str() : "(dry)");
    ImGui::SameLine();
    if (ImGui::ArrowButton("##up", ImGuiDir_Right)) p.post(ShellMessage(fourcc("TKf+")).with("track", track));
    ImGui::Separator();
    if (shown > 0 && p.engine.slots.efxtype[size_t(shown)] != 0)
        unit_panel(p, song, shown);
    else
        ImGui::TextDisabled("Choose an effect in the list to see its controls");
    ImGui::EndChild();
}

}  // namespace ondrel
