#include "shell/note_keys.h"

#include <algorithm>
#include <cstring>

namespace ondrel {

namespace {

// Semitones above the base octave's C, key by key: two rows of a piano and five keys
// more. The "Atari" keyboard differs only where its Y and Z change places.
constexpr const char* kAmigaKeys = "zsxdcvgbhnjmq2w3er5t6y7ui9o0p";
constexpr const char* kAtariKeys = "ysxdcvgbhnjmq2w3er5t6z7ui9o0p";

int digit_value(int32_t key) {
    if (key >= '0' && key <= '9') return key - '0';
    if (key >= 'a' && key <= 'z') return key - 'a' + 10;
    return -1;
}

}  // namespace

std::optional<int> piano_note(KeyboardLayout layout, int32_t key, int octave) {
    if (key <= 0 || key > 127) return std::nullopt;
    const char* keys = layout == KeyboardLayout::Atari ? kAtariKeys : kAmigaKeys;
    const char* at = std::strchr(keys, static_cast<char>(key));
    if (!at || !*at) return std::nullopt;
    const int note =
        (std::clamp(octave, kLowestOctave, kHighestOctave) + 2) * 12 + static_cast<int>(at - keys);
    if (note < 1 || note > 127) return std::nullopt;
    return note;
}

bool is_note_off_key(int32_t key) {
    return key == '1' || key == '`';
}

std::optional<TNOTE> type_digit(const TNOTE& cell, int field, int32_t key) {
    const int d = digit_value(key);
    if (d < 0) return std::nullopt;
    TNOTE out = cell;
    switch (field) {
        case kFieldInstrument0:
            if (d > 12) return std::nullopt;
            out.instrument = static_cast<uint8_t>(std::min(127, d * 10 + cell.instrument % 10));
            return out;
        case kFieldInstrument1:
            if (d > 9) return std::nullopt;
            out.instrument = static_cast<uint8_t>(std::min(127, cell.instrument / 10 * 10 + d));
            return out;
        case kFieldVolume0:
        case kFieldVolume1:
        case kFieldVolume2: {
            if (d > 9) return std::nullopt;
            static constexpr int kPlace[] = {100, 10, 1};
            const int place = kPlace[field - kFieldVolume0];
            const int value = cell.volume - (cell.volume / place % 10) * place + d * place;
            out.volume = static_cast<uint8_t>(std::min(255, value));
            return out;
        }
        case kFieldCommand:
            if (d > 35) return std::nullopt;
            out.command = static_cast<uint8_t>(d);
            return out;
        case kFieldParameter0:
            if (d > 15) return std::nullopt;
            out.parameter = static_cast<uint8_t>(d << 4 | (cell.parameter & 15));
            return out;
        case kFieldParameter1:
            if (d > 15) return std::nullopt;
            out.parameter = static_cast<uint8_t>((cell.parameter & 0xF0) | d);
            return out;
        default: return std::nullopt;
    }
}

}  // namespace ondrel
