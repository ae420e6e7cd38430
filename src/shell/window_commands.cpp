// Commands that open windows and change what the editor does, without touching the song.
#include <algorithm>

#include "shell/command_handlers.h"
#include "shell/editor_cursor.h"
#include "shell/program.h"

namespace ondrel {

void cmd_about(Program& p, const ShellMessage&) {
    p.windows.about = true;
}

void cmd_arrangement_follow(Program& p, const ShellMessage&) {
    p.windows.arrangement_follow = true;
}

void cmd_documentation(Program& p, const ShellMessage&) {
    p.windows.documentation = true;
}

void cmd_open_window(Program& p, const ShellMessage& m) {
    WindowFlags& w = p.windows;
    switch (m.code) {
        case fourcc("itli"): w.instrument_list = true; break;
        case fourcc("arra"): w.arrangement = true; break;
        case fourcc("Srch"): w.search = true; break;
        case fourcc("XPdl"): w.transpose = true; break;
        case fourcc("SMch"): w.midi_channel = true; break;
        case fourcc("MPRT"): w.midi_ports = true; break;
        default: break;
    }
}

void cmd_jump_step(Program& p, const ShellMessage& m) {
    p.engine.player.cursor.jumpstep = static_cast<int16_t>(m.code - fourcc("J000"));
}

void cmd_cursor_to(Program& p, const ShellMessage& m) {
    CursorPlace place = cursor_place(p);
    place.row = static_cast<int>(m.get("row", place.row));
    place.track = static_cast<int>(m.get("track", place.track));
    place.field = static_cast<int>(m.get("field", place.field));
    set_cursor_place(p, place);
}

void cmd_mark_block(Program& p, const ShellMessage& m) {
    BlockMarks& b = p.editor.block;
    if (!m.has("first_track")) {
        b.active = false;
        return;
    }
    const int tracks = current_tracks(p), rows = current_rows(p);
    const auto clamp_to = [](int64_t v, int n) {
        return static_cast<int16_t>(std::clamp<int64_t>(v, 0, n - 1));
    };
    b.first_track = clamp_to(m.get("first_track"), tracks);
    b.last_track = clamp_to(m.get("last_track"), tracks);
    b.first_row = clamp_to(m.get("first_row"), rows);
    b.last_row = clamp_to(m.get("last_row"), rows);
    if (b.first_track > b.last_track) std::swap(b.first_track, b.last_track);
    if (b.first_row > b.last_row) std::swap(b.first_row, b.last_row);
    b.active = true;
}

void cmd_edit_mode(Program& p, const ShellMessage&) {
    p.editor.edit_mode = !p.editor.edit_mode;
}

void cmd_undo(Program& p, const ShellMessage&) {
    const std::string label = p.history().undo_label();
    if (p.history().undo(p.engine.bank, p.engine.slots)) p.say("Undo " + label);
}

void cmd_redo(Program& p, const ShellMessage&) {
    const std::string label = p.history().redo_label();
    if (p.history().redo(p.engine.bank, p.engine.slots)) p.say("Redo " + label);
}

}  // namespace ondrel
