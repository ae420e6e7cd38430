#include "shell/editor_position.h"

#include <algorithm>

#include "shell/command_handlers.h"
#include "shell/editor_cursor.h"
#include "shell/program.h"
#include "shell/song_file_attributes.h"

namespace ondrel {

namespace {
EditorPosition editor_position_of(const Program& p) {
    return {p.engine.player.tr.nopat, p.engine.player.cursor.poscurv, p.engine.player.cursor.poscurx,
            p.editor.view_top, p.editor.oftrack};
}
}  // namespace

void restore_editor_position(Program& p) {
    EditorPosition at = editor_position_of(p);
    readinfo_in_file(p.engine.bank.current(), at);
    // The file's values may be anything: each is brought inside the song before use.
    const TMOD& song = p.engine.bank.current();
    p.engine.player.tr.nopat =
        static_cast<int16_t>(std::clamp<int>(at.nopat, 0, std::max(song.nbpos - 1, 0)));
    const int column = std::max<int>(at.poscurx, 0);
    set_cursor_place(p, {at.poscurv, column / kFieldsPerTrack, column % kFieldsPerTrack});
    p.editor.view_top = static_cast<int16_t>(std::clamp<int>(at.scroll_y, 0, current_rows(p) - 1));
    p.editor.oftrack = static_cast<int16_t>(std::clamp<int>(at.oftrack, 0, current_tracks(p) - 1));
}

void store_editor_position(Program& p) {
    writeinfo_in_file(p.engine.bank.current(), editor_position_of(p));
}

}  // namespace ondrel
