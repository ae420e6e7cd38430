#pragma once
#include <cstdint>
#include <optional>
#include <string>

#include "edit/sound_edits.h"

namespace ondrel {

// The blocks of a sound that command 30 plays: block n (1..8) of sound slot s (0-based)
// is pair n - 1 of entry s + 1 of the song's patmark table (a cell names its instrument
// number, s + 1, and command 30 reads that entry), start frame in position, end frame
// (exclusive; 0 = the sound's end) in value. Slot 127 has no entry: cells reach sounds
// 1..127 only.
inline constexpr int kSoundBlocks = kMarksPerPattern;

// "Block 1" .. "Block 8".
std::string block_name(int n);
// The patmark entry of a sound slot; -1 for none.
int block_entry(int slot);

// Block n of the sound in slot as frames of a sound of frames frames (an end of 0 read
// as the sound's end); none when it is not set.
std::optional<FrameRange> sound_block(const TMOD& song, int slot, int n, uint32_t frames);

// Sets block n to range (the whole sound for an empty range), cut at the sound's end;
// false when the slot has no sound or the range lies past it.
bool set_sound_block(SongTransaction& t, int slot, int n, FrameRange range);
// Moves block n to start at first, keeping its length, stopped at the sound's end.
bool move_sound_block(SongTransaction& t, int slot, int n, uint32_t first);
bool clear_sound_block(SongTransaction& t, int slot, int n);

// How positions move when frames are cut out of a sound, put in, or all but some cut
// away. Start points at the place of an insertion move with what follows them; end points
// (exclusive) stay with what precedes them.
struct FrameShift {
    enum class Kind : uint8_t { Cut, Insert, Crop };
    Kind kind = Kind::Cut;
    uint32_t first = 0;  // Cut, Crop: the frames [first, first + count); Insert: where
    uint32_t count = 0;
    uint64_t start_point(uint64_t p, int shift) const;
    uint64_t end_point(uint64_t p, int shift) const;
};

// After the frames of the sound in slot moved by shift (the sound in the edit already
// holds its new data): its loop points (bytes) and its blocks (frames) follow, and all
// stay inside the sound. A loop left empty is switched off, a block left empty cleared.
void follow_frames(SongTransaction& t, int slot, const FrameShift& shift);

}  // namespace ondrel
