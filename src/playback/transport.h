#pragma once
#include <array>
#include <atomic>
#include <cstdint>

#include "song/tmod.h"
#include "song/tnote.h"

namespace ondrel {

// The transport: written by the window thread (start, stop, auditions) and by the
// sequencer on the audio thread; every field either side writes is atomic.
struct Transport {
    std::atomic<uint8_t> playing{0};         // 1 while playing; start sets it, the song's end clears it
    std::atomic<uint8_t> oldplaying{0};      // playing as the sequencer saw it last
    std::atomic<int64_t> startplaying{0};    // steady clock in microseconds when playing last changed
    std::atomic<uint8_t> playp{0};           // 0 "PLAYING ALL" (the song), 1 "PLAYING PATTERN" (one position)
    std::atomic<uint8_t> floop{0};           // 1: at the end, play goes on from patstart instead of stopping
    std::atomic<int16_t> notick{0};          // half-tick within the row, 0..2 x speed - 1
    std::atomic<int16_t> patdelay{0};        // half-ticks of pattern delay still to run (command EEx)
    std::atomic<int16_t> nopos{0};           // row being played, 0..rows - 1
    std::atomic<int16_t> nopat{0};           // sequence position being played, 0..nbpos - 1
    std::atomic<int16_t> patstart{0};        // position play restarts from after the last (the song's repeat)
    std::atomic<int16_t> patend{1};          // positions played: the song's nbpos (dopatend)
    std::atomic<uint8_t> fbreak{0};          // 1: a jump to breakpat, breaklig is taken at the row's end
    std::atomic<int16_t> breakpat{0};        // position of the pending jump (commands 11, 13)
    std::atomic<int16_t> breaklig{0};        // row of the pending jump
    std::atomic<uint8_t> fplayline{0};       // 1: play one row, then stop
    std::atomic<uint8_t> fplayonenote{0};    // a one-cell audition is running
    std::atomic<uint8_t> afpending{0};       // its cell, afnote, has not sounded yet
    TNOTE afnote{};                          // published by afpending (release/acquire)
    std::atomic<int16_t> aftrack{0};         // track the audition plays on
    std::atomic<uint8_t> fplaytrack{0};      // 1: only track notrkplaytrack of position nopatplaytrack plays
    std::atomic<int16_t> nopatplaytrack{0};  // position of the one-track audition
    std::atomic<int16_t> notrkplaytrack{0};  // track of the one-track audition
    std::atomic<uint8_t> faccedit{1};        // editing mode; when 0 a one-note audition reads only its track
    std::atomic<uint8_t> fvuvu{1};           // 1: the level meters fall by one every call
    std::array<std::atomic<float>, kTracks> valvu{};  // level meter of each track, 0..128; a note sets 128
    std::array<int16_t, kTracks> notesended{};        // last MIDI note sent + 1 per track; 0 = none
    std::array<int16_t, kTracks> instsended{};        // last MIDI program sent per track
};

// Where the editor stands; the sequencer reads it for auditions and block play.
struct EditCursor {
    std::atomic<int16_t> poscurv{0};          // row
    std::atomic<int16_t> poscurx{0};          // column
    std::atomic<int16_t> track{0};            // track under the cursor
    std::atomic<int16_t> cursnd{0};           // sound being edited, 0-based
    std::atomic<uint8_t> fplayblock{0};       // 1: notes of the edited sound play its selected block
    std::atomic<uint32_t> blockstart{65535};  // selected block of the sample editor, in frames
    std::atomic<uint32_t> blockend{65535};
    std::atomic<int16_t> jumpstep{1};        // edit step, "Jump 1 line" .. "Jump 8 lines"
    std::array<uint8_t, kTracks> fshadow{};  // hidden tracks
};

inline constexpr const char* kStatusPlayingAll = "PLAYING ALL";
inline constexpr const char* kStatusPlayingPattern = "PLAYING PATTERN";
inline constexpr const char* kStatusStopped = "STOPPED";
inline constexpr const char* kStatusSoundStopped = "SOUND STOPPED";

}  // namespace ondrel
