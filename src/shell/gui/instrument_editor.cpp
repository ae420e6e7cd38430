#include "shell/gui/instrument_editor.h"

#include <imgui.h>

#include <algorithm>

#include "playback/note_names.h"
#include "shell/gui/widgets.h"
#include "shell/program.h"

namespace ondrel {

namespace {

void post_value(Program& p, const char (&code)[5], int64_t value) {
    p.post(ShellMessage(fourcc(code)).with("value", value));
}

void loop_fields(Program& p, const p_s& s) {
    const uint32_t shift = uint32_t(std::max<int16_t>(0, s.framecode));
    const int start = int(s.loopstart >> shift), end = int(s.loopend >> shift);
    const int frames = int(s.frames());
    bool on = s.loopon != 0;
    int value = 0;
    const auto post_loop = [&](bool loop_on, int first, int last) {
        p.post(ShellMessage(fourcc("SNlp")).with("on", loop_on).with("start", first).with("end", last));
    };
    if (ImGui::Checkbox("Loop", &on)) post_loop(on, start, end > start ? end : frames);
    ImGui::SameLine();
    if (number_field("start", start, value, 0, frames, 90)) post_loop(on, value, end);
    ImGui::SameLine();
    if (number_field("end", end, value, 0, frames, 90)) post_loop(on, start, value);
}

}  // namespace

void draw_instrument_editor(Program& p) {
    const int instrument = p.engine.player.cursor.cursnd + 1;
    int chosen = 0;
    ImGui::PushItemWidth(110);
    if (number_field("Instrument", instrument, chosen, 1, kSamplesPerSong, 70))
        p.post(ShellMessage(fourcc("ILsl")).with("instrument", chosen));
    ImGui::SameLine();
    if (ImGui::ArrowButton("##previous", ImGuiDir_Left))
        p.post(ShellMessage(fourcc("ILsl")).with("instrument", std::max(1, instrument - 1)));
    ImGui::SameLine();
    if (ImGui::ArrowButton("##next", ImGuiDir_Right))
        p.post(ShellMessage(fourcc("ILsl")).with("instrument", std::min(kSamplesPerSong, instrument + 1)));
    ImGui::SameLine();
    if (ImGui::Button("Load a sound...")) p.post(fourcc("OPen"));
    ImGui::SameLine();
    if (ImGui::Button("Save Sound")) p.post(fourcc("SAvs"));

    const p_s* s = p.engine.bank.song_sample(instrument - 1);
    if (!s) {
        ImGui::TextDisabled(
            "Instrument %d is empty: load a sound into it from the browser, the file panel or a drop",
            instrument);
        ImGui::PopItemWidth();
        return;
    }
    std::string name;
    if (text_field("Name", s->name, name, 31, 260)) {
        ShellMessage m(fourcc("SNnm"));
        m.refs.push_back(name);
        p.post(m);
    }
    int value = 0;
    if (slider_field("Volume", s->volume, value, 0, 128)) post_value(p, "SNvl", value);
    ImGui::SameLine();
    if (slider_field("Finetune", s->finetune, value, 0, 15)) post_value(p, "SNft", value);
    char note[5];
    const_midit(std::clamp<int>(s->refnote, 0, 127), note);
    if (number_field("Reference note", s->refnote, value, 0, 127)) post_value(p, "SNrn", value);
    ImGui::SameLine();
    ImGui::Text("(%s)", note);
    ImGui::SameLine();
    if (number_field("Rate (Hz)", int(s->rate), value, 1, 65535, 90)) post_value(p, "SNrt", value);
    loop_fields(p, *s);
    ImGui::Text("%d bits, %s, %u frames (%u bytes)", int(s->bits), s->stereo ? "stereo" : "mono", s->frames(),
                s->data ? s->length : 0u);
    ImGui::PopItemWidth();
}

}  // namespace ondrel
