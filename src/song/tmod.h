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

struct PatMark {
    int32_t position;
    int32_t value;
};

// The song record. Field order and widths are those of the system's record.
struct TMOD {
    uint8_t patflag[128];
    uint8_t trackblock[256];
    PatMark patmark[128][kMarksPerPattern];
    uint16_t trackword1[kTracks];
    uint32_t echolen[kEchoUnits];
    uint32_t echolevel[kEchoUnits];
    uint8_t efxflag[kEffectSlots];
    int16_t efxa[kEffectSlots];
    int16_t efxb[kEffectSlots];
    int16_t efxc[kEffectSlots];
    uint8_t efxd[kEffectSlots];
    uint32_t efxval[kEffectSlots];
    uint8_t echoon[kEchoUnits];
    int16_t rows[256];
    int16_t globalvol;
    int16_t nbvoice[kTracks];
    uint16_t trackpan[kTracks];
    uint16_t trackpan2[kTracks];
    uint16_t trackvol[kTracks];
    uint16_t trackc[kTracks];
    uint16_t trackd[kTracks];
    uint16_t tracke[kTracks];
    uint16_t trackf[kTracks];
    uint16_t trackg[kTracks];
    int16_t format;
    int16_t mode;
    uint32_t tempo;
    int16_t speed;
    char name[64];
    int16_t patbase;
    int16_t sndbase;
    uint8_t nbtrack;
    uint8_t nbpos;
    uint8_t repeat;
    uint8_t sequence[kPositions];
    char path[259];
    uint32_t user;
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
