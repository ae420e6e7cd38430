#pragma once
#include <string>
#include <vector>

namespace ondrel {

// Exit codes that scripts can rely on.
inline constexpr int kExitOk = 0;
inline constexpr int kExitFailed = 1;    // the work could not be done (bad file, no device)
inline constexpr int kExitUsage = 2;     // the command line was wrong
inline constexpr int kExitNoDevice = 3;  // no sound device could be opened

using Args = std::vector<std::string>;

int cmd_info(const Args& args);
int cmd_convert(const Args& args);
int cmd_set_sound(const Args& args);
int cmd_edit_sound(const Args& args);
int cmd_play(const Args& args);
int cmd_render(const Args& args);
int cmd_export_midi(const Args& args);
int cmd_record(const Args& args);
int cmd_spectrogram(const Args& args);

}  // namespace ondrel
