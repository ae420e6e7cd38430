#include "shell/song_file_attributes.h"

#include <array>
#include <cstdint>

#include "platform/file_attributes.h"

namespace ondrel {

namespace {
struct AttributeField {
    const char* name;
    int16_t EditorPosition::*field;
};

constexpr std::array<AttributeField, 5> kAttributes{{
    {"user.on_nopat", &EditorPosition::nopat},
    {"user.on_v", &EditorPosition::poscurv},
    {"user.on_x", &EditorPosition::poscurx},
    {"user.on_y", &EditorPosition::scroll_y},
    {"user.oftrack", &EditorPosition::oftrack},
}};
}  // namespace

void writeinfo_in_file(const std::string& path, const EditorPosition& position) {
    if (path.empty()) return;
    for (const AttributeField& a : kAttributes) {
        const uint32_t value = static_cast<uint32_t>(static_cast<int32_t>(position.*a.field));
        const uint8_t bytes[4] = {uint8_t(value), uint8_t(value >> 8), uint8_t(value >> 16),
                                  uint8_t(value >> 24)};
        write_file_attribute(path, a.name, bytes, sizeof bytes);
    }
}

void readinfo_in_file(const std::string& path, EditorPosition& position) {
    if (path.empty()) return;
    for (const AttributeField& a : kAttributes) {
        // Room for more than 4 bytes, so a longer value reads as "not exactly 4".
        uint8_t bytes[8] = {};
        if (read_file_attribute(path, a.name, bytes, sizeof bytes) != 4) continue;
        const uint32_t value = uint32_t(bytes[0]) | uint32_t(bytes[1]) << 8 | uint32_t(bytes[2]) << 16 |
                               uint32_t(bytes[3]) << 24;
        position.*a.field = static_cast<int16_t>(static_cast<int32_t>(value));
    }
}

}  // namespace ondrel
