#include "shell/recording_settings.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <vector>

#include "export/output_file.h"
#include "shell/recording.h"
#include "shell/settings_lines.h"

namespace ondrel {

namespace {

constexpr const char* kDirectoryKey = "<Record Path>";
constexpr const char* kInputKey = "<Record Input>";
constexpr const char* kFormatKey = "<Record Format>";
constexpr const char* kGainKey = "<Record Gain>";

// A whole number in [low, high], or false.
bool number_in(const std::string& text, long low, long high, long& out) {
    if (text.empty()) return false;
    char* end = nullptr;
    const long v = std::strtol(text.c_str(), &end, 10);
    if (*end || v < low || v > high) return false;
    out = v;
    return true;
}

}  // namespace

std::string recording_settings_file(const std::string& thepath) {
    return thepath + "/recording.txt";
}

void read_recording_settings(Recording& recording, const std::string& thepath) {
    std::ifstream in(recording_settings_file(thepath));
    std::string line, value;
    while (std::getline(in, line)) {
        long n = 0;
        std::error_code ec;
        if (value_of(line, kDirectoryKey, value)) {
            if (std::filesystem::is_directory(value, ec)) recording.directory = value;
        } else if (value_of(line, kInputKey, value)) {
            recording.choose_input(value);
        } else if (value_of(line, kFormatKey, value)) {
            if (number_in(value, 0, 3, n)) recording.recorder.samplermode = static_cast<uint16_t>(n);
        } else if (value_of(line, kGainKey, value)) {
            if (number_in(value, 0, kMaxRecordGain, n)) recording.recorder.vrvol = static_cast<int16_t>(n);
        }
    }
}

bool write_recording_settings(const Recording& recording, const std::string& thepath, std::string& why) {
    std::string text = kDirectoryKey + recording.directory + "\n";
    if (recording.has_input()) text += kInputKey + recording.chosen_input_name() + "\n";
    text += kFormatKey + std::to_string(recording.recorder.samplermode.load()) + "\n";
    text += kGainKey + std::to_string(recording.recorder.vrvol.load()) + "\n";
    return write_settings_file(thepath, recording_settings_file(thepath), text, why);
}

}  // namespace ondrel
