// Edits over a block, a track, a pattern or the song: transpose and replace.
#include "edit/pattern_edits.h"
#include "edit/pattern_shape.h"

namespace ondrel {

TransposeResult transpose(SongTransaction& t, const EditRange& range, int semitones, int instrument) {
    TransposeResult result;
    if (semitones == 0) return result;
    for (const CellBlock& area : range_blocks(t, range))
        result.moved += change_cells(t, area, [&](TNOTE& c, int, int) {
            // Note-offs (bit 7) and cells without a note have nothing to move.
            if (c.note == 0 || (c.note & 0x80) || (instrument != 0 && c.instrument != instrument))
                return false;
            const int note = c.note + semitones;
            if (note < 1 || note > 127) {
                ++result.out_of_range;
                return false;
            }
            c.note = static_cast<uint8_t>(note);
            return true;
        });
    return result;
}

int replace_all(SongTransaction& t, const EditRange& range, const CellMask& find, const CellMask& with) {
    if (!find.any_field() || !with.any_field()) return 0;
    int replaced = 0;
    for (const CellBlock& area : range_blocks(t, range))
        replaced += change_cells(t, area, [&](TNOTE& c, int, int) {
            if (!find.matches(c)) return false;
            const TNOTE before = c;
            with.apply_to(c);
            return !(c == before);
        });
    return replaced;
}

}  // namespace ondrel
