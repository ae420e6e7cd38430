#pragma once
#include <cstdint>
#include <vector>

#include "export/midi_file.h"

namespace ondrel {

// Song time in frames as ticks of a MIDI file. The sequencer's step sets the beat: a
// quarter note is 48 steps (four rows at speed 6), so a tempo is written for each stretch
// of steps of one length, and a sequencer reading the file puts its beats on the song's
// rows whatever the tempo does.
class MidiTempoMap {
public:
    static constexpr uint16_t kDivision = 960;  // ticks per quarter note
    static constexpr int kStepsPerQuarter = 48;

    MidiTempoMap(double frames_per_second, int first_step_frames);

    // From frame on, steps last step_frames frames. Calls come in frame order.
    void step_length_from(uint64_t frame, int step_frames);
    // The tick that the file's own tempi place nearest to the frame's time. Each frame is
    // rounded on its own, so a long song gathers no error.
    uint32_t tick_at(uint64_t frame) const;
    const std::vector<MidiTempo>& tempo() const { return tempo_; }

private:
    uint32_t us_per_quarter(int step_frames) const;

    double rate_;
    std::vector<MidiTempo> tempo_;
    std::vector<double> start_us_;  // the time of each tempo's first tick, by the tempi before it
};

}  // namespace ondrel
