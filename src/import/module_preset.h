#pragma once
#include "song/song_bank.h"

namespace ondrel {

// The state the foreign-module readers start from: a new song's per-track tables,
// 64-row patterns, an empty sequence, 125 BPM at speed 6, global volume 64; format is
// the song's own pan mode (1 MOD and MTM, 2 S3M).
void preset_foreign_song(TMOD& m, int format);

// 8-bit data stored unsigned in the file, made signed as the record keeps it.
void make_signed8(uint8_t* data, uint32_t bytes);

// After a loop end the mixer may read up to three frames for interpolation: they repeat
// the loop's start, so the wrap sounds as it should.
void copy_loop_start_past_end(p_s& s);

}  // namespace ondrel
