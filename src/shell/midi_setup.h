#pragma once
#include <memory>
#include <string>
#include <vector>

#include "engine/engine.h"
#include "playback/messages.h"
#include "playback/midi_router.h"
#include "platform/fluid_synthesiser.h"
#include "platform/midi_ports.h"

namespace ondrel {

inline constexpr uint32_t kMsgMidiNote = fourcc("midi");
inline constexpr uint32_t kMsgMidiPortLost = fourcc("MLST");

// The program's MIDI: the router the sequencer sends to (`papi` while an output is open),
// the internal synthesiser, the system's ports, and what their threads tell the window.
// Window thread only, but for the queues the other threads fill.
class MidiSetup {
public:
    explicit MidiSetup(Engine& engine);
    ~MidiSetup();
    MidiSetup(const MidiSetup&) = delete;
    MidiSetup& operator=(const MidiSetup&) = delete;

    // The internal synthesiser, with the SoundFont chosen (empty: the system's General MIDI
    // one). Opening plays the test phrase unless told not to. False with why set; nothing
    // changes then.
    bool synth_open() const { return synth_ != nullptr; }
    bool open_synth(std::string& why, bool test_phrase = true);
    void close_synth();
    const FluidSynthesiser* synth() const { return synth_.get(); }
    std::string soundfont;

    // The system's ports, once start_ports() has looked for them (the desktop program does;
    // headless runs have none). At start the input named (else the first) is opened; on
    // failure "ERREUR PORT OUVERTURE" goes to standard output and the program goes on.
    void start_ports(const std::string& input_name = "");
    MidiPorts* ports() { return ports_.get(); }
    const MidiPorts* ports() const { return ports_.get(); }
    // The ports' names as last looked up (start_ports and refresh_port_lists): what the
    // window lists, and what 'MOsl' and 'MIsl' count their "port" in.
    void refresh_port_lists();
    std::vector<std::string> output_ports, input_ports;
    // An empty name closes the port.
    bool choose_output(const std::string& name, std::string& why);
    bool choose_input(const std::string& name, std::string& why);

    // What the input and output threads sent the window: 'midi' (a = note, b = velocity)
    // and 'MLST' (the output port went away).
    bool poll(Message& m);

    MidiRouter router;

private:
    // The sequencer sends to the router while any output is attached; after a change the
    // audio callback in progress is waited out, so what was detached can be freed.
    void outputs_changed();
    bool has_ports(std::string& why) const;

    Engine& engine_;
    MidiEventQueue synth_events_;  // outlives every synthesiser, as senders may still hold it
    std::unique_ptr<FluidSynthesiser> synth_;
    std::unique_ptr<MidiPorts> ports_;
    SpscQueue<256> from_input_;
    SpscQueue<8> from_output_;
};

}  // namespace ondrel
