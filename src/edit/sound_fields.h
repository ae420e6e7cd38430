#pragma once
#include <cstdint>
#include <string>
#include <vector>

#include "edit/song_transaction.h"

namespace ondrel {

// The fields of a sound that the instrument editor sets, each kept in its range (values
// beyond it are brought to its nearest end). Each returns false when the slot has no
// sound or the field already held the value.

// The name, cut to 31 characters.
bool set_sound_name(SongTransaction& t, int slot, const std::string& name);
bool set_sound_volume(SongTransaction& t, int slot, int volume);      // 0..128
bool set_sound_finetune(SongTransaction& t, int slot, int finetune);  // 0..15
bool set_sound_refnote(SongTransaction& t, int slot, int note);       // 0..127
// Frames per second, 1..65535: what sound files can carry, so a saved sound reads back.
bool set_sound_rate(SongTransaction& t, int slot, uint32_t rate);
// The loop, in frames: on or off, from start up to end (exclusive). Refused (false) when
// end passes the sound or start is not below end.
bool set_sound_loop(SongTransaction& t, int slot, bool on, uint32_t start, uint32_t end);

// Envelope kind k's (0..4) point p (0..4): x position 0..255 (point 0's x is not used and
// is left as it is), level 0..255. The x positions stay in order: a point's x is kept
// between its neighbours'.
bool set_envelope_point(SongTransaction& t, int slot, int kind, int point, int x, int level);
// Envelope kind k's bit of flagword: whether the mixer applies it.
bool set_envelope_enabled(SongTransaction& t, int slot, int kind, bool on);

// The envelope's values at count places spread evenly over what it runs on, exactly as
// the mixer computes them: the sound's frames for kinds 0..3, the fade length (setting)
// from the release on for kind 4. Entry i is the value at position i x length / count.
std::vector<float> envelope_curve(const p_s& sound, int kind, int count);

}  // namespace ondrel
