#include "platform/midi_ports.h"

#include <rtmidi/RtMidi.h>
#include <unistd.h>

#include <chrono>
#include <cstdlib>
#include <cstring>

namespace ondrel {

namespace {

RtMidi::Api chosen_api() {
    const char* api = std::getenv("ONDREL_MIDI_API");
    return api && std::strcmp(api, "jack") == 0 ? RtMidi::UNIX_JACK : RtMidi::LINUX_ALSA;
}

// RtMidi reports warnings on standard error unless someone listens; the ports' users are
// told through return values instead.
void ignore_error(RtMidiError::Type, const std::string&, void*) {}

// Our own ports are not offered: our output sent to our input would go round for ever.
bool is_own_port(const std::string& name) {
    return name.rfind("Ondrel Tracker", 0) == 0;
}

template <class Port>
std::vector<std::string> names_of(Port* port) {
    std::vector<std::string> names;
    if (!port) return names;
    const unsigned count = port->getPortCount();
    for (unsigned i = 0; i < count; ++i)
        if (std::string name = port->getPortName(i); !is_own_port(name)) names.push_back(std::move(name));
    return names;
}

// The system's number of the port of that name, or -1.
template <class Port>
int index_of(Port* port, const std::string& name) {
    if (!port || is_own_port(name)) return -1;
    const unsigned count = port->getPortCount();
    for (unsigned i = 0; i < count; ++i)
        if (port->getPortName(i) == name) return static_cast<int>(i);
    return -1;
}

}  // namespace

MidiPorts::MidiPorts(MidiRouter& router) : router_(router) {
    const RtMidi::Api api = chosen_api();
    api_ = api;
    // Asked without a sequencer device, ALSA and RtMidi each print their own complaint:
    // look first, and say it once.
    if (api == RtMidi::LINUX_ALSA && access("/dev/snd/seq", R_OK | W_OK) != 0) {
        why_ = "no ALSA sequencer (/dev/snd/seq)";
        return;
    }
    try {
        probe_in_ = std::make_unique<RtMidiIn>(api, "Ondrel Tracker");
        probe_out_ = std::make_unique<RtMidiOut>(api, "Ondrel Tracker");
        probe_in_->setErrorCallback(ignore_error);
        probe_out_->setErrorCallback(ignore_error);
        available_ = true;
    } catch (const RtMidiError& e) {
        why_ = api == RtMidi::UNIX_JACK ? "no JACK server" : "no ALSA sequencer";
        why_ += " (" + e.getMessage() + ")";
        probe_in_.reset();
        probe_out_.reset();
    }
}

MidiPorts::~MidiPorts() {
    close_input();
    close_output();
}

std::vector<std::string> MidiPorts::output_names() const {
    return names_of(probe_out_.get());
}

std::vector<std::string> MidiPorts::input_names() const {
    return names_of(probe_in_.get());
}

template <class Port, class Prepare>
std::unique_ptr<Port> MidiPorts::open_port(Port* probe, const std::string& name, const char* kind,
                                           std::string& why, Prepare prepare) {
    if (!available_) {
        why = why_;
        return nullptr;
    }
    const int index = index_of(probe, name);
    const std::string port = std::string("MIDI ") + kind + " port \"" + name + "\"";
    if (index < 0) {
        why = "no " + port;
        return nullptr;
    }
    try {
        auto opened = std::make_unique<Port>(static_cast<RtMidi::Api>(api_), std::string("Ondrel Tracker ") + kind);
        opened->setErrorCallback(ignore_error);
        prepare(*opened);
        opened->openPort(static_cast<unsigned>(index), "Ondrel Tracker");
        if (opened->isPortOpen()) return opened;
        why = "cannot open the " + port;
    } catch (const RtMidiError& e) {
        why = "cannot open the " + port + ": " + e.getMessage();
    }
    return nullptr;
}

bool MidiPorts::open_output(const std::string& name, std::string& why) {
    close_output();
    out_ = open_port<RtMidiOut>(probe_out_.get(), name, "output", why, [](RtMidiOut&) {});
    if (!out_) return false;
    output_name_ = name;
    MidiEvent stale;
    while (out_queue_.pop(stale)) {
    }
    sending_ = true;
    sender_ = std::thread([this] { send_loop(); });
    router_.attach(MidiRouter::Port, &out_queue_);
    return true;
}

void MidiPorts::close_output() {
    router_.attach(MidiRouter::Port, nullptr);
    sending_ = false;
    if (sender_.joinable()) sender_.join();
    out_.reset();
    output_name_.clear();
}

void MidiPorts::send_loop() {
    using namespace std::chrono;
    auto next_check = steady_clock::now();
    std::vector<unsigned char> bytes;
    while (sending_.load()) {
        MidiEvent e;
        while (out_queue_.pop(e)) {
            bytes.assign(e.bytes.begin(), e.bytes.begin() + e.size);
            out_->sendMessage(&bytes);
        }
        // A port that went away (a device unplugged, a program closed) stops the sending.
        if (steady_clock::now() >= next_check) {
            next_check = steady_clock::now() + milliseconds(500);
            if (index_of(out_.get(), output_name_) < 0) {
                router_.attach(MidiRouter::Port, nullptr);
                if (lost_) lost_(output_name_);
                return;
            }
        }
        std::this_thread::sleep_for(milliseconds(1));
    }
}

bool MidiPorts::open_input(const std::string& name, NoteHandler on_note, std::string& why) {
    close_input();
    on_note_ = std::move(on_note);
    parser_ = MidiInputParser();
    in_ = open_port<RtMidiIn>(probe_in_.get(), name, "input", why, [this](RtMidiIn& in) {
        in.ignoreTypes(true, true, true);
        in.setCallback(&MidiPorts::input_callback, this);
    });
    if (!in_) return false;
    input_name_ = name;
    return true;
}

void MidiPorts::close_input() {
    if (in_) {
        in_->closePort();
        in_->cancelCallback();
    }
    in_.reset();
    input_name_.clear();
}

void MidiPorts::input_callback(double, std::vector<unsigned char>* message, void* self) {
    auto* ports = static_cast<MidiPorts*>(self);
    if (!message) return;
    ports->parser_.feed(message->data(), message->size(), [ports](const MidiEvent& m) {
        // What comes in goes out again, as a keyboard played through the program.
        ports->router_.send(m);
        if (MidiInputParser::is_note_played(m) && ports->on_note_) ports->on_note_(m.bytes[1], m.bytes[2]);
    });
}

}  // namespace ondrel
