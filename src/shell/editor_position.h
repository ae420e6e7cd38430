#pragma once
#include <cstdint>

namespace ondrel {

// Where the editor stood in a song, kept on the song's file between sessions. The window
// copies it from and to the transport (nopat), the edit cursor (poscurv, poscurx) and its
// pattern view (scroll_y, oftrack).
struct EditorPosition {
    int16_t nopat = 0;     // the pattern (sequence position) shown in the editor
    int16_t poscurv = 0;   // cursor row
    int16_t poscurx = 0;   // cursor column
    int16_t scroll_y = 0;  // the pattern view's vertical scroll
    int16_t oftrack = 0;   // the first track shown (horizontal scroll)
};

}  // namespace ondrel
