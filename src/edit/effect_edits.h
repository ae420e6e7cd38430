#pragma once
#include <cstdint>

#include "edit/song_transaction.h"

namespace ondrel {

// The effect panel and the track buttons as undoable edits: the same rules as the live
// rack (render/effect_slot_rules.h), on the edit's copies of the slot types and the song.

// "Clone efx" on slot: the new slot, or -1. A refusal shows its alert through the bank's
// alert sink; an echo past the 15th clone is refused without one. Adding a unit of a type
// is cloning its basic slot (the slot numbered as the type).
int clone_effect(SongTransaction& t, int slot);
// "Remove efx" on slot: tracks routed to it go back to their dry sound. A basic slot is
// refused with its alert.
bool remove_effect(SongTransaction& t, int slot);

// The track's effect button: the next slot with a unit above or below the track's (the
// walk of mnplusefx / mnmoinsefx). The send buffers the routing needs are reserved first
// (they are kept once made). The new slot, or -1 when memory or units ran out.
int mnplusefx(SongTransaction& t, int track);
int mnmoinsefx(SongTransaction& t, int track);

// The echo panel. "Echo Delay (ms)" is the delay at 44100 frames a second: frames =
// ms x 441 / 10, 1 to 10000 ms; shown back rounded to the nearest ms. "Set To BPM" sets it
// to one beat at the song's tempo: tempo (microseconds) x 441 / 10000 frames, 480 ms at
// 125 BPM. The echo instance's line is grown before the song sees a longer delay.
inline constexpr uint32_t kMaxEchoDelayMs = 10000;
uint32_t echo_delay_frames(uint32_t ms);
uint32_t echo_delay_ms(uint32_t frames);
uint32_t beat_frames(uint32_t tempo);
// Each false when slot holds no echo (type 11) or nothing changed.
bool set_echo_delay_ms(SongTransaction& t, int slot, uint32_t ms);
bool set_echo_delay_to_beat(SongTransaction& t, int slot);
bool set_echo_feedback(SongTransaction& t, int slot, int feedback);  // "Feedback", 0..128 (128 = 1.0)
bool set_echo_invert(SongTransaction& t, int slot, bool on);         // "Invert Phase"

// "Auto Pan D" and its "Speed" (the pan step per buffer, 0..255; the step's sign, which
// the mixer flips at each bound, is kept), for any slot with a unit.
bool set_auto_pan(SongTransaction& t, int slot, bool on);
bool set_auto_pan_speed(SongTransaction& t, int slot, int speed);
// "Freq (Hz)" of an active filter (type 5), 10..20000 Hz (its design holds while
// f x 2 pi / 44100 stays below 3, about 21 kHz); "Q" of the two-pole filters (16, 17),
// 1..255 (0 would silence them).
bool set_active_filter_frequency(SongTransaction& t, int slot, int hz);
bool set_filter_q(SongTransaction& t, int slot, int q);

}  // namespace ondrel
