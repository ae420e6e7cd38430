#pragma once
#include <SDL.h>

#include "shell/keys.h"

namespace ondrel {

// An SDL key event as the program names keys: the key as the keyboard labels it (so the
// note keys follow the chosen layout's letters), and Ctrl, Shift and Alt.
KeyChord chord_of(const SDL_Keysym& key);

}  // namespace ondrel
