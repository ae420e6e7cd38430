#pragma once
#include <cstdint>
#include <string>

namespace ondrel {

// Keys as the program names them, whatever the window system: printable keys are their
// lower-case character as the keyboard labels it; the others have codes above 255.
enum Key : int32_t {
    kKeyNone = 0,
    kKeyF1 = 256,  // F1 .. F12 follow
    kKeyF12 = kKeyF1 + 11,
    kKeyUp = 300,
    kKeyDown,
    kKeyLeft,
    kKeyRight,
    kKeyPageUp,
    kKeyPageDown,
    kKeyHome,
    kKeyEnd,
    kKeyTab,
    kKeyEnter,
    kKeyEscape,
    kKeyDelete,
    kKeyInsert,
    kKeyBackspace,
    kKeyPadPlus,
    kKeyPadMinus,
    kKeyPadMultiply,
    kKeyPadDivide,
    kKeySpace = ' ',
};

enum KeyMods : uint8_t { kModNone = 0, kModCtrl = 1, kModShift = 2, kModAlt = 4 };

struct KeyChord {
    int32_t key = kKeyNone;
    uint8_t mods = kModNone;
    friend bool operator==(const KeyChord&, const KeyChord&) = default;
    bool empty() const { return key == kKeyNone; }
};

constexpr KeyChord ctrl(int32_t key) {
    return {key, kModCtrl};
}
constexpr KeyChord ctrl_shift(int32_t key) {
    return {key, kModCtrl | kModShift};
}
constexpr KeyChord plain(int32_t key) {
    return {key, kModNone};
}
constexpr KeyChord alt(int32_t key) {
    return {key, kModAlt};
}

// "Ctrl+Shift+S", "F5": how menus show a shortcut.
std::string chord_text(const KeyChord& chord);

}  // namespace ondrel
