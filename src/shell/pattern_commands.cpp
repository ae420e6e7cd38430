// The pattern, track and block commands: clear, cut, copy, paste, paste-mix, transpose.
#include <algorithm>

#include "edit/pattern_edits.h"
#include "shell/command_handlers.h"
#include "shell/command_table.h"
#include "shell/editor_cursor.h"
#include "shell/program.h"

namespace ondrel {

namespace {

int current_pattern(const Program& p) {
    const TMOD& m = p.engine.bank.current();
    return m.sequence[std::clamp<int>(p.engine.player.tr.nopat, 0, kPositions - 1)];
}

CellBlock marked_block(const Program& p) {
    const BlockMarks& b = p.editor.block;
    return {current_pattern(p), b.first_track, b.first_row, b.last_track, b.last_row};
}

// What a pattern, track or block command acts on.
enum class Scope { Pattern, Track, Block };

Scope scope_of(uint32_t code) {
    switch (code >> 24) {
        case 'P': return Scope::Pattern;
        case 'T': return Scope::Track;
        default: return Scope::Block;
    }
}

CellBlock block_of(Program& p, Scope scope) {
    const int pattern = current_pattern(p);
    SongTransaction view(p.engine.bank, p.engine.slots, "");
    if (scope == Scope::Pattern) return whole_pattern(view, pattern);
    if (scope == Scope::Track) return whole_track(view, pattern, p.engine.player.cursor.track);
    return marked_block(p);
}

CellClip& clipboard_of(Program& p, Scope scope) {
    return scope == Scope::Pattern ? p.editor.pattern_clip
           : scope == Scope::Track ? p.editor.track_clip
                                   : p.editor.block_clip;
}

bool needs_block(Program& p, Scope scope) {
    if (scope != Scope::Block || p.editor.block.active) return false;
    p.say("No block is marked (Shift+arrows or a drag with the mouse)");
    return true;
}

void copy_to_clipboard(Program& p, Scope scope) {
    SongTransaction view(p.engine.bank, p.engine.slots, "");
    clipboard_of(p, scope) = copy_block(view, block_of(p, scope));
}

void clear(Program& p, Scope scope, const char* label) {
    const CellBlock block = block_of(p, scope);
    if (!p.edit(label, [&](SongTransaction& t) { clear_block(t, block); })) p.say("Nothing to clear");
}

}  // namespace

void cmd_clear_cells(Program& p, const ShellMessage& m) {
    const Scope scope = scope_of(m.code);
    if (needs_block(p, scope)) return;
    clear(p, scope, find_command(m.code)->label);
}

void cmd_copy_cells(Program& p, const ShellMessage& m) {
    const Scope scope = scope_of(m.code);
    if (needs_block(p, scope)) return;
    copy_to_clipboard(p, scope);
    const CellClip& clip = clipboard_of(p, scope);
    p.say("Copied " + std::to_string(clip.tracks) + " x " + std::to_string(clip.rows) + " cells");
}

void cmd_cut_cells(Program& p, const ShellMessage& m) {
    const Scope scope = scope_of(m.code);
    if (needs_block(p, scope)) return;
    copy_to_clipboard(p, scope);
    clear(p, scope, find_command(m.code)->label);
}

void cmd_paste_cells(Program& p, const ShellMessage& m) {
    const Scope scope = scope_of(m.code);
    const CellClip& clip = clipboard_of(p, scope);
    if (clip.empty()) {
        p.say("The clipboard is empty");
        return;
    }
    const int pattern = current_pattern(p);
    const CursorPlace at = cursor_place(p);
    // A pattern pastes over the whole pattern, a track over the cursor's track, a block
    // at the cursor; "mix" fills only the empty cells.
    const int track = scope == Scope::Pattern ? 0 : at.track;
    const int row = scope == Scope::Block ? at.row : 0;
    const PasteMode mode = m.code == fourcc("Bmix") ? PasteMode::Mix : PasteMode::Replace;
    int written = 0;
    p.edit(mode == PasteMode::Mix ? "Paste mix" : "Paste",
           [&](SongTransaction& t) { written = paste_block(t, pattern, track, row, clip, mode); });
    p.say(std::to_string(written) + " cells pasted");
}

void cmd_transpose(Program& p, const ShellMessage& m) {
    // The keys move the block by a semitone or an octave, or the cursor's track when no
    // block is marked; the transpose window names its scope and amount.
    int semitones = static_cast<int>(m.get("semitones", 1));
    if (m.code == fourcc("XPsu")) semitones = 1;
    if (m.code == fourcc("XPsd")) semitones = -1;
    if (m.code == fourcc("XPou")) semitones = 12;
    if (m.code == fourcc("XPod")) semitones = -12;
    const auto fallback = p.editor.block.active ? EditRange::Kind::Block : EditRange::Kind::Track;
    const auto kind = static_cast<EditRange::Kind>(m.get("scope", int(fallback)));
    const int pattern = current_pattern(p);
    EditRange range = EditRange::whole_song();
    switch (kind) {
        case EditRange::Kind::Block:
            if (needs_block(p, Scope::Block)) return;
            range = EditRange::of_block(marked_block(p));
            break;
        case EditRange::Kind::Track:
            range = EditRange::of_track(pattern, p.engine.player.cursor.track);
            break;
        case EditRange::Kind::Pattern: range = EditRange::of_pattern(pattern); break;
        case EditRange::Kind::Song: break;
    }
    const int instrument = p.editor.transpose_current_instrument_only ? p.engine.player.cursor.cursnd + 1 : 0;
    TransposeResult result;
    p.edit("Transpose", [&](SongTransaction& t) { result = transpose(t, range, semitones, instrument); });
    std::string said = std::to_string(result.moved) + " notes transposed";
    if (result.out_of_range)
        said += ", " + std::to_string(result.out_of_range) + " left where they were (out of range)";
    p.say(said);
}

}  // namespace ondrel
