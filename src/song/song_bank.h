#pragma once
#include <array>
#include <atomic>
#include <cstdint>
#include <memory>
#include <vector>

#include "song/alerts.h"
#include "song/pattern.h"
#include "song/sample.h"
#include "song/structure_lock.h"
#include "song/tmod.h"

namespace ondrel {

// One song's record with its patterns and samples, built on the side (by a reader or a
// test) and then installed into the bank in one swap.
struct SongData {
    SongData();
    std::unique_ptr<TMOD> mod;
    std::array<PatternRef, kPatternsPerSong> patterns;
    std::array<SampleRef, kSamplesPerSong> samples;
};

// The songs in memory and the global pattern and sample tables they share.
class SongBank {
public:
    explicit SongBank(AlertSink* alerts = nullptr);
    ~SongBank();
    SongBank(const SongBank&) = delete;
    SongBank& operator=(const SongBank&) = delete;

    // The tables below are written on the window thread (readers, editors, song commands),
    // structural changes under the structure lock; the audio thread reads them.
    std::array<std::unique_ptr<TMOD>, kMaxSongs> timod;  // the songs, by song number; null past nbimod
    int16_t nbimod = 0;                                  // songs in memory, 1..63
    int16_t noimod = 0;                                  // number of the current song, 0..nbimod - 1
    uint8_t fmulload = 0;            // "Multiple Music Loading": 1 = a load adds a song instead of replacing
    std::vector<PatternRef> p_pat;   // patterns: entry song x 128 + pattern; null = none (nbimod x 128)
    std::vector<SampleRef> t_sound;  // sounds: entry song x 128 + sound - 1; null = empty (nbimod x 128)
    std::atomic<int16_t> nbvoie{0};  // tracks read per row and allocated in every pattern, 0..64
    // Set while a whole song is swapped in; the render callback then renders silence.
    std::atomic<uint8_t> loadin{0};
    // The sample being replaced (local number), 65535 for none; voices on it are skipped.
    std::atomic<uint16_t> loadininst{65535};

    void set_alerts(AlertSink* alerts) { alerts_ = alerts; }
    AlertSink* alerts() const { return alerts_; }
    void set_structure_lock(StructureLock* lock) { lock_ = lock ? lock : &no_lock_; }
    StructureLock& structure_lock() { return *lock_; }

    TMOD& current() { return *timod[noimod]; }
    const TMOD& current() const { return *timod[noimod]; }
    Pattern* pattern(int global) const;
    p_s* sample(int global) const;
    // Local pattern / sample number of the current song.
    Pattern* song_pattern(int local) const { return pattern(current().patbase + local); }
    p_s* song_sample(int local) const { return sample(current().sndbase + local); }

    // Adds a song slot; 0 when 63 songs are held already.
    int addmusic();
    // A new song with the defaults, made current. False (and an alert) when refused.
    bool newmusic();
    void patcreate(int pattern, short tracks);
    void Gofree(int pattern);
    void Raz_data(int sample);
    void updatenbvoice(short tracks);
    // Frees the current song; the bank always keeps one song.
    void killmusic();
    // Makes song current.
    void select(int song);
    // Puts sample into sound slot (0-based) of the current song, the render callback kept
    // off that slot meanwhile; sample comes back holding the record the slot had.
    void replace_sound(int slot, SampleRef& sample);

    // Replaces song's record, patterns and samples with data (whose base indices are
    // rewritten for the slot), under the structure lock; the old ones are freed after.
    void install(int song, SongData&& data);
    // Copy of song's record with new-song defaults, for a reader to start from.
    std::unique_ptr<TMOD> default_record(int song) const;

private:
    void free_song_data(int song);

    AlertSink* alerts_;
    NoStructureLock no_lock_;
    StructureLock* lock_ = &no_lock_;
};

// A copy of song's record, patterns and samples, to play on the side. The record is copied
// under the structure lock: the sequencer writes some of its fields while it plays.
SongData copy_song(SongBank& bank, int song);

}  // namespace ondrel
