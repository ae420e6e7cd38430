#include "shell/keys.h"

namespace ondrel {

namespace {
const char* special_name(int32_t key) {
    switch (key) {
        case kKeyUp: return "Up";
        case kKeyDown: return "Down";
        case kKeyLeft: return "Left";
        case kKeyRight: return "Right";
        case kKeyPageUp: return "PgUp";
        case kKeyPageDown: return "PgDn";
        case kKeyHome: return "Home";
        case kKeyEnd: return "End";
        case kKeyTab: return "Tab";
        case kKeyEnter: return "Enter";
        case kKeyEscape: return "Esc";
        case kKeyDelete: return "Del";
        case kKeyInsert: return "Ins";
        case kKeyBackspace: return "Backspace";
        case kKeyPadPlus: return "Keypad +";
        case kKeyPadMinus: return "Keypad -";
        case kKeyPadMultiply: return "Keypad *";
        case kKeyPadDivide: return "Keypad /";
        case kKeySpace: return "Space";
        default: return nullptr;
    }
}
}  // namespace

std::string chord_text(const KeyChord& chord) {
    if (chord.empty()) return {};
    std::string text;
    if (chord.mods & kModCtrl) text += "Ctrl+";
    if (chord.mods & kModAlt) text += "Alt+";
    if (chord.mods & kModShift) text += "Shift+";
    if (chord.key >= kKeyF1 && chord.key <= kKeyF12)
        return text + "F" + std::to_string(chord.key - kKeyF1 + 1);
    if (const char* name = special_name(chord.key)) return text + name;
    if (chord.key > ' ' && chord.key < 127) {
        const char c = static_cast<char>(chord.key);
        return text + static_cast<char>(c >= 'a' && c <= 'z' ? c - 'a' + 'A' : c);
    }
    return text + "?";
}

}  // namespace ondrel
