#include "render/midi_export.h"

#include <algorithm>
#include <array>
#include <cstring>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "export/midi_tempo_map.h"

namespace ondrel {

namespace {

constexpr int kChannels = 16;
constexpr int kDrumChannel = 10;
constexpr uint8_t kReleaseVelocity = 100;  // as the sequencer's own note-offs

// One message as the sequencer sent it, and from which track.
struct Sent {
    uint64_t frame;  // from the song's start
    int track;
    uint8_t kind;
    uint8_t data1, data2;
    int instrument;  // a note-on's: the instrument of the track's voice
};

// The MIDI output while a copy of the song plays. Every sending track is given its own
// number as its channel (1..64: the sequencer only asks whether a track has one), which
// tells tracks that share a channel apart; the real channels are put back afterwards.
// It is called inside render_offline on the exporting thread, not on an audio device's.
class SentRecorder final : public MidiOut {
public:
    SentRecorder(const Player& player, uint64_t first_frame) : player_(player), first_frame_(first_frame) {}
    std::vector<Sent> sent;

    void NoteOn(uint8_t tag, uint8_t note, uint8_t velocity, uint64_t) override {
        add(tag, kMidiNoteOn, note, velocity);
    }
    void NoteOff(uint8_t tag, uint8_t note, uint8_t velocity, uint64_t) override {
        add(tag, kMidiNoteOff, note, velocity);
    }
    void ProgramChange(uint8_t tag, uint8_t program, uint64_t) override {
        add(tag, kMidiProgramChange, program, 0);
    }

private:
    void add(uint8_t tag, uint8_t kind, uint8_t data1, uint8_t data2) {
        const int track = tag - 1;
        sent.push_back({player_.step_frame - first_frame_, track, kind, data1, data2,
                        kind == kMidiNoteOn ? player_.track_instrument(track) : 0});
    }
    const Player& player_;
    uint64_t first_frame_;
};

// What one play of the song gave.
struct Pass {
    std::vector<Sent> sent;
    std::vector<std::pair<uint64_t, int>> step_lengths;  // from frame on, steps last so many frames
    uint64_t frames = 0;                                 // how long the song played
    RenderEnd end = RenderEnd::SongEnd;
};

int step_frames(const Mixer& mixer, int buffer_frames) {
    if (!mixer.ftemp.load(std::memory_order_relaxed)) return buffer_frames;  // a step a buffer
    return std::max(1, static_cast<int>(mixer.tick_frames()));
}

// Plays a copy of the engine's song with a MIDI output in which the tracks marked send.
Pass play(Engine& engine, const std::array<bool, kTracks>& send, const MidiExportOptions& options) {
    const auto made = std::make_unique<Engine>();
    Engine& copy = *made;
    copy.bank.install(0, copy_song(engine.bank, engine.bank.noimod));
    for (int t = 0; t < kTracks; ++t)
        copy.bank.current().trackword1[t] = send[t] ? static_cast<uint16_t>(t + 1) : 0;
    copy.bank.nbvoie = engine.bank.nbvoie.load();
    copy.mixer.ftemp = engine.mixer.ftemp.load();
    copy.mixer.qual = engine.mixer.qual.load();
    copy.mixer.valpitch = engine.mixer.valpitch.load();
    for (int t = 0; t < kTracks; ++t) copy.mixer.mute[t] = engine.mixer.mute[t].load();

    const int buffer = std::clamp(options.render.buffer_frames, 16, kMaxFramesPerCall);
    const uint64_t first = copy.mixer.frames_rendered();
    SentRecorder recorder(copy.player, first);
    copy.player.papi = &recorder;
    Pass pass;
    int step = step_frames(copy.mixer, buffer);
    pass.step_lengths.push_back({0, step});
    pass.end =
        render_offline(copy.mixer, copy.player, options.render, [&](const float*, int count, double seconds) {
            pass.frames += static_cast<uint64_t>(count);
            // The mixer takes the tempo once a buffer: a new one holds from the first step
            // that the next buffer starts, after what is owed of the current one.
            if (const int next = step_frames(copy.mixer, buffer); next != step) {
                const uint64_t owed =
                    copy.mixer.bpmreste >= 1 ? static_cast<uint64_t>(copy.mixer.bpmreste) : 0;
                pass.step_lengths.push_back({copy.mixer.frames_rendered() - first + owed, next});
                step = next;
            }
            if (options.progress) options.progress(copy.player, seconds);
            return true;
        });
    copy.player.papi = nullptr;
    pass.sent = std::move(recorder.sent);
    return pass;
}

int file_channel(int channel) {
    return (channel - 1) % kChannels + 1;
}

// Channels for the tracks without one, in track order: those no MIDI track uses, drums
// aside, and once they run out the same again.
std::array<uint8_t, kTracks> sketch_channels(const TMOD& song, const std::array<bool, kTracks>& has_channel,
                                             const std::array<bool, kTracks>& sketched) {
    std::array<bool, kChannels + 1> used{};
    for (int t = 0; t < kTracks; ++t)
        if (has_channel[t]) used[file_channel(song.trackword1[t])] = true;
    std::vector<uint8_t> free;
    for (int c = 1; c <= kChannels; ++c)
        if (c != kDrumChannel && !used[c]) free.push_back(static_cast<uint8_t>(c));
    if (free.empty())
        for (int c = 1; c <= kChannels; ++c)
            if (c != kDrumChannel) free.push_back(static_cast<uint8_t>(c));
    std::array<uint8_t, kTracks> channel{};
    size_t next = 0;
    for (int t = 0; t < kTracks; ++t)
        if (sketched[t]) channel[t] = free[next++ % free.size()];
    return channel;
}

// The tracks' messages, in order: what the MIDI tracks sent, as sent.
void add_played(const Pass& pass, const TMOD& song, const MidiTempoMap& time, uint64_t end,
                std::array<std::vector<MidiMessage>, kTracks>& out) {
    for (const Sent& s : pass.sent)
        if (s.frame < end)
            out[s.track].push_back({time.tick_at(s.frame), s.kind,
                                    static_cast<uint8_t>(file_channel(song.trackword1[s.track])), s.data1,
                                    s.data2});
}

// The other tracks' notes on channels of their own, each after its instrument's program;
// the sequencer's programs for them (the instrument before) are left out.
void add_sketched(const Pass& pass, const TMOD& song, const std::array<bool, kTracks>& has_channel,
                  const MidiTempoMap& time, uint64_t end,
                  std::array<std::vector<MidiMessage>, kTracks>& out) {
    std::array<bool, kTracks> sketched{};
    for (const Sent& s : pass.sent)
        if (s.frame < end && s.kind == kMidiNoteOn && !has_channel[s.track]) sketched[s.track] = true;
    const std::array<uint8_t, kTracks> channel = sketch_channels(song, has_channel, sketched);
    std::array<int, kChannels + 1> program;
    program.fill(-1);
    for (const Sent& s : pass.sent) {
        if (s.frame >= end || !sketched[s.track] || s.kind == kMidiProgramChange) continue;
        const uint32_t tick = time.tick_at(s.frame);
        const uint8_t c = channel[s.track];
        if (s.kind == kMidiNoteOn && s.instrument >= 1 && program[c] != s.instrument - 1) {
            program[c] = s.instrument - 1;
            out[s.track].push_back({tick, kMidiProgramChange, c, static_cast<uint8_t>(program[c]), 0});
        }
        out[s.track].push_back({tick, s.kind, c, s.data1, s.data2});
    }
}

// A note-off at tick for the track's note that no message has let go (a note-on of
// velocity 0 lets go too).
void release_sounding_note(std::vector<MidiMessage>& messages, uint32_t tick) {
    std::optional<MidiMessage> sounding;
    for (const MidiMessage& m : messages) {
        if (m.kind == kMidiNoteOn && m.data2 > 0)
            sounding = m;
        else if (m.kind != kMidiProgramChange && sounding && m.data1 == sounding->data1)
            sounding.reset();
    }
    if (sounding)
        messages.push_back({tick, kMidiNoteOff, sounding->channel, sounding->data1, kReleaseVelocity});
}

}  // namespace

MidiExport song_to_midi(Engine& engine, const MidiExportOptions& options) {
    const TMOD& song = engine.bank.current();
    const int tracks_read = std::clamp<int>(engine.bank.nbvoie.load(), 0, kTracks);
    // Only the tracks the sequencer reads count.
    std::array<bool, kTracks> has_channel{};
    bool any_channel = false;
    bool any_without = false;
    for (int t = 0; t < tracks_read; ++t) {
        has_channel[t] = song.trackword1[t] != 0;
        any_channel = any_channel || has_channel[t];
        any_without = any_without || !has_channel[t];
    }
    // The MIDI tracks are played with the others on their samples, as they would be: a
    // track whose voices are chosen among the free ones depends on them. The others are
    // then played with every track sent, which renders no sound and is quick.
    std::vector<Pass> passes;
    if (any_channel) passes.push_back(play(engine, has_channel, options));
    if (any_without || passes.empty()) {
        std::array<bool, kTracks> all;
        all.fill(true);
        passes.push_back(play(engine, all, options));
    }

    const Pass& first = passes.front();
    MidiTempoMap time(kOutputRate, first.step_lengths.front().second);
    for (const auto& [frame, frames] : first.step_lengths)
        if (frame < first.frames) time.step_length_from(frame, frames);
    std::array<std::vector<MidiMessage>, kTracks> messages;
    if (any_channel) add_played(first, song, time, first.frames, messages);
    if (any_without) add_sketched(passes.back(), song, has_channel, time, first.frames, messages);

    MidiExport result;
    result.end = first.end;
    result.seconds = static_cast<double>(first.frames) / kOutputRate;
    MidiSong& file = result.file;
    file.division = MidiTempoMap::kDivision;
    file.name.assign(song.name, strnlen(song.name, sizeof song.name));
    file.tempo = time.tempo();
    file.end_tick = time.tick_at(first.frames);
    for (int t = 0; t < kTracks; ++t) {
        const bool has_notes = std::any_of(messages[t].begin(), messages[t].end(),
                                           [](const MidiMessage& m) { return m.kind == kMidiNoteOn; });
        if (!has_notes) continue;
        release_sounding_note(messages[t], file.end_tick);
        file.tracks.push_back({"Track " + std::to_string(t + 1), std::move(messages[t])});
    }
    return result;
}

}  // namespace ondrel
