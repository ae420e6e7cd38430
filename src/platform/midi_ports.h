#pragma once
#include <atomic>
#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include "playback/midi_event_queue.h"
#include "playback/midi_input_parser.h"
#include "playback/midi_router.h"

class RtMidiIn;
class RtMidiOut;

namespace ondrel {

// The system's MIDI ports through RtMidi: ALSA's sequencer, or a JACK server when
// ONDREL_MIDI_API=jack. One output port receives what the router sends (a thread of its
// own takes the messages off the queue, so the audio thread never waits on a port); one
// input port passes what comes in on to the router and hands played notes to the editor.
class MidiPorts {
public:
    // Called on the input's thread for each note played (velocity above 0).
    using NoteHandler = std::function<void(int note, int velocity)>;
    // Called on the output's thread, once, when the open output port has gone.
    using LostHandler = std::function<void(const std::string& port)>;

    explicit MidiPorts(MidiRouter& router);
    ~MidiPorts();
    MidiPorts(const MidiPorts&) = delete;
    MidiPorts& operator=(const MidiPorts&) = delete;

    // False when the system has no MIDI (no ALSA sequencer, no JACK server); why tells.
    bool available() const { return available_; }
    const std::string& unavailable_reason() const { return why_; }

    std::vector<std::string> output_names() const;
    std::vector<std::string> input_names() const;

    // Opens the output port of that name (closing the one before). False with why set.
    bool open_output(const std::string& name, std::string& why);
    void close_output();
    const std::string& output_name() const { return output_name_; }
    void on_output_lost(LostHandler handler) { lost_ = std::move(handler); }

    bool open_input(const std::string& name, NoteHandler on_note, std::string& why);
    void close_input();
    const std::string& input_name() const { return input_name_; }

private:
    // A port of the system opened by name, prepare() run on it first; null with why set.
    template <class Port, class Prepare>
    std::unique_ptr<Port> open_port(Port* probe, const std::string& name, const char* kind, std::string& why,
                                    Prepare prepare);
    static void input_callback(double, std::vector<unsigned char>* message, void* self);
    void send_loop();

    MidiRouter& router_;
    int api_ = 0;  // RtMidi::Api
    bool available_ = false;
    std::string why_;
    std::unique_ptr<RtMidiIn> probe_in_;  // lists the sources
    std::unique_ptr<RtMidiOut> probe_out_;  // lists the destinations

    std::unique_ptr<RtMidiOut> out_;
    std::string output_name_;
    MidiEventQueue out_queue_;
    std::thread sender_;
    std::atomic<bool> sending_{false};
    LostHandler lost_;

    std::unique_ptr<RtMidiIn> in_;
    std::string input_name_;
    MidiInputParser parser_;  // the input's thread only
    NoteHandler on_note_;
};

}  // namespace ondrel
