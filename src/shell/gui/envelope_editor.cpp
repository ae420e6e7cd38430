#include "shell/gui/envelope_editor.h"

#include <imgui.h>

#include <algorithm>
#include <cmath>
#include <cstdio>

#include "edit/sound_fields.h"
#include "shell/gui/menu_bar.h"
#include "shell/program.h"

namespace ondrel {

namespace {
constexpr ImU32 kBack = IM_COL32(16, 20, 28, 255);
constexpr ImU32 kGrid = IM_COL32(45, 50, 65, 255);
constexpr ImU32 kCurve = IM_COL32(255, 200, 90, 255);
constexpr ImU32 kCurveOff = IM_COL32(120, 100, 60, 255);  // the mixer does not apply it
constexpr ImU32 kPoint = IM_COL32(240, 240, 250, 255);
constexpr ImU32 kPointHot = IM_COL32(255, 90, 90, 255);
constexpr float kPointRadius = 5;
// What the curve's values are, to scale them into the graph: a gain of 0 to 2 for the
// volume envelopes, 0 to 510 for the send, 0 to 127 for pan, 0 to 255 for the pitch word.
constexpr float kTop[] = {2.0f, 510.0f, 127.0f, 255.0f, 2.0f};
}  // namespace

void EnvelopeEditor::draw(Program& p) {
    const int kind = p.editor.envelope_kind;
    ImGui::TextUnformatted("A.D.S.R.");
    ImGui::SameLine();
    ImGui::SetNextItemWidth(180);
    if (ImGui::BeginCombo("##envelope", find_command(fourcc("co00") + uint32_t(kind))->label)) {
        draw_menu_items(p, Menu::Envelope);
        ImGui::EndCombo();
    }
    const p_s* s = p.engine.bank.song_sample(p.engine.player.cursor.cursnd);
    if (!s) {
        ImGui::TextDisabled("Instrument %d has no sound", p.engine.player.cursor.cursnd + 1);
        return;
    }
    ImGui::SameLine();
    bool on = (s->flagword >> kind) & 1;
    if (ImGui::Checkbox("On", &on)) p.post(ShellMessage(fourcc("ENon")).with("kind", kind).with("on", on));
    ImGui::SameLine();
    ImGui::TextDisabled(kind == 4 ? "over the fade length after a note-off" : "over the sound's length");

    const ImVec2 size = ImGui::GetContentRegionAvail();
    const ImVec2 at = ImGui::GetCursorScreenPos();
    ImGui::InvisibleButton("##graph", size);
    ImDrawList* dl = ImGui::GetWindowDrawList();
    dl->AddRectFilled(at, ImVec2(at.x + size.x, at.y + size.y), kBack);
    for (int i = 1; i < 4; ++i) {
        dl->AddLine(ImVec2(at.x + size.x * i / 4, at.y), ImVec2(at.x + size.x * i / 4, at.y + size.y), kGrid);
        dl->AddLine(ImVec2(at.x, at.y + size.y * i / 4), ImVec2(at.x + size.x, at.y + size.y * i / 4), kGrid);
    }
    // The curve as heard, then the points as stored (x 0..255 across, level 0..255 up).
    const int width = std::max(2, int(size.x));
    const std::vector<float> curve = envelope_curve(*s, kind, width);
    for (int x = 1; x < width; ++x) {
        const auto y = [&](int i) {
            return at.y + size.y - size.y * std::clamp(curve[size_t(i)] / kTop[kind], 0.0f, 1.0f);
        };
        dl->AddLine(ImVec2(at.x + x - 1, y(x - 1)), ImVec2(at.x + x, y(x)), on ? kCurve : kCurveOff, 2);
    }
    const auto place = [&](int x, int level) {
        return ImVec2(at.x + size.x * float(x) / 255.0f, at.y + size.y - size.y * float(level) / 255.0f);
    };
    const ImGuiIO& io = ImGui::GetIO();
    const int mouse_x = std::clamp(int(std::lround((io.MousePos.x - at.x) * 255.0f / size.x)), 0, 255);
    const int mouse_level =
        std::clamp(int(std::lround((at.y + size.y - io.MousePos.y) * 255.0f / size.y)), 0, 255);
    int hot = -1;
    for (int point = 0; point < 5; ++point) {
        const uint16_t word = s->env(kind, point);
        int x = point == 0 ? 0 : word >> 8, level = word & 0xFF;
        if (point == dragged_) {
            x = drag_x_;
            level = drag_level_;
        }
        const ImVec2 c = place(x, level);
        if (std::hypot(io.MousePos.x - c.x, io.MousePos.y - c.y) <= kPointRadius + 3) hot = point;
        dl->AddCircleFilled(c, kPointRadius, point == hot || point == dragged_ ? kPointHot : kPoint);
        char label[8];
        std::snprintf(label, sizeof label, "%d", point);
        dl->AddText(ImVec2(c.x + 6, c.y - 14), kPoint, label);
    }
    if (ImGui::IsItemHovered() && hot >= 0 && ImGui::IsMouseClicked(ImGuiMouseButton_Left)) dragged_ = hot;
    if (dragged_ < 0) return;
    drag_x_ = dragged_ == 0 ? 0 : mouse_x;
    drag_level_ = mouse_level;
    ImGui::SetTooltip("point %d: x %d, level %d", dragged_, drag_x_, drag_level_);
    if (ImGui::IsMouseDown(ImGuiMouseButton_Left)) return;
    p.post(ShellMessage(fourcc("ENpt"))
               .with("kind", kind)
               .with("point", dragged_)
               .with("x", drag_x_)
               .with("level", drag_level_));
    dragged_ = -1;
}

}  // namespace ondrel
