#pragma once
#include <imgui.h>

namespace ondrel {

class Program;
struct TMOD;

// The pattern of the current position: rows by tracks, each field in its own colour, a
// highlight every 4 and 16 rows, the row being played, the cursor and the marked block;
// track headers with their meters, a click on one mutes the track.
class PatternView {
public:
    void draw(Program& p, const TMOD& song, ImVec2 size);

private:
    void place_view(Program& p, int rows, int tracks);
    void draw_headers(Program& p, const TMOD& song, ImDrawList* dl, ImVec2 origin, int tracks);
    void handle_mouse(Program& p, ImVec2 origin, int rows);

    float char_w_ = 7, row_h_ = 15, header_h_ = 30, number_w_ = 35, track_w_ = 120;
    int visible_rows_ = 1, visible_tracks_ = 1;
    int view_top_ = 0;
    bool dragging_ = false;
    int drag_row_ = 0, drag_track_ = 0;  // where a drag with the mouse began
};

}  // namespace ondrel
