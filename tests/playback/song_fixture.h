#pragma once
// Songs built in code for the sequencer tests, and a way to step the sequencer.
#include <gtest/gtest.h>

#include <vector>

#include "engine/engine.h"
#include "playback/tables.h"

namespace ondrel::test {

// A cell to put in a song: where, and what.
struct Put {
    int pattern, row, track, note, instrument, command = 0, parameter = 0, volume = 0;
};

class SongFixture : public ::testing::Test {
protected:
    Engine engine;
    SongBank& bank = engine.bank;
    Player& player = engine.player;
    Transport& tr = engine.player.tr;

    TMOD& song() { return bank.current(); }

    // A song of tracks tracks whose sequence plays patterns (each of rows rows, else 64).
    void make_song(int tracks, std::vector<int> sequence, std::vector<int> rows = {}) {
        TMOD& m = song();
        m.nbtrack = static_cast<uint8_t>(tracks);
        m.nbpos = static_cast<uint8_t>(sequence.size());
        int patterns = 0;
        for (size_t i = 0; i < sequence.size(); ++i) {
            m.sequence[i] = static_cast<uint8_t>(sequence[i]);
            patterns = std::max(patterns, sequence[i] + 1);
        }
        for (int p = 0; p < patterns; ++p) {
            m.rows[p] = static_cast<int16_t>(p < static_cast<int>(rows.size()) ? rows[p] : 64);
            bank.Gofree(m.patbase + p);
            bank.patcreate(m.patbase + p, static_cast<short>(tracks));
        }
        bank.nbvoie = static_cast<int16_t>(tracks);
    }

    // An 8-bit sample in instrument slot instrument (1-based).
    p_s& add_sample(int instrument, int volume = 64, int finetune = 0) {
        SampleRef s = make_sample(1000);
        s->bits = 8;
        s->rate = 8363;
        s->volume = static_cast<int16_t>(volume);
        s->finetune = static_cast<int16_t>(finetune);
        p_s& ref = *s;
        bank.t_sound[song().sndbase + instrument - 1] = std::move(s);
        return ref;
    }

    void put(const Put& c) {
        const auto byte = [](int v) { return static_cast<uint8_t>(v); };
        bank.song_pattern(c.pattern)->col[c.track][c.row] = {
            byte(c.note), byte(c.volume), 0, byte(c.instrument), byte(c.command), byte(c.parameter)};
    }
    void put(int pattern, int row, int track, int note, int instrument, int command = 0, int parameter = 0,
             int volume = 0) {
        put({pattern, row, track, note, instrument, command, parameter, volume});
    }

    void play(bool pattern_mode = false) { player.start(pattern_mode); }
    void calls(int n) {
        for (int i = 0; i < n; ++i) player.gere_play();
    }
    // Calls for whole rows at the song's current speed.
    void rows(int n) { calls(n * 2 * song().speed); }

    std::vector<uint32_t> window_messages() {
        std::vector<uint32_t> codes;
        Message m;
        while (player.to_window.pop(m)) codes.push_back(m.code);
        return codes;
    }

    Voice& voice(int v) { return player.nlist[v]; }
};

}  // namespace ondrel::test
