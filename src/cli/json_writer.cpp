#include "cli/json_writer.h"

#include <cstdio>

namespace ondrel {

void JsonWriter::string_value(const std::string& s) {
    out += '"';
    for (unsigned char c : s) {
        switch (c) {
            case '"': out += "\\\""; break;
            case '\\': out += "\\\\"; break;
            case '\n': out += "\\n"; break;
            case '\t': out += "\\t"; break;
            case '\r': out += "\\r"; break;
            default:
                if (c < 0x20 || c >= 0x7f) {
                    // Names in module files are in old 8-bit code pages: keep the byte,
                    // shown as its Latin-1 character, so the output stays valid UTF-8.
                    char esc[8];
                    std::snprintf(esc, sizeof esc, "\\u%04x", c);
                    out += esc;
                } else {
                    out += static_cast<char>(c);
                }
        }
    }
    out += '"';
}

}  // namespace ondrel
