#pragma once
#include <cstdint>
#include <string>
#include <vector>

#include "song/effect_slots.h"
#include "song/song_bank.h"

namespace ondrel {

// The native file of song: "o.t." version 1, "inst" per sample, "patt" per pattern,
// then "efx.".
std::vector<uint8_t> write_otm(const SongBank& bank, int song, const EffectSlots& slots);

// Saves the song to path (by the rules of OutputFile) and records path in the song; false
// with why set.
bool save_otm(const std::string& path, SongBank& bank, int song, const EffectSlots& slots, std::string& why);

}  // namespace ondrel
