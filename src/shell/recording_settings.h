#pragma once
#include <string>

namespace ondrel {

class Recording;

// The recording panel's choices kept between runs, in "recording.txt" beside the path file:
// the directory new recordings are named in, the input, the format and the gain, one
// "<Key>value" line each. The path file itself keeps its three kinds of lines only: its
// reader stops at the first line it does not expect, so another kind of line there would be
// read by no one.

// The settings file of the settings directory thepath.
std::string recording_settings_file(const std::string& thepath);

// Reads the file into recording; a missing file, an unknown line, a directory that is gone,
// an input that is not there now, or a number out of range leave what was there.
void read_recording_settings(Recording& recording, const std::string& thepath);

// Writes the file (creating thepath). False with why set when it could not be written.
bool write_recording_settings(const Recording& recording, const std::string& thepath, std::string& why);

}  // namespace ondrel
