#include "shell/midi_setup.h"

#include <cstdio>
#include <mutex>

namespace ondrel {

MidiSetup::MidiSetup(Engine& engine) : engine_(engine) {}

MidiSetup::~MidiSetup() {
    ports_.reset();
    close_synth();
}

void MidiSetup::outputs_changed() {
    Player& player = engine_.player;
    player.papi.store(router.any_attached() ? &router : nullptr, std::memory_order_release);
    // The audio device's lock is held by the callback while it runs.
    std::lock_guard<StructureLock> wait_out(engine_.bank.structure_lock());
}

bool MidiSetup::open_synth(std::string& why, bool test_phrase) {
    if (synth_) return true;
    auto synth = FluidSynthesiser::open(soundfont, kOutputRate, synth_events_, why);
    if (!synth) return false;
    synth_ = std::move(synth);
    engine_.mixer.set_synth(synth_.get());
    router.attach(MidiRouter::Synth, &synth_events_);
    outputs_changed();
    if (test_phrase) synth_->queue_test_phrase();
    return true;
}

void MidiSetup::close_synth() {
    if (!synth_) return;
    router.attach(MidiRouter::Synth, nullptr);
    engine_.mixer.set_synth(nullptr);
    outputs_changed();
    synth_.reset();
}

void MidiSetup::start_ports(const std::string& input_name) {
    if (ports_) return;
    ports_ = std::make_unique<MidiPorts>(router);
    ports_->on_output_lost([this](const std::string&) { from_output_.push(Message{kMsgMidiPortLost, 0, 0}); });
    refresh_port_lists();
    std::string why;
    const auto& inputs = input_ports;
    std::string name = inputs.empty() ? "" : inputs.front();
    for (const std::string& n : inputs)
        if (n == input_name) name = n;
    if (name.empty() || !choose_input(name, why)) {
        std::printf("ERREUR PORT OUVERTURE\n");
        std::fflush(stdout);
    }
}

void MidiSetup::refresh_port_lists() {
    output_ports = ports_ ? ports_->output_names() : std::vector<std::string>{};
    input_ports = ports_ ? ports_->input_names() : std::vector<std::string>{};
}

bool MidiSetup::choose_output(const std::string& name, std::string& why) {
    if (!has_ports(why)) return false;
    const bool chosen = name.empty() ? (ports_->close_output(), true) : ports_->open_output(name, why);
    outputs_changed();
    return chosen;
}

bool MidiSetup::choose_input(const std::string& name, std::string& why) {
    if (!has_ports(why)) return false;
    if (name.empty()) {
        ports_->close_input();
        return true;
    }
    return ports_->open_input(
        name, [this](int note, int velocity) { from_input_.push(Message{kMsgMidiNote, note, velocity}); }, why);
}

bool MidiSetup::has_ports(std::string& why) const {
    if (!ports_) why = "no MIDI ports";
    return ports_ != nullptr;
}

bool MidiSetup::poll(Message& m) {
    return from_input_.pop(m) || from_output_.pop(m);
}

}  // namespace ondrel
