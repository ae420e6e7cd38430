#pragma once
#include <cstdint>
#include <vector>

#include "edit/song_transaction.h"

namespace ondrel {

// Edits of one sound (sample slot, local number 0..127) in frames. A range with
// first == end means "the whole sound"; one that runs past the sound's end is cut there.
// Every tool works on 8- and 16-bit, mono and
// stereo sounds, never reads or writes outside the data, and keeps loop points and block
// marks inside the sound afterwards.
struct FrameRange {
    uint32_t first = 0;
    uint32_t end = 0;  // one past the last frame
    bool whole() const { return first == end; }
};

// The sound tools: "Fade In", "Fade Out", "Normalize", "Reverse", "Invert Sign".
// Fades run in whole steps of value x i / (count - 1) (i the frame's place in the range,
// truncated toward zero): from silence to the sound (in) or back (out); a one-frame fade is
// silence. Normalize scales to the format's largest positive value (127, 32767), rounding
// to nearest; silence stays as it is. Reverse turns the frames round (each frame's
// channels stay in order). Invert Sign negates, the most negative value becoming the most
// positive. False when the slot has no sound, the range lies past it, or nothing changed.
enum class SoundTool : uint8_t { FadeIn, FadeOut, Normalize, Reverse, InvertSign };
bool apply_sound_tool(SongTransaction& t, int slot, SoundTool tool, FrameRange range);
// The tool's name as menus and undo show it: "Fade In", ...
const char* sound_tool_label(SoundTool tool);

// Frames cut or copied out of a sound, in its own format and rate (the rate a sound made
// by pasting into an empty slot gets).
struct SoundClip {
    int16_t bits = 16;
    bool stereo = false;
    uint32_t rate = 44100;
    std::vector<uint8_t> bytes;
    uint32_t frames() const;
};
// Cutting the whole sound leaves its record (name, settings) with no data. Loop points and
// blocks after the frames cut move back with them; those inside go to where the cut was.
SoundClip copy_frames(const SongTransaction& t, int slot, FrameRange range);
bool cut_frames(SongTransaction& t, int slot, FrameRange range);
bool crop_to_frames(SongTransaction& t, int slot, FrameRange range);
bool silence_frames(SongTransaction& t, int slot, FrameRange range);
// Inserts clip at frame (past the end: at the end), converted to the sound's format:
// 8 to 16 bits x 256, 16 to 8 bits >> 8, stereo to mono the channels' mean (truncated),
// mono to stereo both channels the same. An empty slot, or a record without data,
// becomes a sound of the clip's format and rate. Loop points and blocks from frame on
// move with what follows them. False when the result would pass kMaxSampleBytes.
bool paste_frames(SongTransaction& t, int slot, uint32_t frame, const SoundClip& clip);

}  // namespace ondrel
