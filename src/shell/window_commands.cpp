// Commands that open windows and change what the editor does, without touching the song.
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
