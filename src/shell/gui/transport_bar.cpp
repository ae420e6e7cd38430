#include "shell/gui/transport_bar.h"

#include <imgui.h>

#include <algorithm>
#include <cstdio>

#include "shell/gui/pane.h"
#include "shell/gui/widgets.h"
#include "shell/program.h"

namespace ondrel {

float draw_transport_bar(Program& p, const TMOD& song, float top) {
    const ImGuiViewport* view = ImGui::GetMainViewport();
    const float height = ImGui::GetFrameHeightWithSpacing() * 2 + 8;
    begin_pane("##transport", ImVec2(0, top), ImVec2(view->Size.x, height));
    const Player& player = p.engine.player;
    const Transport& tr = player.tr;
    const bool playing = tr.playing != 0;
    command_button(p, fourcc("PLsg"), "Play Song", playing && !tr.playp);
    ImGui::SameLine();
    command_button(p, fourcc("PLpt"), "Play Pattern", playing && tr.playp);
    ImGui::SameLine();
    command_button(p, fourcc("PLst"), "Stop");
    ImGui::SameLine();
    bool loop = tr.floop != 0;
    if (ImGui::Checkbox("loop", &loop)) p.post(fourcc("PLlp"));
    ImGui::SameLine(0, 24);

    const int position = std::clamp<int>(tr.nopat, 0, kPositions - 1);
    const double seconds = playing ? double(system_time_us() - uint64_t(tr.startplaying.load())) / 1e6 : 0.0;
    ImGui::Text("Pos %03d/%03d  Pattern %03d  Row %03d  Time %02d:%02d", position, song.nbpos,
                song.sequence[position], int(tr.nopos), int(seconds) / 60, int(seconds) % 60);
    ImGui::SameLine(0, 24);
    ImGui::Text("BPM %u  Speed %d", song.tempo ? 60000000u / song.tempo : 0u, int(song.speed));
    ImGui::SameLine(0, 24);
    const Mixer& mixer = p.engine.mixer;
    level_meter("L", mixer.lmax.load(std::memory_order_relaxed));
    ImGui::SameLine();
    level_meter("R", mixer.rmax.load(std::memory_order_relaxed));
    ImGui::SameLine();
    ImGui::Text("Load %3.0f%%", 100.0f * mixer.powermusic.load(std::memory_order_relaxed));

    const int instrument = player.cursor.cursnd + 1;
    const p_s* sound = p.engine.bank.song_sample(instrument - 1);
    ImGui::Text("Octave %d  Step %d  Instrument %02d %s", p.editor.octave, int(player.cursor.jumpstep),
                instrument, sound ? sound->name : "(empty)");
    if (p.editor.midi_range_low[0]) {
        ImGui::SameLine(0, 24);
        ImGui::Text("MIDI %s .. %s", p.editor.midi_range_low.data(), p.editor.midi_range_high.data());
    }
    ImGui::SameLine(0, 24);
    ImGui::Text("Song \"%s\"  %d tracks", song.name[0] ? song.name : "No name", int(song.nbtrack));
    ImGui::End();
    return height;
}

}  // namespace ondrel
