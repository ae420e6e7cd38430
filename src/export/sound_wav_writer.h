#pragma once
#include <cstdint>
#include <string>
#include <vector>

#include "song/sample.h"

namespace ondrel {

// A sound as a WAV file of its own bits, channels and rate (8-bit data unsigned as WAV
// files hold them), which the sound reader takes back to the same data.
std::vector<uint8_t> sound_to_wav(const p_s& sound);
bool save_sound_wav(const std::string& path, const p_s& sound, std::string& why);

}  // namespace ondrel
