// Searching the song: find, find and replace by masks, and the instrument searches.
#include <algorithm>
#include <string>

#include "edit/pattern_edits.h"
#include "shell/command_handlers.h"
#include "shell/editor_cursor.h"
#include "shell/program.h"

namespace ondrel {

namespace {

int position(const Program& p) {
    return std::clamp<int>(p.engine.player.tr.nopat, 0, kPositions - 1);
}

EditRange search_range(const Program& p, EditRange::Kind kind) {
    const int pattern = p.engine.bank.current().sequence[position(p)];
    const BlockMarks& b = p.editor.block;
    switch (kind) {
        case EditRange::Kind::Block:
            return EditRange::of_block({pattern, b.first_track, b.first_row, b.last_track, b.last_row});
        case EditRange::Kind::Track: return EditRange::of_track(pattern, p.engine.player.cursor.track);
        case EditRange::Kind::Pattern: return EditRange::of_pattern(pattern);
        case EditRange::Kind::Song: break;
    }
    return EditRange::whole_song();
}

// Moves the cursor to the next cell that matches; false when none does.
bool jump_to_next(Program& p, const EditRange& range, const CellMask& mask) {
    const CursorPlace at = cursor_place(p);
    const CellPlace after{range.kind == EditRange::Kind::Song ? position(p) : -1,
                          p.engine.bank.current().sequence[position(p)], at.track, at.row};
    SongTransaction view(p.engine.bank, p.engine.slots, "");
    const auto found = find_next(view, range, mask, after);
    if (!found) return false;
    if (found->position >= 0) p.engine.player.tr.nopat = static_cast<int16_t>(found->position);
    set_cursor_place(p, {found->row, found->track, kFieldNote});
    p.post(fourcc("doup"));
    return true;
}

// The block's marks outlive the block: without one marked they name cells nobody chose.
bool no_block(Program& p, EditRange::Kind scope, const char* to) {
    if (scope != EditRange::Kind::Block || p.editor.block.active) return false;
    p.say(std::string("No block is marked to ") + to);
    return true;
}

bool no_replacement(Program& p) {
    if (p.editor.search.replace.any_field()) return false;
    p.say("The replacement sets no field");
    return true;
}

// Every range but a block holds the cursor's cell.
bool holds_cursor(const EditRange& range, const CursorPlace& at) {
    if (range.kind != EditRange::Kind::Block) return true;
    const CellBlock& b = range.block;
    return at.track >= std::min(b.first_track, b.last_track) &&
           at.track <= std::max(b.first_track, b.last_track) && at.row >= std::min(b.first_row, b.last_row) &&
           at.row <= std::max(b.first_row, b.last_row);
}

}  // namespace

void cmd_find_next(Program& p, const ShellMessage&) {
    const SearchState& s = p.editor.search;
    if (no_block(p, s.scope, "search in")) return;
    if (!jump_to_next(p, search_range(p, s.scope), s.find)) p.say("Not found");
}

void cmd_replace_all(Program& p, const ShellMessage&) {
    const SearchState& s = p.editor.search;
    if (no_block(p, s.scope, "replace in") || no_replacement(p)) return;
    const EditRange range = search_range(p, s.scope);
    int replaced = 0;
    p.edit("Replace", [&](SongTransaction& t) { replaced = replace_all(t, range, s.find, s.replace); });
    p.say(std::to_string(replaced) + " cells replaced");
}

void cmd_replace_one(Program& p, const ShellMessage&) {
    const SearchState& s = p.editor.search;
    if (no_block(p, s.scope, "replace in") || no_replacement(p)) return;
    const EditRange range = search_range(p, s.scope);
    const CursorPlace at = cursor_place(p);
    bool replaced = false;
    if (holds_cursor(range, at)) {
        // replace_all over the one cell: it writes only when the cell is a hit.
        const int pattern = p.engine.bank.current().sequence[position(p)];
        const EditRange cell = EditRange::of_block({pattern, at.track, at.row, at.track, at.row});
        p.edit("Replace",
               [&](SongTransaction& t) { replaced = replace_all(t, cell, s.find, s.replace) > 0; });
    }
    const bool found = jump_to_next(p, range, s.find);
    if (replaced)
        p.say(found ? "1 cell replaced" : "1 cell replaced, no more found");
    else if (!found)
        p.say("Not found");
}

void cmd_find_unused_instruments(Program& p, const ShellMessage&) {
    SongTransaction view(p.engine.bank, p.engine.slots, "");
    const std::vector<int> unused = unused_instruments(view);
    p.editor.unused_instruments.assign(unused.begin(), unused.end());
    p.windows.instrument_list = true;
    int with_sound = 0;
    for (int i : unused) with_sound += p.engine.bank.song_sample(i - 1) != nullptr;
    p.say(std::to_string(with_sound) + " instruments with a sound are not used in the music");
}

void cmd_find_current_instrument(Program& p, const ShellMessage&) {
    CellMask mask;
    mask.instrument = static_cast<uint8_t>(p.engine.player.cursor.cursnd + 1);
    if (!jump_to_next(p, EditRange::whole_song(), mask))
        p.say("Instrument " + std::to_string(*mask.instrument) + " is not used in the music");
}

}  // namespace ondrel
