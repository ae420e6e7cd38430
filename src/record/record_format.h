#pragma once
#include <array>
#include <cstdint>

namespace ondrel {

// The recording formats (samplermode 0-3), with the labels the recording panel shows.
struct RecordFormat {
    const char* label;
    const char* name;  // on the command line
    uint16_t channels;
    uint16_t bits;
    uint16_t block_align;
    uint32_t byte_rate;
};

inline constexpr uint32_t kRecordRate = 44100;

inline constexpr std::array<RecordFormat, 4> kRecordFormats{{
    {"Mono 44100 Hz 16 Bits", "mono16", 1, 16, 2, 88200},
    {"Stereo 44100 Hz 16 Bits", "stereo16", 2, 16, 4, 176400},
    {"Mono 44100 Hz 8 Bits", "mono8", 1, 8, 1, 44100},
    {"Stereo 44100 Hz 8 Bits", "stereo8", 2, 8, 2, 88200},
}};

// The format of a mode; modes out of range read as mode 0.
inline const RecordFormat& record_format(int samplermode) {
    return kRecordFormats[samplermode >= 0 && samplermode < 4 ? samplermode : 0];
}

}  // namespace ondrel
