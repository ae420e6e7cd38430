#pragma once
#include <cstddef>
#include <cstdint>
#include <memory>

namespace ondrel {

inline constexpr int kEnvelopeKinds = 5;
inline constexpr int kEnvelopePoints = 5;
inline constexpr size_t kSampleSlack = 256;  // zero bytes after the data for interpolation
// Largest sample data we accept from any file (a stereo 16-bit sound of about 6 minutes).
inline constexpr uint32_t kMaxSampleBytes = 64u << 20;

// The sample record: this header, then the data, then kSampleSlack zero bytes, in one
// allocation (see make_sample).
struct p_s {
    uint32_t rate;
    uint8_t* data;       // null when the sample is empty
    uint32_t length;     // bytes
    uint32_t loopstart;  // bytes
    uint32_t loopend;    // bytes
    int16_t loopon;
    int16_t refnote;
    uint8_t spare[4];
    char name[32];
    int16_t volume;  // 0..128
    int16_t bits;    // 8 or 16
    uint8_t stereo;
    uint8_t flag2;      // bit 0: always interpolate
    int16_t framecode;  // log2 of bytes per frame
    int16_t range1[2];
    int16_t range2[2];
    uint16_t envelope[kEnvelopePoints * kEnvelopeKinds];  // point-major: [point * 5 + kind]
    uint16_t flagword;                                    // envelope enable bits
    int16_t range3[2];
    int16_t level;
    int16_t finetune;
    uint32_t setting;
    uint16_t flag;
    // Kept from an imported sound file: where its data began, the importer's default
    // words, half its rate, and the file it came from.
    uint32_t source_offset;
    uint16_t default_words[4];
    uint32_t halfrate;
    uint16_t trailing;
    char source_path[256];

    uint16_t& env(int kind, int point) { return envelope[point * kEnvelopeKinds + kind]; }
    uint16_t env(int kind, int point) const { return envelope[point * kEnvelopeKinds + kind]; }
    uint32_t frames() const { return length >> framecode; }
};

struct SampleFree {
    void operator()(p_s* s) const;
};
using SampleRef = std::unique_ptr<p_s, SampleFree>;

// Allocates a zero-filled record for length data bytes (plus the slack), resets its
// header (Raz_data), and points data at the bytes after the header.
SampleRef make_sample(uint32_t length);

// Resets the header to the reset values, leaving data and length to the caller.
void Raz_data(p_s& s);

// Frame-size code for the given sample format: log2 of bytes per frame.
int16_t frame_code(int bits, bool stereo);

// Keeps loop points inside the data so that no reader can hand the mixer a loop that
// runs past the allocation; a loop that is off keeps its points as stored.
void bound_loop(p_s& s);

// Copies a name into the record, NUL-terminated, cut to what fits.
void set_sample_name(p_s& s, const char* text, size_t max_len);

}  // namespace ondrel

namespace ondrel {
// Makes a record read from a file safe to play: 8 or 16 bits, a frame code that matches
// them, a reference note inside the period table, loop points inside the data.
void bound_sample(p_s& s);
}  // namespace ondrel
