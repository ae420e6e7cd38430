#include "shell/editor_cursor.h"

#include <algorithm>

#include "shell/program.h"

namespace ondrel {

CursorPlace cursor_place(const Program& p) {
    const EditCursor& c = p.engine.player.cursor;
    return {c.poscurv, c.track, c.poscurx % kFieldsPerTrack};
}

int current_rows(const Program& p) {
    const TMOD& m = p.engine.bank.current();
    const int position = std::clamp<int>(p.engine.player.tr.nopat, 0, kPositions - 1);
    return std::max<int>(1, m.rows[m.sequence[position]]);
}

int current_tracks(const Program& p) {
    return std::clamp<int>(p.engine.bank.current().nbtrack, 1, kTracks);
}

void set_cursor_place(Program& p, CursorPlace place) {
    EditCursor& c = p.engine.player.cursor;
    place.row = std::clamp(place.row, 0, current_rows(p) - 1);
    place.track = std::clamp(place.track, 0, current_tracks(p) - 1);
    place.field = std::clamp<int>(place.field, 0, kFieldsPerTrack - 1);
    c.poscurv = static_cast<int16_t>(place.row);
    c.track = static_cast<int16_t>(place.track);
    c.poscurx = static_cast<int16_t>(place.track * kFieldsPerTrack + place.field);
}

void move_cursor_rows(Program& p, int rows, bool wrap) {
    CursorPlace place = cursor_place(p);
    const int count = current_rows(p);
    place.row += rows;
    if (wrap) place.row = ((place.row % count) + count) % count;
    set_cursor_place(p, place);
}

void move_cursor_fields(Program& p, int fields) {
    CursorPlace place = cursor_place(p);
    const int tracks = current_tracks(p);
    int at = place.track * kFieldsPerTrack + place.field + fields;
    const int all = tracks * kFieldsPerTrack;
    at = ((at % all) + all) % all;
    place.track = at / kFieldsPerTrack;
    place.field = at % kFieldsPerTrack;
    set_cursor_place(p, place);
}

void move_cursor_tracks(Program& p, int tracks) {
    CursorPlace place = cursor_place(p);
    const int count = current_tracks(p);
    place.track = ((place.track + tracks) % count + count) % count;
    place.field = kFieldNote;
    set_cursor_place(p, place);
}

}  // namespace ondrel
