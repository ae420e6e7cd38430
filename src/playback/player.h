#pragma once
#include <array>
#include <atomic>
#include <cstdint>
#include <vector>

#include "playback/messages.h"
#include "playback/midi_out.h"
#include "playback/transport.h"
#include "playback/voice.h"
#include "song/effect_slots.h"
#include "song/song_bank.h"

namespace ondrel {

inline constexpr uint32_t kMsgStop = fourcc("stop");
inline constexpr uint32_t kMsgActi = fourcc("acti");
inline constexpr uint32_t kMsgDoup = fourcc("doup");

// The effect units, as stopping play clears them.
class UnitReset {
public:
    virtual ~UnitReset() = default;
    virtual void delefx() = 0;
};

// The sequencer and its state: transport, voice list, polyphony counters, MIDI sending.
// gere_play runs on the audio thread; start, stop and the auditions on the window thread.
class Player {
public:
    Player(SongBank& bank, EffectSlots& slots);

    Transport tr;
    EditCursor cursor;
    // The voice list: written by the sequencer (notes) and the mixer (positions), both on
    // the audio thread while it runs; stop clears it (through the audio thread when it runs).
    std::array<Voice, kVoices> nlist{};
    // A bit per voice that may be active, so the mixer need not look at all 256: set when
    // a voice starts, cleared by the mixer when it finds the voice stopped.
    std::array<uint64_t, kVoices / 64> active_hint{};
    void activate(int voice) {
        nlist[voice].active = 1;
        active_hint[voice / 64] |= uint64_t{1} << (voice % 64);
    }
    std::array<int16_t, kVoices> polytotrack{};   // track 0..63 owning each voice (track_to_poly)
    std::array<int16_t, kVoices> polytour{};      // per track: the next of its voices, 0..nbvoice - 1
    std::array<int16_t, kTracks> efxaffiche{};    // slot shown on each track's effect button (command 33)
    std::array<int16_t, kEffectSlots> autovar{};  // the mixer's auto-pan positions, 0..255; efxa at start
    std::atomic<MidiOut*> papi{nullptr};          // the open MIDI output, null when none
    uint64_t step_frame = 0;  // the mixer's frame count where the current step starts (audio thread)
    SpscQueue<64> to_window;                      // messages from the audio thread ('stop')
    std::vector<Message> window_posts;            // messages from the window thread itself ('acti')
    const char* status = kStatusStopped;          // the status line
    // Set by the audio driver while its callback may run: stopping then hands the voice
    // reset to the audio thread instead of doing it here.
    std::atomic<bool> audio_running{false};
    UnitReset* units = nullptr;

    // One half-tick of the sequencer.
    void gere_play();
    // Voice for the next note of track (polyphony by the track's nbvoice).
    int track_to_poly(int track);
    // The instrument of the voice that track (0..63) plays its notes on now.
    int track_instrument(int track) const { return nlist[curvoice_[track]].instrument; }
    // Value of envelope kind (0..4, or 16) for voice, whose sample is length long.
    float compute_adsr(int kind, unsigned voice, unsigned long length, const p_s* env) const;

    // "PLAYING ALL" (pattern_mode false) or "PLAYING PATTERN".
    void start(bool pattern_mode);
    void stoppi(bool sound_only = false);
    // Auditions: one cell on a track, one track of a position, one row.
    void audition_note(const TNOTE& cell, int track);
    void audition_track(int position, int track);
    void play_line();
    // Called by the audio thread before it renders a buffer: carries out a stop that
    // the window thread asked for.
    void service_audio_requests();

    // Remembers the rows played from now on, so that a song that comes back to a row it
    // has played (a loop by jump) can be told apart from one still going; repeated is
    // raised at the first such row.
    void watch_for_repeats(bool on);
    std::atomic<bool> repeated{false};

    int ilestou(int position) const;  // pattern table index, -1 when none
    int dopatend();                   // sets patend; returns the rows of the whole song
    int fan(int column) const;
    int fun(int track) const;
    static int prochain(const TNOTE* column, int row, int rows);
    void jump(int step, bool stay, bool control = false);

private:
    friend class EffectCommands;
    void silence_voices();
    void read_track(int track, int position, const Pattern* pattern, bool audition_cell);
    void take_instrument(int track, Voice& v, const TNOTE& cell);
    void set_start(Voice& v) const;
    // The current song's sample of an instrument number, null when none (numbers from
    // files can point past the song's 128 slots).
    const p_s* sample_of(int instrument) const;
    void trigger(int track, Voice& v, int note);
    void send_program(int track, const Voice& v);
    int route_to_slot(int track, int slot);

    SongBank& bank_;
    EffectSlots& slots_;
    std::array<int16_t, kTracks> curvoice_{};  // voice each track's commands act on
    int local_pos_ = 0;                        // the position while a call works on it
    uint64_t falling_meters_ = 0;              // a bit per track whose meter is above zero
    // A bit per position and row while watched; kept in the player so that starting a
    // render neither allocates nor clears more than the last one marked.
    static constexpr int kWordsPerPosition = kMaxRows / 64;
    std::array<uint64_t, kPositions * kWordsPerPosition> visited_{};
    std::array<uint64_t, kPositions / 64> visited_positions_{};
    bool watching_ = false;
    void mark_visited();
    std::atomic<uint32_t> stop_request_{0};
    std::atomic<bool> stop_silences_{false};
    void stop_audio_side(bool silence);
    std::atomic<uint32_t> stop_done_{0};
};

uint64_t system_time_us();

}  // namespace ondrel
