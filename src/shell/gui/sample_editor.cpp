#include "shell/gui/sample_editor.h"

#include <algorithm>
#include <cmath>
#include <cstdio>

#include "edit/sound_blocks.h"
#include "edit/sound_frames.h"
#include "shell/program.h"

namespace ondrel {

namespace {

constexpr ImU32 kWave = IM_COL32(110, 200, 255, 255);
constexpr ImU32 kWaveBack = IM_COL32(16, 20, 28, 255);
constexpr ImU32 kCentre = IM_COL32(50, 55, 70, 255);
constexpr ImU32 kSelection = IM_COL32(200, 200, 255, 50);
constexpr ImU32 kLoop = IM_COL32(90, 230, 110, 255);
constexpr ImU32 kBlock = IM_COL32(255, 170, 60, 255);
constexpr float kGrab = 5;  // pixels either side of a line that pick it up

float value_at(const p_s& s, uint32_t frame, int channel) {
    const size_t index = size_t(frame) * (s.stereo ? 2 : 1) + size_t(channel);
    const float scale = s.bits == 16 ? 1.0f / 32768.0f : 1.0f / 128.0f;
    return float(sample_at(s.data, s.bits, index)) * scale;
}

void post_range(Program& p, uint32_t code, double a, double b) {
    const auto first = static_cast<int64_t>(std::floor(std::min(a, b)));
    const auto end = static_cast<int64_t>(std::ceil(std::max(a, b)));
    p.post(
        ShellMessage(code).with("first", std::max<int64_t>(0, first)).with("end", std::max<int64_t>(0, end)));
}

}  // namespace

double SampleEditor::frame_at(float x, float left) const {
    return first_ + double(x - left) * per_pixel_;
}

float SampleEditor::x_of(double frame, float left) const {
    return left + float((frame - first_) / per_pixel_);
}

void SampleEditor::compute_peaks(const p_s& s, int width) {
    if (peaks_of_ == s.data && peaks_first_ == first_ && peaks_per_pixel_ == per_pixel_ &&
        int(low_[0].size()) == width)
        return;
    peaks_of_ = s.data;
    peaks_first_ = first_;
    peaks_per_pixel_ = per_pixel_;
    const uint32_t frames = sound_frames(&s);
    const int channels = s.stereo ? 2 : 1;
    for (int c = 0; c < channels; ++c) {
        low_[c].assign(size_t(width), 0);
        high_[c].assign(size_t(width), 0);
        for (int x = 0; x < width; ++x) {
            const double from = first_ + x * per_pixel_;
            const auto a = static_cast<uint32_t>(std::max(0.0, std::floor(from)));
            const auto b =
                std::min<uint32_t>(frames, std::max<uint32_t>(a + 1, uint32_t(std::ceil(from + per_pixel_))));
            float lo = 1, hi = -1;
            for (uint32_t f = a; f < b; ++f) {
                const float v = value_at(s, f, c);
                lo = std::min(lo, v);
                hi = std::max(hi, v);
            }
            if (a >= frames) lo = hi = 0;
            low_[c][size_t(x)] = lo;
            high_[c][size_t(x)] = hi;
        }
        // Each column reaches its neighbour's range, so a steep slope draws unbroken.
        for (size_t x = low_[c].size(); x-- > 1;) {
            low_[c][x] = std::min(low_[c][x], high_[c][x - 1]);
            high_[c][x] = std::max(high_[c][x], low_[c][x - 1]);
        }
    }
}

void SampleEditor::toolbar(Program& p, const p_s* s) {
    const bool sound = s && s->data && s->length;
    const FrameRange sel = p.editor.sound_selection;
    ImGui::BeginDisabled(!sound);
    if (ImGui::Button("Play")) p.post(ShellMessage(fourcc("SNpl")).with("first", 0).with("end", 0));
    ImGui::SameLine();
    ImGui::BeginDisabled(sel.whole());
    if (ImGui::Button("Play selection")) p.post(fourcc("SNpl"));
    ImGui::EndDisabled();
    ImGui::SameLine();
    if (ImGui::Button("Stop")) p.post(ShellMessage(fourcc("SNpl")).with("stop", 1));
    ImGui::SameLine(0, 16);
    for (int tool = 0; tool <= int(SoundTool::InvertSign); ++tool) {
        if (ImGui::Button(sound_tool_label(SoundTool(tool))))
            p.post(ShellMessage(fourcc("SNtl")).with("tool", tool));
        ImGui::SameLine();
    }
    ImGui::SameLine(0, 16);
    const struct {
        const char* label;
        const char code[5];
    } kFrameButtons[] = {{"Cut", "SNct"}, {"Copy", "SNcp"}, {"Crop", "SNcr"}, {"Silence", "SNsi"}};
    for (const auto& b : kFrameButtons) {
        if (ImGui::Button(b.label)) p.post(fourcc(b.code));
        ImGui::SameLine();
    }
    ImGui::EndDisabled();
    ImGui::BeginDisabled(p.editor.sound_clip.bytes.empty());
    if (ImGui::Button("Paste")) p.post(fourcc("SNpa"));
    ImGui::EndDisabled();

    if (ImGui::Button("Zoom +")) per_pixel_ = std::max(0.05, per_pixel_ / 2);
    ImGui::SameLine();
    if (ImGui::Button("Zoom -")) per_pixel_ *= 2;
    ImGui::SameLine();
    if (ImGui::Button("All")) per_pixel_ = 0;
    if (!sound) return;
    ImGui::SameLine(0, 16);
    ImGui::BeginDisabled(sel.whole());
    if (ImGui::Button("Loop the selection"))
        p.post(ShellMessage(fourcc("SNlp")).with("on", 1).with("start", sel.first).with("end", sel.end));
    ImGui::EndDisabled();
    ImGui::SameLine(0, 16);
    ImGui::SetNextItemWidth(90);
    if (ImGui::BeginCombo("##block", block_name(block_).c_str())) {
        for (int n = 1; n <= kSoundBlocks; ++n)
            if (ImGui::Selectable(block_name(n).c_str(), n == block_)) block_ = n;
        ImGui::EndCombo();
    }
    ImGui::SameLine();
    if (ImGui::Button("Set")) p.post(ShellMessage(fourcc("SNbk")).with("block", block_));
    if (ImGui::IsItemHovered())
        ImGui::SetTooltip("The block becomes the selection (the whole sound without one)");
    ImGui::SameLine();
    if (ImGui::Button("Clear")) p.post(ShellMessage(fourcc("SNbc")).with("block", block_));
    ImGui::SameLine(0, 16);
    if (sel.whole())
        ImGui::TextDisabled("No selection: tools act on the whole sound");
    else
        ImGui::Text("Selection %u - %u (%u frames)", sel.first, sel.end, sel.end - sel.first);
}

void SampleEditor::waveform(Program& p, const p_s& s, ImVec2 size) {
    const uint32_t frames = sound_frames(&s);
    const int width = std::max(1, int(size.x));
    const double fit = double(frames) / width;
    if (per_pixel_ <= 0 || per_pixel_ > fit) per_pixel_ = fit;
    first_ = std::clamp(first_, 0.0, std::max(0.0, frames - per_pixel_ * width));
    compute_peaks(s, width);

    ImDrawList* dl = ImGui::GetWindowDrawList();
    const ImVec2 at = ImGui::GetCursorScreenPos();
    ImGui::InvisibleButton("##wave", size);
    const bool hovered = ImGui::IsItemHovered();
    dl->AddRectFilled(at, ImVec2(at.x + size.x, at.y + size.y), kWaveBack);
    const int channels = s.stereo ? 2 : 1;
    const float lane = size.y / float(channels);
    for (int c = 0; c < channels; ++c) {
        const float mid = at.y + lane * (c + 0.5f);
        const float half = lane * 0.45f;
        dl->AddLine(ImVec2(at.x, mid), ImVec2(at.x + size.x, mid), kCentre);
        for (int x = 0; x < width; ++x)
            dl->AddRectFilled(ImVec2(at.x + x, mid - high_[c][size_t(x)] * half),
                              ImVec2(at.x + x + 1, mid - low_[c][size_t(x)] * half + 1), kWave);
    }

    const FrameRange sel = p.editor.sound_selection;
    if (!sel.whole())
        dl->AddRectFilled(ImVec2(std::max(at.x, x_of(sel.first, at.x)), at.y),
                          ImVec2(std::min(at.x + size.x, x_of(sel.end, at.x)), at.y + size.y), kSelection);
    const uint32_t shift = uint32_t(std::max<int16_t>(0, s.framecode));
    double loop_start = s.loopstart >> shift, loop_end = s.loopend >> shift;
    if (drag_ == Drag::LoopStart) loop_start = dragged_;
    if (drag_ == Drag::LoopEnd) loop_end = dragged_;
    const auto vertical = [&](double frame, ImU32 colour, const char* label) {
        const float x = x_of(frame, at.x);
        if (x < at.x - 1 || x > at.x + size.x + 1) return;
        dl->AddLine(ImVec2(x, at.y), ImVec2(x, at.y + size.y), colour, 1.5f);
        if (label) dl->AddText(ImVec2(x + 3, at.y + 2), colour, label);
    };
    if (s.loopon) {
        vertical(loop_start, kLoop, "loop");
        vertical(loop_end, kLoop, nullptr);
    }
    const int slot = p.engine.player.cursor.cursnd;
    const TMOD& song = p.engine.bank.current();
    for (int n = 1; n <= kSoundBlocks; ++n) {
        const auto block = sound_block(song, slot, n, frames);
        if (!block) continue;
        const bool dragged = dragged_block_ == n && (drag_ == Drag::Block || drag_ == Drag::BlockEnd);
        const double start = dragged && drag_ == Drag::Block ? dragged_ : block->first;
        const double end =
            dragged && drag_ == Drag::BlockEnd ? dragged_ : start + double(block->end) - double(block->first);
        vertical(start, kBlock, block_name(n).c_str());
        vertical(end, kBlock, nullptr);
    }

    const ImGuiIO& io = ImGui::GetIO();
    const double mouse_frame = std::clamp(frame_at(io.MousePos.x, at.x), 0.0, double(frames));
    if (hovered && io.MouseWheel != 0) {
        const double keep = mouse_frame;
        per_pixel_ = std::clamp(per_pixel_ * (io.MouseWheel > 0 ? 0.5 : 2.0), 0.05, fit);
        first_ = keep - double(io.MousePos.x - at.x) * per_pixel_;
    }
    const auto near = [&](double frame) { return std::abs(x_of(frame, at.x) - io.MousePos.x) <= kGrab; };
    if (hovered && ImGui::IsMouseClicked(ImGuiMouseButton_Left)) {
        drag_ = Drag::Select;
        anchor_ = mouse_frame;
        if (s.loopon && near(loop_start))
            drag_ = Drag::LoopStart;
        else if (s.loopon && near(loop_end))
            drag_ = Drag::LoopEnd;
        // A start mark moves its block; an end mark resizes it.
        for (int n = 1; n <= kSoundBlocks && drag_ == Drag::Select; ++n) {
            const auto block = sound_block(song, slot, n, frames);
            if (!block || !(near(block->first) || near(block->end))) continue;
            drag_ = near(block->first) ? Drag::Block : Drag::BlockEnd;
            dragged_block_ = n;
            block_first_ = block->first;
        }
        dragged_ = mouse_frame;
    }
    if (drag_ == Drag::None) return;
    dragged_ = mouse_frame;
    // An end kept after its start: the block never shrinks to nothing or turns over.
    if (drag_ == Drag::BlockEnd)
        dragged_ = std::clamp(dragged_, std::min(block_first_ + 1, double(frames)), double(frames));
    if (drag_ == Drag::Select && std::abs(dragged_ - anchor_) >= per_pixel_)
        dl->AddRectFilled(ImVec2(x_of(std::min(anchor_, dragged_), at.x), at.y),
                          ImVec2(x_of(std::max(anchor_, dragged_), at.x), at.y + size.y), kSelection);
    if (ImGui::IsMouseDown(ImGuiMouseButton_Left)) return;
    // Let go: the change the drag made.
    const auto frame = static_cast<int64_t>(std::llround(dragged_));
    switch (drag_) {
        case Drag::Select:
            if (std::abs(dragged_ - anchor_) < per_pixel_)
                post_range(p, fourcc("SNse"), 0, 0);
            else
                post_range(p, fourcc("SNse"), anchor_, dragged_);
            break;
        case Drag::LoopStart:
            p.post(ShellMessage(fourcc("SNlp"))
                       .with("on", 1)
                       .with("start", frame)
                       .with("end", int64_t(loop_end)));
            break;
        case Drag::LoopEnd:
            p.post(ShellMessage(fourcc("SNlp"))
                       .with("on", 1)
                       .with("start", int64_t(loop_start))
                       .with("end", frame));
            break;
        case Drag::Block:
            p.post(ShellMessage(fourcc("SNbm")).with("block", dragged_block_).with("first", frame));
            break;
        case Drag::BlockEnd:
            p.post(ShellMessage(fourcc("SNbm"))
                       .with("block", dragged_block_)
                       .with("first", static_cast<int64_t>(block_first_))
                       .with("end", frame));
            break;
        case Drag::None: break;
    }
    drag_ = Drag::None;
}

void SampleEditor::show_pitch(const p_s& s) {
    if (pitch_of_ != s.data || pitch_length_ != s.length || pitch_rate_ != s.rate) {
        pitch_of_ = s.data;
        pitch_length_ = s.length;
        pitch_rate_ = s.rate;
        pitch_ = calcfft(s);
    }
    if (!pitch_.found) {
        ImGui::TextDisabled("No pitch: the first 4096 frames are silent");
        return;
    }
    ImGui::Text("Pitch %.1f Hz, nearest note %s %+.0f cents", pitch_.frequency, pitch_.note_name.c_str(),
                pitch_.cents);
}

void SampleEditor::draw(Program& p) {
    const p_s* s = p.engine.bank.song_sample(p.engine.player.cursor.cursnd);
    toolbar(p, s);
    if (!s || !s->data || !s->length) {
        ImGui::TextDisabled("Instrument %d has no sound", p.engine.player.cursor.cursnd + 1);
        return;
    }
    const ImVec2 room = ImGui::GetContentRegionAvail();
    waveform(p, *s, ImVec2(room.x, std::max(40.0f, room.y - ImGui::GetFrameHeightWithSpacing())));
    // Under the waveform: the pitch, and the scroll bar when the view is zoomed in.
    show_pitch(*s);
    const uint32_t frames = sound_frames(s);
    const double visible = per_pixel_ * room.x;
    if (visible < frames) {
        float start = float(first_);
        ImGui::SameLine(0, 16);
        ImGui::SetNextItemWidth(ImGui::GetContentRegionAvail().x);
        if (ImGui::SliderFloat("##scroll", &start, 0.0f, float(frames - visible), "frame %.0f"))
            first_ = start;
    }
}

}  // namespace ondrel
