#pragma once
#include <cstdint>
#include <vector>

#include "edit/song_transaction.h"

namespace ondrel {

// Edits of one sound (sample slot, local number 0..127) in frames. A range with
// first == end means "the whole sound". Every tool works on 8- and 16-bit, mono and
// stereo sounds, never reads or writes outside the data, and keeps loop points and block
// marks inside the sound afterwards.
struct FrameRange {
    uint32_t first = 0;
    uint32_t end = 0;  // one past the last frame
    bool whole() const { return first == end; }
};

// The sound tools: "Fade In", "Fade Out", "Normalize", "Reverse", "Invert Sign".
enum class SoundTool : uint8_t { FadeIn, FadeOut, Normalize, Reverse, InvertSign };
bool apply_sound_tool(SongTransaction& t, int slot, SoundTool tool, FrameRange range);

// Frames cut or copied out of a sound, in its own format.
struct SoundClip {
    int16_t bits = 16;
    bool stereo = false;
    std::vector<uint8_t> bytes;
    uint32_t frames() const;
};
SoundClip copy_frames(const SongTransaction& t, int slot, FrameRange range);
bool cut_frames(SongTransaction& t, int slot, FrameRange range);
bool crop_to_frames(SongTransaction& t, int slot, FrameRange range);
bool silence_frames(SongTransaction& t, int slot, FrameRange range);
// Inserts clip at frame (converted to the sound's bits and channels); an empty slot
// becomes a sound of the clip's format.
bool paste_frames(SongTransaction& t, int slot, uint32_t frame, const SoundClip& clip);

}  // namespace ondrel
