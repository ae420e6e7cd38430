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
    std::atomic<uint8_t> playing{0};
    std::atomic<uint8_t> oldplaying{0};
    std::atomic<int64_t> startplaying{0};  // microseconds
    std::atomic<uint8_t> playp{0};         // 0 song, 1 pattern
    std::atomic<uint8_t> floop{0};
    std::atomic<int16_t> notick{0};  // half-tick within the row
    std::atomic<int16_t> patdelay{0};
    std::atomic<int16_t> nopos{0};  // row
    std::atomic<int16_t> nopat{0};  // sequence position
    std::atomic<int16_t> patstart{0};
    std::atomic<int16_t> patend{1};
    std::atomic<uint8_t> fbreak{0};
    std::atomic<int16_t> breakpat{0};
    std::atomic<int16_t> breaklig{0};
    std::atomic<uint8_t> fplayline{0};
    std::atomic<uint8_t> fplayonenote{0};  // a one-cell audition is running
    std::atomic<uint8_t> afpending{0};     // its cell, afnote, has not sounded yet
    TNOTE afnote{};                        // published by afpending (release/acquire)
    std::atomic<int16_t> aftrack{0};       // track the audition plays on
    std::atomic<uint8_t> fplaytrack{0};
    std::atomic<int16_t> nopatplaytrack{0};
    std::atomic<int16_t> notrkplaytrack{0};
    std::atomic<uint8_t> faccedit{1};
    std::atomic<uint8_t> fvuvu{1};
    std::array<std::atomic<float>, kTracks> valvu{};
    std::array<int16_t, kTracks> notesended{};  // last MIDI note + 1 per track
    std::array<int16_t, kTracks> instsended{};  // last program per track
};

// Where the editor stands; the sequencer reads it for auditions and block play.
struct EditCursor {
    std::atomic<int16_t> poscurv{0};  // row
    std::atomic<int16_t> poscurx{0};  // column
    std::atomic<int16_t> track{0};    // track under the cursor
    std::atomic<int16_t> cursnd{0};   // sound being edited, 0-based
    std::atomic<uint8_t> fplayblock{0};
    std::atomic<uint32_t> blockstart{65535};  // selected block of the sample editor
    std::atomic<uint32_t> blockend{65535};
    std::atomic<int16_t> jumpstep{1};        // edit step, "Jump 1 line" .. "Jump 8 lines"
    std::array<uint8_t, kTracks> fshadow{};  // hidden tracks
};

inline constexpr const char* kStatusPlayingAll = "PLAYING ALL";
inline constexpr const char* kStatusPlayingPattern = "PLAYING PATTERN";
inline constexpr const char* kStatusStopped = "STOPPED";
inline constexpr const char* kStatusSoundStopped = "SOUND STOPPED";

}  // namespace ondrel
