#include "shell/gui/song_pane.h"

#include <imgui.h>

#include <algorithm>

#include "shell/gui/widgets.h"
#include "shell/program.h"

namespace ondrel {

namespace {

void post_value(Program& p, uint32_t code, int value) {
    p.post(ShellMessage(code).with("value", value));
}

void song_settings(Program& p, const TMOD& song) {
    std::string name;
    if (text_field("Name", song.name, name, 63, 220)) {
        ShellMessage m(fourcc("SGnm"));
        m.refs.push_back(name);
        p.post(m);
    }
    int value = 0;
    const int bpm = song.tempo ? int(60000000u / song.tempo) : 125;
    if (number_field("BPM", bpm, value, 32, 255)) post_value(p, fourcc("SGtp"), value);
    ImGui::SameLine();
    if (number_field("Speed", song.speed, value, 1, 31)) post_value(p, fourcc("SGsp"), value);
    if (number_field("Master volume", song.globalvol, value, 0, 256)) post_value(p, fourcc("SGvl"), value);
    const int position = std::clamp<int>(p.engine.player.tr.nopat, 0, kPositions - 1);
    if (number_field("Rows", song.rows[song.sequence[position]], value, 1, 256))
        post_value(p, fourcc("SGrw"), value);
    ImGui::SameLine();
    if (number_field("Tracks", song.nbtrack, value, 1, kTracks)) post_value(p, fourcc("SGtr"), value);
}

}  // namespace

void draw_track_settings(Program& p, const TMOD& song, int track) {
    ImGui::Text("Track %d", track + 1);
    const auto post = [&](const char(&code)[5], int value) {
        p.post(ShellMessage(fourcc(code)).with("track", track).with("value", value));
    };
    const int voices = song.nbvoice[track] >= 127 ? 5 : std::clamp<int>(song.nbvoice[track], 1, 5) - 1;
    ImGui::SetNextItemWidth(200);
    if (ImGui::BeginCombo("Voices", kVoiceChoices[voices])) {
        for (int i = 0; i < 6; ++i)
            if (ImGui::Selectable(kVoiceChoices[i], i == voices)) post("TKvc", i == 5 ? 127 : i + 1);
        ImGui::EndCombo();
    }
    int value = 0;
    if (slider_field("Pan", song.trackvol[track], value, 0, 127)) post("TKpn", value);
    if (slider_field("Volume", song.trackpan[track], value, 0, 255)) post("TKvl", value);
    if (number_field("MIDI channel (0: samples)", song.trackword1[track], value, 0, 16)) post("TKmc", value);
    if (ImGui::ArrowButton("##fx down", ImGuiDir_Left))
        p.post(ShellMessage(fourcc("TKf-")).with("track", track));
    ImGui::SameLine();
    if (ImGui::ArrowButton("##fx up", ImGuiDir_Right))
        p.post(ShellMessage(fourcc("TKf+")).with("track", track));
    ImGui::SameLine();
    const int slot = song.tracke[track];
    ImGui::Text("Effect: %s", slot ? p.engine.rack.label(slot).c_str() : "none (dry)");
}

void draw_song_pane(Program& p, const TMOD& song) {
    ImGui::PushItemWidth(120);
    song_settings(p, song);
    ImGui::Separator();
    draw_track_settings(p, song, std::clamp<int>(p.engine.player.cursor.track, 0, kTracks - 1));
    ImGui::PopItemWidth();
}

void draw_midi_channel_window(Program& p, const TMOD& song) {
    if (!p.windows.midi_channel) return;
    if (!ImGui::Begin("Set Midi chanel", &p.windows.midi_channel, ImGuiWindowFlags_AlwaysAutoResize)) {
        ImGui::End();
        return;
    }
    const int track = std::clamp<int>(p.engine.player.cursor.track, 0, kTracks - 1);
    ImGui::Text("Track %d: 0 plays its samples, 1 to 16 sends it to that MIDI channel", track + 1);
    int value = 0;
    if (number_field("Channel", song.trackword1[track], value, 0, 16))
        p.post(ShellMessage(fourcc("TKmc")).with("track", track).with("value", value));
    ImGui::End();
}

}  // namespace ondrel
