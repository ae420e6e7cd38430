#include "shell/editor_keys.h"

#include <algorithm>

#include "edit/pattern_edits.h"
#include "shell/editor_cursor.h"
#include "shell/note_keys.h"
#include "shell/program.h"

namespace ondrel {

namespace {

constexpr int kPageRows = 16;

int current_pattern(const Program& p) {
    const TMOD& m = p.engine.bank.current();
    return m.sequence[std::clamp<int>(p.engine.player.tr.nopat, 0, kPositions - 1)];
}

TNOTE cell_at(const Program& p, int track, int row) {
    const Pattern* pattern = p.engine.bank.song_pattern(current_pattern(p));
    const TNOTE* cell = pattern ? pattern->cell(track, row) : nullptr;
    return cell ? *cell : TNOTE{};
}

void write_at(Program& p, int track, int row, const TNOTE& cell, const char* label) {
    const int pattern = current_pattern(p);
    p.edit(label, [&](SongTransaction& t) { write_cell(t, pattern, track, row, cell); });
}

void advance(Program& p) {
    p.engine.player.jump(p.engine.player.cursor.jumpstep, false);
}

// Shift+arrows: the block runs from where the marking began to the cursor.
void mark_to_cursor(Program& p, const CursorPlace& before) {
    EditorState& e = p.editor;
    if (!e.block.active) {
        e.block_anchor_track = static_cast<int16_t>(before.track);
        e.block_anchor_row = static_cast<int16_t>(before.row);
    }
    const CursorPlace now = cursor_place(p);
    e.block.active = true;
    e.block.first_track = static_cast<int16_t>(std::min<int>(e.block_anchor_track, now.track));
    e.block.last_track = static_cast<int16_t>(std::max<int>(e.block_anchor_track, now.track));
    e.block.first_row = static_cast<int16_t>(std::min<int>(e.block_anchor_row, now.row));
    e.block.last_row = static_cast<int16_t>(std::max<int>(e.block_anchor_row, now.row));
}

bool navigate(Program& p, const KeyChord& chord) {
    const bool shift = chord.mods & kModShift;
    const CursorPlace before = cursor_place(p);
    switch (chord.key) {
        case kKeyUp: move_cursor_rows(p, -1, !shift); break;
        case kKeyDown: move_cursor_rows(p, 1, !shift); break;
        case kKeyPageUp: move_cursor_rows(p, -kPageRows, false); break;
        case kKeyPageDown: move_cursor_rows(p, kPageRows, false); break;
        case kKeyHome: move_cursor_rows(p, -kMaxRows, false); break;
        case kKeyEnd: move_cursor_rows(p, kMaxRows, false); break;
        case kKeyLeft:
            if (shift)
                move_cursor_tracks(p, -1);
            else
                move_cursor_fields(p, -1);
            break;
        case kKeyRight:
            if (shift)
                move_cursor_tracks(p, 1);
            else
                move_cursor_fields(p, 1);
            break;
        case kKeyTab: move_cursor_tracks(p, shift ? -1 : 1); return true;
        default: return false;
    }
    if (shift) mark_to_cursor(p, before);
    return true;
}

void enter_note(Program& p, int note) {
    EditorState& e = p.editor;
    Player& player = p.engine.player;
    const CursorPlace place = cursor_place(p);
    const bool chord = player.tr.faccedit && e.chord.keys_down > 1 && e.chord.notes > 0;
    const int track = chord ? e.chord.first_track + e.chord.notes : place.track;
    const int row = chord ? e.chord.row : place.row;
    if (track >= current_tracks(p)) return;  // a chord wider than the song's tracks
    TNOTE cell = cell_at(p, track, row);
    cell.note = static_cast<uint8_t>(note);
    cell.instrument = static_cast<uint8_t>(player.cursor.cursnd + 1);
    if (!chord) e.chord = {row, track, 0, e.chord.keys_down};
    ++e.chord.notes;
    if (e.edit_mode) write_at(p, track, row, cell, "Note");
    if (!player.tr.playing) player.tr.nopos = static_cast<int16_t>(row);
    player.audition_note(TNOTE{cell.note, cell.volume, 0, cell.instrument, cell.command, cell.parameter},
                         track);
    if (e.edit_mode && !chord) advance(p);
}

void clear_under_cursor(Program& p, bool whole_cell) {
    const CursorPlace place = cursor_place(p);
    CellPart part = CellPart::All;
    if (!whole_cell) {
        if (place.field == kFieldNote)
            part = CellPart::Note;
        else if (place.field <= kFieldInstrument1)
            part = CellPart::Instrument;
        else if (place.field <= kFieldVolume2)
            part = CellPart::Volume;
        else
            part = CellPart::Effect;
    }
    const int pattern = current_pattern(p);
    p.edit("Clear", [&](SongTransaction& t) { clear_cell_part(t, pattern, place.track, place.row, part); });
    advance(p);
}

void shift_rows(Program& p, bool insert) {
    const CursorPlace place = cursor_place(p);
    const int pattern = current_pattern(p);
    p.edit(insert ? "Insert row" : "Delete row", [&](SongTransaction& t) {
        if (insert)
            insert_row(t, pattern, place.track, place.row);
        else
            delete_row(t, pattern, place.track, place.row);
    });
}

}  // namespace

void editor_key_down(Program& p, const KeyChord& chord, bool repeat) {
    if (navigate(p, chord)) return;
    if (chord.key == kKeyEscape) {
        p.editor.block.active = false;
        return;
    }
    if (chord.key == kKeyPadPlus || chord.key == kKeyPadMinus) {
        p.editor.octave =
            std::clamp(p.editor.octave + (chord.key == kKeyPadPlus ? 1 : -1), kLowestOctave, kHighestOctave);
        p.say("Octave " + std::to_string(p.editor.octave));
        return;
    }
    if (chord.key == kKeyPadDivide || chord.key == kKeyPadMultiply) {
        const int slot = std::clamp(p.engine.player.cursor.cursnd + (chord.key == kKeyPadMultiply ? 1 : -1),
                                    0, kSamplesPerSong - 1);
        p.post(ShellMessage(fourcc("ILsl")).with("instrument", slot + 1));
        p.say("Instrument " + std::to_string(slot + 1));
        return;
    }
    if (chord.mods & (kModCtrl | kModAlt)) return;
    const bool editing = p.editor.edit_mode;
    if (editing && chord.key == kKeyDelete) return clear_under_cursor(p, chord.mods & kModShift);
    if (editing && chord.key == kKeyInsert) return shift_rows(p, true);
    if (editing && chord.key == kKeyBackspace) return shift_rows(p, false);

    // Outside edit mode the piano plays from any column; in it, digits go into the field.
    const CursorPlace place = cursor_place(p);
    if (place.field == kFieldNote || !editing) {
        if (editing && is_note_off_key(chord.key) && !repeat) {
            TNOTE cell = cell_at(p, place.track, place.row);
            cell.note = 0x80;
            write_at(p, place.track, place.row, cell, "Note off");
            advance(p);
            return;
        }
        if (const auto note = piano_note(p.editor.layout, chord.key, p.editor.octave)) {
            if (repeat) return;
            ++p.editor.chord.keys_down;
            enter_note(p, *note);
        }
        return;
    }
    if (!editing) return;
    if (const auto cell = type_digit(cell_at(p, place.track, place.row), place.field, chord.key)) {
        write_at(p, place.track, place.row, *cell, "Type");
        advance(p);
    }
}

void enter_note_at_cursor(Program& p, int note) {
    // A MIDI key is never a digit: it enters its note whatever field the cursor is on.
    enter_note(p, note);
}

void editor_key_up(Program& p, const KeyChord& chord) {
    if (!piano_note(p.editor.layout, chord.key, p.editor.octave)) return;
    ChordEntry& c = p.editor.chord;
    c.keys_down = std::max(0, c.keys_down - 1);
    if (c.keys_down == 0) c.notes = 0;
}

}  // namespace ondrel
