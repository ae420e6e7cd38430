// MIDI: the internal synthesiser, the ports, notes from a MIDI keyboard.
#include <algorithm>
#include <filesystem>
#include <string>

#include "shell/command_handlers.h"
#include "playback/note_names.h"
#include "shell/editor_keys.h"
#include "shell/program.h"

namespace ondrel {

namespace {

Alert synth_question(const char* text) {
    return Alert{"title", text, {"Yes", "No !!"}};
}

void tell_midi_failure(Program& p, const std::string& why) {
    p.alerts.show(Alert{"MIDI", why, {"Too bad"}});
    p.say(why);
}

std::string port_at(const std::vector<std::string>& names, int64_t index) {
    return index >= 0 && index < static_cast<int64_t>(names.size()) ? names[static_cast<size_t>(index)] : "";
}

}  // namespace

void cmd_internal_synth(Program& p, const ShellMessage&) {
    if (!p.midi.synth_open()) {
        p.alerts.ask(synth_question("Launch Internal Midi Synth ? This take some more resource ! "), [&p](int b) {
            if (b != 0) return;
            std::string why;
            if (!p.midi.open_synth(why)) return tell_midi_failure(p, "Can't launch the Midi Synth: " + why);
            p.say("Internal Midi Synth on: " + p.midi.synth()->soundfont());
        });
        return;
    }
    p.alerts.ask(synth_question("Destroy Internal Midi Synth ? This free some resource !"), [&p](int b) {
        if (b != 0) return;
        p.midi.close_synth();
        p.say("Internal Midi Synth off");
    });
}

void cmd_choose_soundfont(Program& p, const ShellMessage&) {
    p.file_panel.mode = FilePanelRequest::Mode::Open;
    p.file_panel.reply_code = fourcc("MSFt");
    p.file_panel.title = "Choose SoundFont";
    p.file_panel.directory = p.midi.soundfont.empty() ? "/usr/share/sounds/sf2" : std::filesystem::path(p.midi.soundfont).parent_path().string();
}

void cmd_soundfont_chosen(Program& p, const ShellMessage& m) {
    if (m.refs.empty()) return;
    const std::string before = p.midi.soundfont;
    p.midi.soundfont = m.refs.front();
    if (p.midi.synth_open()) {
        // Heard at once: the synthesiser starts again on the new sounds.
        p.midi.close_synth();
        std::string why;
        if (!p.midi.open_synth(why)) {
            p.midi.soundfont = before;
            tell_midi_failure(p, "Can't launch the Midi Synth: " + why);
            std::string again;
            p.midi.open_synth(again);
            return;
        }
    }
    p.say("SoundFont: " + p.midi.soundfont);
    p.run_after_file();
}

void cmd_midi_port(Program& p, const ShellMessage& m) {
    MidiPorts* ports = p.midi.ports();
    if (!ports || !ports->available()) {
        p.say(ports ? "No MIDI ports: " + ports->unavailable_reason() : "No MIDI ports");
        return;
    }
    const bool output = m.code == fourcc("MOsl");
    const std::string name = port_at(output ? p.midi.output_ports : p.midi.input_ports, m.get("port", -1));
    std::string why;
    const bool done = output ? p.midi.choose_output(name, why) : p.midi.choose_input(name, why);
    if (!done) return tell_midi_failure(p, why);
    p.say(std::string(output ? "MIDI output: " : "MIDI input: ") + (name.empty() ? "none" : name));
}

void cmd_midi_port_lost(Program& p, const ShellMessage&) {
    const std::string name = p.midi.ports() ? p.midi.ports()->output_name() : "";
    std::string ignored;
    p.midi.choose_output("", ignored);
    p.say("The MIDI output port " + name + " went away: nothing more is sent to it");
}

void cmd_midi_note(Program& p, const ShellMessage& m) {
    const int64_t note = m.get("note", -1);
    if (note < 0 || note > 127 || m.get("vel", 0) <= 0) return;
    setnoteg(p.editor, static_cast<short>(note));
    enter_note_at_cursor(p, static_cast<int>(note));
}

void setnoteg(EditorState& editor, short note) {
    const int low = std::max(note - 36, 0);
    const_midit(low, editor.midi_range_low.data());
    const_midit(std::min(low + 60, 127), editor.midi_range_high.data());
}

bool internal_synth_open(const Program& p) {
    return p.midi.synth_open();
}

}  // namespace ondrel
