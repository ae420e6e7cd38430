#include "edit/cell_block.h"

namespace ondrel {

namespace {
bool field_matches(const std::optional<uint8_t>& wanted, uint8_t value) {
    return !wanted || *wanted == value;
}
void write_field(const std::optional<uint8_t>& value, uint8_t& field) {
    if (value) field = *value;
}
}  // namespace

bool CellMask::matches(const TNOTE& cell) const {
    return field_matches(note, cell.note) && field_matches(volume, cell.volume) &&
           field_matches(instrument, cell.instrument) && field_matches(command, cell.command) &&
           field_matches(parameter, cell.parameter);
}

void CellMask::apply_to(TNOTE& cell) const {
    write_field(note, cell.note);
    write_field(volume, cell.volume);
    write_field(instrument, cell.instrument);
    write_field(command, cell.command);
    write_field(parameter, cell.parameter);
}

}  // namespace ondrel
