#include "playback/midi_input_parser.h"

namespace ondrel {

namespace {
// Data bytes after a channel status: two, but one for program change and channel pressure.
int data_bytes(uint8_t status) {
    const uint8_t kind = status & 0xF0;
    return kind == 0xC0 || kind == 0xD0 ? 1 : 2;
}
}  // namespace

std::optional<MidiEvent> MidiInputParser::take(uint8_t byte) {
    if (byte >= 0xF8) return std::nullopt;  // real time: clock, start, stop, sensing
    if (byte >= 0xF0) {                     // system common and exclusive
        status_ = 0;
        have_ = 0;
        return std::nullopt;
    }
    if (byte & 0x80) {
        status_ = byte;
        have_ = 0;
        return std::nullopt;
    }
    if (!status_) return std::nullopt;  // data with nothing to belong to (inside a sysex)
    data_[have_++] = byte;
    const int need = data_bytes(status_);
    if (have_ < need) return std::nullopt;
    have_ = 0;
    MidiEvent m;
    m.bytes = {status_, data_[0], need == 2 ? data_[1] : uint8_t{0}};
    m.size = static_cast<uint8_t>(need + 1);
    return m;
}

}  // namespace ondrel
