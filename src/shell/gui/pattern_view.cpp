#include "shell/gui/pattern_view.h"

#include <algorithm>
#include <cstdio>

#include "shell/cell_text.h"
#include "shell/editor_cursor.h"
#include "shell/gui/song_pane.h"
#include "shell/program.h"

namespace ondrel {

namespace {

constexpr ImU32 kBeat = IM_COL32(32, 32, 42, 255);     // every 4 rows
constexpr ImU32 kMeasure = IM_COL32(46, 46, 62, 255);  // every 16 rows
constexpr ImU32 kPlayRow = IM_COL32(70, 60, 20, 255);
constexpr ImU32 kCursorRow = IM_COL32(40, 50, 80, 255);
constexpr ImU32 kCursorEdit = IM_COL32(200, 60, 60, 255);
constexpr ImU32 kCursorView = IM_COL32(70, 110, 200, 255);
constexpr ImU32 kBlock = IM_COL32(90, 90, 160, 90);
constexpr ImU32 kRowNumber = IM_COL32(140, 140, 150, 255);
constexpr ImU32 kEmpty = IM_COL32(85, 85, 100, 255);
constexpr ImU32 kNote = IM_COL32(230, 230, 235, 255);
constexpr ImU32 kInstrument = IM_COL32(110, 190, 255, 255);
constexpr ImU32 kVolume = IM_COL32(120, 225, 120, 255);
constexpr ImU32 kCommand = IM_COL32(255, 160, 80, 255);
constexpr ImU32 kParameter = IM_COL32(255, 215, 100, 255);
constexpr ImU32 kSeparator = IM_COL32(60, 60, 75, 255);
constexpr ImU32 kMuted = IM_COL32(200, 70, 70, 255);
constexpr ImU32 kMeter = IM_COL32(80, 200, 100, 255);

bool is_empty_text(const char* text) {
    return text[0] == '.' || (text[0] == '-' && text[1] == '-');
}

}  // namespace

void PatternView::place_view(Program& p, int rows, int tracks) {
    const Transport& tr = p.engine.player.tr;
    const bool following = tr.playing && !tr.fplaytrack && p.editor.follow_song;
    const int focus = following ? int(tr.nopos) : int(p.engine.player.cursor.poscurv);
    // The focused row stays in the middle, as in the trackers composers know.
    view_top_ =
        std::clamp(focus - visible_rows_ / 2, -visible_rows_ / 2, std::max(0, rows - 1 - visible_rows_ / 2));
    p.editor.view_top = static_cast<int16_t>(std::max(0, view_top_));

    const int cursor_track = p.engine.player.cursor.track;
    int of = p.editor.oftrack;
    if (cursor_track < of) of = cursor_track;
    if (cursor_track >= of + visible_tracks_) of = cursor_track - visible_tracks_ + 1;
    of = std::clamp(of, 0, std::max(0, tracks - visible_tracks_));
    p.editor.oftrack = static_cast<int16_t>(of);
}

void PatternView::draw_headers(Program& p, const TMOD& song, ImDrawList* dl, ImVec2 origin, int tracks) {
    const Transport& tr = p.engine.player.tr;
    for (int i = 0; i < visible_tracks_; ++i) {
        const int t = p.editor.oftrack + i;
        if (t >= tracks) break;
        const ImVec2 a(origin.x + number_w_ + i * track_w_, origin.y);
        const ImVec2 b(a.x + track_w_ - 4, a.y + header_h_ - 4);
        const bool muted = p.engine.mixer.mute[size_t(t)].load(std::memory_order_relaxed) != 0;
        dl->AddRectFilled(a, b, muted ? IM_COL32(70, 30, 30, 255) : IM_COL32(38, 38, 50, 255));
        char label[32];
        std::snprintf(label, sizeof label, "Track %02d%s", t + 1, muted ? "  MUTED" : "");
        dl->AddText(ImVec2(a.x + 4, a.y + 2), muted ? kMuted : kNote, label);
        const float level =
            std::clamp(tr.valvu[size_t(t)].load(std::memory_order_relaxed) / 128.0f, 0.0f, 1.0f);
        if (p.engine.player.tr.fvuvu && level > 0)
            dl->AddRectFilled(ImVec2(a.x + 4, b.y - 7), ImVec2(a.x + 4 + (track_w_ - 12) * level, b.y - 3),
                              kMeter);
        ImGui::SetCursorScreenPos(a);
        ImGui::PushID(t);
        if (ImGui::InvisibleButton("##header", ImVec2(track_w_ - 4, header_h_ - 4)))
            p.post(ShellMessage(fourcc("MUTE")).with("track", t));
        if (ImGui::IsItemHovered())
            ImGui::SetTooltip("Click: mute or unmute track %d. Right click: its settings", t + 1);
        if (ImGui::BeginPopupContextItem("##track")) {
            draw_track_settings(p, song, t);
            ImGui::EndPopup();
        }
        ImGui::PopID();
    }
}

void PatternView::handle_mouse(Program& p, ImVec2 origin, int rows) {
    const ImGuiIO& io = ImGui::GetIO();
    const ImVec2 m = io.MousePos;
    const float top = origin.y + header_h_;
    const bool inside = ImGui::IsWindowHovered() && m.y >= top && m.x >= origin.x + number_w_;
    if (inside && io.MouseWheel != 0) {
        const int row = std::clamp(int(p.engine.player.cursor.poscurv) - int(io.MouseWheel * 4), 0, rows - 1);
        p.post(ShellMessage(fourcc("CUto")).with("row", row));
    }
    const auto cell_under_mouse = [&](int& row, int& track, int& field) {
        row = std::clamp(view_top_ + int((m.y - top) / row_h_), 0, rows - 1);
        const int column = std::max(0, int((m.x - origin.x - number_w_) / track_w_));
        track = std::min(p.editor.oftrack + column, current_tracks(p) - 1);
        field = field_at_column(int((m.x - origin.x - number_w_ - column * track_w_ - 4) / char_w_));
    };
    int row = 0, track = 0, field = 0;
    if (inside && ImGui::IsMouseClicked(ImGuiMouseButton_Left)) {
        cell_under_mouse(row, track, field);
        drag_row_ = row;
        drag_track_ = track;
        dragging_ = true;
        p.post(ShellMessage(fourcc("CUto")).with("row", row).with("track", track).with("field", field));
        if (p.editor.block.active) p.post(fourcc("BLck"));  // a click drops the block
        return;
    }
    if (!dragging_) return;
    if (!ImGui::IsMouseDown(ImGuiMouseButton_Left)) {
        dragging_ = false;
        return;
    }
    if (!ImGui::IsMouseDragging(ImGuiMouseButton_Left)) return;
    // A drag marks the rectangle from where it began to the cell under the mouse.
    cell_under_mouse(row, track, field);
    const BlockMarks& b = p.editor.block;
    const int first_track = std::min(drag_track_, track), last_track = std::max(drag_track_, track);
    const int first_row = std::min(drag_row_, row), last_row = std::max(drag_row_, row);
    if (b.active && b.first_track == first_track && b.last_track == last_track && b.first_row == first_row &&
        b.last_row == last_row)
        return;
    p.post(ShellMessage(fourcc("BLck"))
               .with("first_track", first_track)
               .with("last_track", last_track)
               .with("first_row", first_row)
               .with("last_row", last_row));
}

void PatternView::draw(Program& p, const TMOD& song, ImVec2 size) {
    char_w_ = ImGui::CalcTextSize("0").x;
    row_h_ = ImGui::GetTextLineHeight() + 2;
    header_h_ = row_h_ * 2;
    number_w_ = char_w_ * 4 + 6;
    track_w_ = char_w_ * (kCellChars + 1) + 8;
    const int tracks = std::clamp<int>(song.nbtrack, 1, kTracks);
    const int position = std::clamp<int>(p.engine.player.tr.nopat, 0, kPositions - 1);
    const int rows = std::max<int>(1, song.rows[song.sequence[position]]);
    visible_rows_ = std::max(1, int((size.y - header_h_) / row_h_));
    visible_tracks_ = std::clamp(int((size.x - number_w_) / track_w_), 1, tracks);
    place_view(p, rows, tracks);

    ImDrawList* dl = ImGui::GetWindowDrawList();
    const ImVec2 origin = ImGui::GetCursorScreenPos();
    draw_headers(p, song, dl, origin, tracks);

    const Transport& tr = p.engine.player.tr;
    const bool play_here = tr.playing && !tr.fplaytrack && tr.nopat == position;
    const EditCursor& cursor = p.engine.player.cursor;
    const BlockMarks& block = p.editor.block;
    const Pattern* pattern = p.engine.bank.pattern(song.patbase + song.sequence[position]);
    const float width = number_w_ + visible_tracks_ * track_w_;
    for (int i = 0; i < visible_rows_; ++i) {
        const int r = view_top_ + i;
        if (r < 0 || r >= rows) continue;
        const float y = origin.y + header_h_ + i * row_h_;
        ImU32 band = r % 16 == 0 ? kMeasure : r % 4 == 0 ? kBeat : 0;
        if (r == cursor.poscurv) band = kCursorRow;
        if (play_here && r == tr.nopos) band = kPlayRow;
        if (band) dl->AddRectFilled(ImVec2(origin.x, y), ImVec2(origin.x + width, y + row_h_), band);
        char number[12];  // any int fits
        std::snprintf(number, sizeof number, "%03d", r);
        dl->AddText(ImVec2(origin.x + 3, y + 1), kRowNumber, number);
        for (int c = 0; c < visible_tracks_; ++c) {
            const int t = p.editor.oftrack + c;
            if (t >= tracks) break;
            const float x = origin.x + number_w_ + c * track_w_ + 4;
            const TNOTE* cell = pattern ? pattern->cell(t, r) : nullptr;
            const CellText text = cell_text(cell ? *cell : TNOTE{});
            if (block.active && t >= block.first_track && t <= block.last_track && r >= block.first_row &&
                r <= block.last_row)
                dl->AddRectFilled(ImVec2(x - 3, y), ImVec2(x + track_w_ - 6, y + row_h_), kBlock);
            if (t == cursor.track && r == cursor.poscurv) {
                const int field = cursor.poscurx % kFieldsPerTrack;
                const float fx = x + field_column(field) * char_w_;
                dl->AddRectFilled(ImVec2(fx - 1, y),
                                  ImVec2(fx + field_width(field) * char_w_ + 1, y + row_h_),
                                  p.editor.edit_mode ? kCursorEdit : kCursorView);
            }
            const auto put = [&](int column, const char* s, ImU32 colour) {
                dl->AddText(ImVec2(x + column * char_w_, y + 1), is_empty_text(s) ? kEmpty : colour, s);
            };
            put(0, text.note, kNote);
            put(5, text.instrument, kInstrument);
            put(8, text.volume, kVolume);
            put(12, text.command, kCommand);
            put(13, text.parameter, kParameter);
            dl->AddLine(ImVec2(x + track_w_ - 6, y), ImVec2(x + track_w_ - 6, y + row_h_), kSeparator);
        }
    }
    handle_mouse(p, origin, rows);
    ImGui::Dummy(size);
}

}  // namespace ondrel
