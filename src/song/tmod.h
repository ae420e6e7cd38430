#pragma once
#include <cstddef>
#include <cstdint>

namespace ondrel {

inline constexpr int kMaxSongs = 64;  // entries of timod; 63 usable
inline constexpr int kSongsUsable = 63;
inline constexpr int kPatternsPerSong = 128;
inline constexpr int kSamplesPerSong = 128;
inline constexpr int kTracks = 64;
inline constexpr int kPositions = 256;
inline constexpr int kEffectSlots = 100;
inline constexpr int kEchoUnits = 16;
inline constexpr int kMarksPerPattern = 8;
inline constexpr int32_t kEmptyMark = 2147483647;
inline constexpr int kMaxRows = 1024;  // bound for row counts taken from files

// One mark of the sample editor's blocks: where block n of a sound starts and ends.
struct PatMark {
    int32_t position;  // block start in frames; kEmptyMark when the block is not set
    int32_t value;     // block end in frames
};

// The song record, one per song in memory. Field order and widths are those of the
// system's record. Written by the module readers (which start from the defaults of
// set_new_song_defaults), by the effect commands while the song plays (noted per field),
// and by the window's editors; read by the sequencer, the mixer and the effect units.
// A value after the last ';' of a comment is what a new song holds.
struct TMOD {
    uint8_t patflag[128];     // per instrument (index instrument - 1): 0 silences its cells, commands too; 1
    uint8_t trackblock[256];  // per-track block of the native file, kept and saved whole; unused by playback
    PatMark patmark[128][kMarksPerPattern];  // block marks by sound number, eight blocks each (command 30)
    uint16_t trackword1[kTracks];            // MIDI channel of each track, 1..16; 0 = played from samples
    uint32_t echolen[kEchoUnits];            // delay of each echo instance in frames; 44100
    uint32_t echolevel[kEchoUnits];          // feedback of each echo instance, 128 = 1.0; 75 ("Feedback")
    uint8_t efxflag[kEffectSlots];           // auto pan on (non-zero) for each effect slot ("Auto Pan D")
    int16_t efxa[kEffectSlots];              // auto-pan lower bound of each slot, 0..255 (pan x 2); 64
    int16_t efxb[kEffectSlots];              // auto-pan upper bound of each slot, 0..255; 192
    int16_t efxc[kEffectSlots];     // auto-pan step per buffer ("Speed"); the mixer flips its sign at a bound
    uint8_t efxd[kEffectSlots];     // resonance q of each slot's two-pole filters (types 16, 17); 10
    uint32_t efxval[kEffectSlots];  // centre frequency of each slot's active filter in Hz; 1000
    uint8_t echoon[kEchoUnits];     // "Invert Phase" of each echo instance (right channel negated)
    int16_t rows[256];              // row count of each pattern, 1..kMaxRows (128 reachable); 64
    int16_t globalvol;              // master volume, 64 = unity, 0..256; command 16 sets it
    int16_t nbvoice[kTracks];       // voices of each track, 1..126; 127 = a free voice from the top
    uint16_t trackpan[kTracks];     // left gain of each track, 128 = unity; commands 21, 22 set it
    uint16_t trackpan2[kTracks];    // right gain of each track, 128 = unity; commands 22, 27 set it
    uint16_t trackvol[kTracks];     // pan position of each track, 0 (left)..127 (right); command 8 sets it
    uint16_t trackc[kTracks];       // effect send level of each track, 128 = unity; command 34 sets it
    uint16_t trackd[kTracks];       // per-track word of the native file, kept and saved; 128
    uint16_t tracke[kTracks];       // effect slot each track is routed to, 1..99; 0 = dry (command 33)
    uint16_t trackf[kTracks];       // per-track word of the native file, kept and saved; 0
    uint16_t trackg[kTracks];       // routing bank of each track; only bank 0 is heard, so 0
    int16_t format;                 // pan mode the file came with: 1 MOD and MTM, 2 S3M; 0 for a new song
    int16_t mode;                   // pan mode the mixer uses: 1 Amiga, 2 panoramic, 3 left and right
    uint32_t tempo;                 // microseconds per beat (60,000,000 / BPM); 480000; command 15
    int16_t speed;                  // ticks per row, 1..31; 6; command 15 sets it
    char name[64];                  // the song's title, NUL-terminated
    int16_t patbase;                // index of this song's pattern 0 in p_pat: song x 128
    int16_t sndbase;                // index of this song's sound 1 in t_sound: song x 128
    uint8_t nbtrack;                // tracks in use, 1..64; 8
    uint8_t nbpos;                  // positions of the sequence, 1..255 ("Nb Pos.")
    uint8_t repeat;                 // position play restarts from after the last ("Repeat")
    uint8_t sequence[kPositions];   // pattern played at each position, 0..127
    char path[259];                 // file the song was loaded from or saved to; "" for a new song
    uint32_t user;                  // free word of the record, kept at 0
};

// Writes the defaults of a new song; song is the song's number in the bank.
void set_new_song_defaults(TMOD& m, int song);

// The per-track tables a module reader presets before reading.
void reset_track_tables(TMOD& m);

// Copies a C string into a fixed field, always NUL-terminated.
template <std::size_t N>
void set_text(char (&field)[N], const char* text, std::size_t max_len = N - 1) {
    size_t i = 0;
    for (; text && text[i] && i < max_len && i < N - 1; ++i) field[i] = text[i];
    for (size_t j = i; j < N; ++j) field[j] = 0;
}

}  // namespace ondrel

namespace ondrel {
// Brings every field that indexes a table (pan positions, effect slots, voices, rows,
// tracks) into its range, so that a record read from any file is safe to play.
void bound_record(TMOD& m);
}  // namespace ondrel
