#include "shell/midi_settings.h"

#include <fstream>

#include "shell/midi_setup.h"
#include "shell/settings_lines.h"

namespace ondrel {

namespace {
constexpr const char* kSoundFontKey = "<SoundFont>";
constexpr const char* kOutputKey = "<Midi Output>";
constexpr const char* kInputKey = "<Midi Input>";
}  // namespace

std::string midi_settings_file(const std::string& thepath) {
    return thepath + "/midi.txt";
}

MidiSettings read_midi_settings(const std::string& thepath) {
    MidiSettings settings;
    std::ifstream in(midi_settings_file(thepath));
    std::string line, value;
    while (std::getline(in, line)) {
        if (value_of(line, kSoundFontKey, value))
            settings.soundfont = value;
        else if (value_of(line, kOutputKey, value))
            settings.output = value;
        else if (value_of(line, kInputKey, value))
            settings.input = value;
    }
    return settings;
}

bool write_midi_settings(const MidiSetup& midi, const std::string& thepath, std::string& why) {
    std::string text;
    if (!midi.soundfont.empty()) text += kSoundFontKey + midi.soundfont + "\n";
    if (const MidiPorts* ports = midi.ports()) {
        if (!ports->output_name().empty()) text += kOutputKey + ports->output_name() + "\n";
        if (!ports->input_name().empty()) text += kInputKey + ports->input_name() + "\n";
    }
    return write_settings_file(thepath, midi_settings_file(thepath), text, why);
}

}  // namespace ondrel
