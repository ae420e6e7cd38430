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
// allocation (see make_sample). Filled by the module readers and by the sound importer
// (loadsnd), both starting from Raz_data's values (after the last ';' of a comment);
// read by the sequencer (volume, finetune, marks) and the mixer (everything it plays).
struct p_s {
    uint32_t rate;       // frames per second of the data (8363 for MOD samples); 0
    uint8_t* data;       // the bytes after this header; null when the sample is empty
    uint32_t length;     // data length in bytes
    uint32_t loopstart;  // loop start in bytes
    uint32_t loopend;    // loop end in bytes; the mixer loops from loopstart to here
    uint16_t loopon;     // non-zero: the data loops between loopstart and loopend; 0
    int16_t refnote;     // note (index of floatnote) that plays the data at its own rate; 72
    uint8_t spare[4];    // unused, kept for the record's layout
    char name[32];       // the sound's name, NUL-terminated; "None" when a file gives none
    int16_t volume;      // default volume of a note, 0..128 (a file's 0..64 doubled)
    int16_t bits;        // bits per sample value: 8 (signed) or 16 (signed, native order)
    uint8_t stereo;      // 1: frames are interleaved left, right pairs; 0
    uint8_t flag2;       // bit 0: always interpolate this sound, whatever "Sound Quality" says
    int16_t framecode;   // log2 of bytes per frame, 0..2: byte counts >> framecode = frame counts
    int16_t range1[2];   // lowest and highest note of the first key range; 0, 127
    int16_t range2[2];   // lowest and highest note of the second key range; 0, 127
    uint16_t envelope[kEnvelopePoints * kEnvelopeKinds];  // [point x 5 + kind] = position << 8 | level
    uint16_t flagword;  // envelope enable bits: 1 volume, 2 send, 4 pan, 8 pitch, 16 fade; 0
    int16_t range3[2];  // a third low and high note pair; 0, 127
    int16_t level;      // a level word kept and saved with the sound; 64
    int16_t finetune;   // finetune of a note, 0..15 (15 and 0 = none, see finetune_factor); 0
    uint32_t setting;   // length over which the fade envelope runs, in frames after release; 102400
    uint16_t flag;      // a flag word kept with the record; 0
    // Kept from an imported sound file (loadsnd), shown by "info" and read by nothing else:
    uint32_t source_offset;     // where the data began in the file
    uint16_t default_words[4];  // the importer's fixed words 0, 127, 128, 0
    uint32_t halfrate;          // rate >> 1
    uint16_t trailing;          // 0
    char source_path[256];      // the file the sound came from, NUL-terminated

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
// A record of its own with the same header and data.
SampleRef copy_sample(const p_s& sample);

// Zero-filled memory from the allocator sample records come from, for a recorder that fills
// it first and makes it a record afterwards (sample_in_place).
struct SampleBlockFree {
    void operator()(uint8_t* block) const;
};
using SampleBlock = std::unique_ptr<uint8_t, SampleBlockFree>;
SampleBlock make_sample_block(size_t bytes);

// Makes a block a record where it lies: a reset header written over its first bytes, the
// data just after the header, length bytes long. The block must hold the header, length
// bytes and the slack.
SampleRef sample_in_place(SampleBlock block, uint32_t length);

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
