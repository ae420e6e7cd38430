#include "shell/gui/key_translation.h"

namespace ondrel {

namespace {
int32_t key_of(SDL_Keycode code) {
    if (code >= SDLK_F1 && code <= SDLK_F12) return kKeyF1 + (code - SDLK_F1);
    switch (code) {
        case SDLK_UP: return kKeyUp;
        case SDLK_DOWN: return kKeyDown;
        case SDLK_LEFT: return kKeyLeft;
        case SDLK_RIGHT: return kKeyRight;
        case SDLK_PAGEUP: return kKeyPageUp;
        case SDLK_PAGEDOWN: return kKeyPageDown;
        case SDLK_HOME: return kKeyHome;
        case SDLK_END: return kKeyEnd;
        case SDLK_TAB: return kKeyTab;
        case SDLK_RETURN:
        case SDLK_KP_ENTER: return kKeyEnter;
        case SDLK_ESCAPE: return kKeyEscape;
        case SDLK_DELETE: return kKeyDelete;
        case SDLK_INSERT: return kKeyInsert;
        case SDLK_BACKSPACE: return kKeyBackspace;
        case SDLK_KP_PLUS: return kKeyPadPlus;
        case SDLK_KP_MINUS: return kKeyPadMinus;
        case SDLK_KP_MULTIPLY: return kKeyPadMultiply;
        case SDLK_KP_DIVIDE: return kKeyPadDivide;
        default: break;
    }
    if (code >= SDLK_KP_1 && code <= SDLK_KP_9) return '1' + (code - SDLK_KP_1);
    if (code == SDLK_KP_0) return '0';
    if (code > 0 && code < 127) return code >= 'A' && code <= 'Z' ? code - 'A' + 'a' : code;
    return kKeyNone;
}
}  // namespace

KeyChord chord_of(const SDL_Keysym& key) {
    KeyChord chord;
    chord.key = key_of(key.sym);
    if (key.mod & KMOD_CTRL) chord.mods |= kModCtrl;
    if (key.mod & KMOD_SHIFT) chord.mods |= kModShift;
    if (key.mod & KMOD_ALT) chord.mods |= kModAlt;
    return chord;
}

}  // namespace ondrel
