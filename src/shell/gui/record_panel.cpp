#include "shell/gui/record_panel.h"

#include <imgui.h>

#include <cstdio>
#include <filesystem>

#include "record/disk_recording.h"
#include "record/record_format.h"
#include "shell/gui/widgets.h"
#include "shell/program.h"

namespace ondrel {

namespace {

const ImVec4 kWarning{1, 0.7f, 0.35f, 1};
const ImVec4 kRecordingRed{0.95f, 0.3f, 0.3f, 1};

void post_setting(Program& p, const char (&code)[5], int64_t value) {
    p.post(ShellMessage(fourcc(code)).with("value", value));
}

// Where the sound comes from: the input (with its chooser) or the song's own output.
void source_row(Program& p, bool idle) {
    const Recording& r = p.recording;
    const bool song = p.engine.mixer.frecmusic.load(std::memory_order_relaxed) != 0;
    ImGui::BeginDisabled(!idle);
    ImGui::AlignTextToFramePadding();
    ImGui::TextUnformatted("Source:");
    ImGui::SameLine();
    if (ImGui::RadioButton("Input", !song)) post_setting(p, "RCsr", 0);
    ImGui::SameLine();
    if (ImGui::RadioButton("The song's output", song)) post_setting(p, "RCsr", 1);
    ImGui::SameLine(0, 24);
    const auto names = r.input_names();
    ImGui::TextUnformatted("Input:");
    ImGui::SameLine();
    ImGui::SetNextItemWidth(260);
    ImGui::BeginDisabled(names.empty());
    if (ImGui::BeginCombo("##input", names.empty() ? "none" : r.chosen_input_name().c_str())) {
        for (size_t i = 0; i < names.size(); ++i)
            if (ImGui::Selectable(names[i].c_str(), int(i) == r.chosen_input()))
                post_setting(p, "RCin", int64_t(i));
        ImGui::EndCombo();
    }
    ImGui::EndDisabled();
    ImGui::EndDisabled();
    if (names.empty())
        ImGui::TextColored(
            kWarning,
            "No capture device: recording from the input is off. The song's output can still be "
            "recorded.");
}

// The format, and where the recording goes: a new sound in the current instrument or a file.
void destination_rows(Program& p, bool idle) {
    const Recorder& rec = p.recording.recorder;
    ImGui::BeginDisabled(!idle);
    ImGui::AlignTextToFramePadding();
    ImGui::TextUnformatted("Format:");
    ImGui::SameLine();
    ImGui::SetNextItemWidth(220);
    const int mode = rec.samplermode.load(std::memory_order_relaxed);
    if (ImGui::BeginCombo("##format", record_format(mode).label)) {
        for (size_t i = 0; i < kRecordFormats.size(); ++i)
            if (ImGui::Selectable(kRecordFormats[i].label, int(i) == mode))
                post_setting(p, "RCfm", int64_t(i));
        ImGui::EndCombo();
    }
    ImGui::SameLine(0, 24);
    const bool disk = rec.soundrecoutput.load(std::memory_order_relaxed) == 1;
    char memory[48];
    std::snprintf(memory, sizeof memory, "Instrument %d", p.engine.player.cursor.cursnd + 1);
    if (ImGui::RadioButton(memory, !disk)) post_setting(p, "RCds", 0);
    ImGui::SameLine();
    if (ImGui::RadioButton("D2D File", disk)) post_setting(p, "RCds", 1);
    if (disk) {
        ImGui::SameLine();
        if (ImGui::Button("Choose...")) p.post(fourcc("RCch"));
        ImGui::SameLine();
        const std::string& file = rec.d2dref();
        if (file.empty())
            ImGui::TextDisabled("no file yet");
        else
            ImGui::TextUnformatted(file.c_str());
    }
    ImGui::EndDisabled();
}

void gain_row(Program& p) {
    const int gain = p.recording.recorder.vrvol.load(std::memory_order_relaxed);
    int value = gain;
    ImGui::AlignTextToFramePadding();
    ImGui::TextUnformatted("Gain:  ");
    ImGui::SameLine();
    if (slider_field("##gain", gain, value, 0, kMaxRecordGain, 220)) post_setting(p, "RCgn", value);
    ImGui::SameLine();
    ImGui::Text("x %.2f%s", gain / 128.0, gain > 128 ? "  (loud input wraps)" : "");
}

void transport_row(Program& p) {
    const Recorder& rec = p.recording.recorder;
    ImGui::AlignTextToFramePadding();
    command_button(p, fourcc("moni"), "Monitor", rec.isMonitoring());
    ImGui::SameLine();
    command_button(p, fourcc("reco"), "Record", rec.isRecording());
    ImGui::SameLine();
    command_button(p, fourcc("stre"), "Stop");
    ImGui::SameLine(0, 24);
    if (rec.isRecording())
        ImGui::TextColored(kRecordingRed, "Recording%s", rec.isMonitoring() ? " and monitoring" : "");
    else if (rec.isMonitoring())
        ImGui::TextUnformatted("Monitoring");
    else
        ImGui::TextDisabled("Stopped");
}

// The peaks of what is recorded: the monitored input's meters (0-15), or the song's output.
void meters_row(const Program& p) {
    const Recorder& rec = p.recording.recorder;
    const Mixer& mixer = p.engine.mixer;
    if (mixer.frecmusic.load(std::memory_order_relaxed)) {
        level_meter("L", mixer.lmax.load(std::memory_order_relaxed), 200);
        ImGui::SameLine();
        level_meter("R", mixer.rmax.load(std::memory_order_relaxed), 200);
        return;
    }
    const bool live = rec.isMonitoring();
    level_meter("L", live ? rec.maxg.load(std::memory_order_relaxed) / 15.0f : 0.0f, 200);
    ImGui::SameLine();
    level_meter("R", live ? rec.maxd.load(std::memory_order_relaxed) / 15.0f : 0.0f, 200);
    if (!live) {
        ImGui::SameLine();
        ImGui::TextDisabled("(the input's meters move while it is monitored)");
    }
}

// How much the current recording has taken (or the last one took), and where it stands:
// the memory it may fill, or what the writer has put on disk.
void progress_row(const Program& p) {
    const Recorder& rec = p.recording.recorder;
    const uint64_t bytes = rec.bytes_recorded();
    const double seconds =
        double(bytes) / record_format(rec.samplermode.load(std::memory_order_relaxed)).byte_rate;
    const bool recording = rec.isRecording();
    ImGui::Text("%s %llu bytes (%d:%04.1f)",
                recording ? "Recording:" : "Last recording:", static_cast<unsigned long long>(bytes),
                int(seconds) / 60, seconds - 60 * (int(seconds) / 60));
    if (!recording) return;
    ImGui::SameLine(0, 24);
    if (rec.soundrecoutput.load(std::memory_order_relaxed) == 1) {
        ImGui::Text("written to disk: %llu bytes", static_cast<unsigned long long>(rec.bytes_written()));
        return;
    }
    char room[64];
    std::snprintf(room, sizeof room, "of %u bytes at most in memory", kRecordLimit);
    ImGui::ProgressBar(std::min(1.0f, float(bytes) / kRecordLimit), ImVec2(280, 0), room);
}

}  // namespace

void draw_record_panel(Program& p) {
    const bool idle = !p.recording.busy();
    source_row(p, idle);
    destination_rows(p, idle);
    gain_row(p);
    ImGui::Separator();
    transport_row(p);
    meters_row(p);
    progress_row(p);
}

}  // namespace ondrel
