#include "shell/cell_text.h"

#include <cstdio>

#include "playback/note_names.h"

namespace ondrel {

namespace {
constexpr char kHex[] = "0123456789ABCDEF";
constexpr int kColumns[kFieldsPerTrack] = {0, 5, 6, 8, 9, 10, 12, 13, 14};
}  // namespace

char command_char(int command) {
    if (command < 10) return static_cast<char>('0' + command);
    if (command < 36) return static_cast<char>('A' + command - 10);
    return '?';
}

CellText cell_text(const TNOTE& cell) {
    CellText t{};
    if (cell.note & 0x80)
        std::snprintf(t.note, sizeof t.note, "OFF ");
    else if (cell.note)
        const_midit(cell.note, t.note);
    else
        std::snprintf(t.note, sizeof t.note, "--- ");

    if (!cell.instrument)
        std::snprintf(t.instrument, sizeof t.instrument, "..");
    else if (cell.instrument < 100) {
        // Two digits by hand: some builds cannot tell that "%02d" fits and warn.
        t.instrument[0] = static_cast<char>('0' + cell.instrument / 10);
        t.instrument[1] = static_cast<char>('0' + cell.instrument % 10);
    } else
        std::snprintf(t.instrument, sizeof t.instrument, "%c%d", 'A' + cell.instrument / 10 - 10,
                      cell.instrument % 10);

    if (!cell.volume)
        std::snprintf(t.volume, sizeof t.volume, "...");
    else
        std::snprintf(t.volume, sizeof t.volume, "%03d", cell.volume);

    if (!cell.command && !cell.parameter) {
        std::snprintf(t.command, sizeof t.command, ".");
        std::snprintf(t.parameter, sizeof t.parameter, "..");
    } else {
        t.command[0] = command_char(cell.command);
        t.parameter[0] = kHex[cell.parameter >> 4];
        t.parameter[1] = kHex[cell.parameter & 15];
    }
    return t;
}

int field_column(int field) {
    return kColumns[field < 0 ? 0 : field >= kFieldsPerTrack ? kFieldsPerTrack - 1 : field];
}

int field_width(int field) {
    return field == kFieldNote ? 4 : 1;
}

int field_at_column(int x) {
    int best = kFieldNote;
    for (int f = 0; f < kFieldsPerTrack; ++f)
        if (x >= kColumns[f]) best = f;
    return best;
}

}  // namespace ondrel
