#pragma once
#include <array>
#include <cstddef>
#include <cstdint>

namespace ondrel {

// The 46-byte WAV header of a disk recording (d2dentete): a format chunk of 18 bytes, then
// the data chunk from offset 38, the samples from offset 46.
inline constexpr size_t kD2dHeaderBytes = 46;
using D2dHeader = std::array<uint8_t, kD2dHeaderBytes>;

inline constexpr size_t kRiffSizeAt = 4;
inline constexpr size_t kDataSizeAt = 42;

// Prepares the header for a recording in samplermode. Of the two size fields only the first
// byte is cleared: the other three keep what the previous recording left in them, and a
// file whose recording never stopped shows them.
void begin_d2d_header(D2dHeader& header, int samplermode);

// The sizes written when a recording stops at file position P: the RIFF size is P - 38 and
// the data size P, both counting the 46 header bytes, as files made so far have them.
void end_d2d_header(D2dHeader& header, uint32_t file_position);

// Both sizes 0xFFFFFFFF, as readers take "to the end of the data".
void unknown_d2d_sizes(D2dHeader& header);

}  // namespace ondrel
