#pragma once
#include <string>

#include "song/effect_slots.h"
#include "song/song_bank.h"

namespace ondrel {

// The song as one JSON object (keys named after the song record's fields).
std::string song_json(const SongBank& bank, int song);
// The song for people to read.
std::string song_text(const SongBank& bank, int song, const EffectSlots& slots);

// One sample record as JSON (the keys of an entry of "samples") and for people.
std::string sample_json(const p_s& s, int index);
std::string sample_text(const p_s& s);

// Cells of a pattern column that are not empty.
int used_cells(const TNOTE* column, int rows);

}  // namespace ondrel
