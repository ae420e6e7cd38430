#pragma once
// Songs and sounds for edit tests: the whole current song as bytes, a cell read like the
// editor reads one, small sounds built from their sample values, and an engine with an
// undo history.
#include <gtest/gtest.h>

#include <cstring>
#include <vector>

#include "edit/edit_history.h"
#include "edit/song_transaction.h"
#include "engine/engine.h"

namespace ondrel::test {

// Record, patterns (shape and cells) and samples (header and data) of the current song,
// for exact comparisons.
inline std::vector<uint8_t> song_bytes(const SongBank& bank) {
    std::vector<uint8_t> out;
    const auto put = [&out](const void* p, size_t n) {
        const auto* b = static_cast<const uint8_t*>(p);
        out.insert(out.end(), b, b + n);
    };
    TMOD record;
    std::memcpy(static_cast<void*>(&record), &bank.current(), sizeof record);
    put(&record, sizeof record);
    for (int p = 0; p < kPatternsPerSong; ++p) {
        const Pattern* pat = bank.song_pattern(p);
        out.push_back(pat ? 1 : 0);
        if (!pat) continue;
        put(&pat->nrows, sizeof pat->nrows);
        for (int t = 0; t < kTracks; ++t) {
            const TNOTE* c = pat->column(t);
            out.push_back(c ? 1 : 0);
            if (c) put(c, sizeof(TNOTE) * size_t(pat->nrows));
        }
    }
    for (int s = 0; s < kSamplesPerSong; ++s) {
        const p_s* smp = bank.song_sample(s);
        out.push_back(smp ? 1 : 0);
        if (!smp) continue;
        p_s header;
        std::memcpy(static_cast<void*>(&header), smp, sizeof header);
        header.data = nullptr;  // where the data lives is not part of the song
        put(&header, sizeof header);
        if (smp->data) put(smp->data, smp->length);
    }
    return out;
}

// The cell at (pattern, track, row) of the current song; empty where there is none.
inline TNOTE cell_at(const SongBank& bank, int pattern, int track, int row) {
    const Pattern* p = bank.song_pattern(pattern);
    const TNOTE* c = p ? p->cell(track, row) : nullptr;
    return c ? *c : TNOTE{};
}

// Runs one edit of the current song as a transaction and commits it; returns what the
// edit returned.
template <class Edit>
auto edit(Engine& engine, Edit&& e) {
    SongTransaction t(engine.bank, engine.slots, "test");
    auto result = e(t);
    t.commit();
    return result;
}

struct SoundFormat {
    int bits;
    bool stereo;
};

inline SampleRef make_sound(SoundFormat f, const std::vector<int>& values) {
    SampleRef s = make_sample(static_cast<uint32_t>(values.size() * (f.bits / 8)));
    s->bits = static_cast<int16_t>(f.bits);
    s->stereo = f.stereo;
    s->framecode = frame_code(f.bits, f.stereo);
    s->rate = 22050;
    s->volume = 100;
    for (size_t i = 0; i < values.size(); ++i)
        if (f.bits == 16)
            reinterpret_cast<int16_t*>(s->data)[i] = static_cast<int16_t>(values[i]);
        else
            s->data[i] = static_cast<uint8_t>(values[i]);
    return s;
}

inline std::vector<int> values_of(const p_s* s) {
    std::vector<int> out;
    for (uint32_t i = 0; s && s->data && i < s->length / (s->bits / 8); ++i)
        out.push_back(s->bits == 16 ? reinterpret_cast<const int16_t*>(s->data)[i]
                                    : static_cast<int8_t>(s->data[i]));
    return out;
}

class EditFixture : public ::testing::Test {
protected:
    Engine engine;
    EditHistory history;

    void put_sound(int slot, SampleRef s) { engine.bank.t_sound[size_t(slot)] = std::move(s); }
    const p_s* sound(int slot) const { return engine.bank.song_sample(slot); }
    // Runs a change as the program does; its result must say whether it made a step.
    template <class Change>
    bool edit(Change change) {
        SongTransaction t(engine.bank, engine.slots, "edit");
        const bool said = change(t);
        EditStep step = t.commit();
        EXPECT_EQ(said, !step.empty());
        history.push(std::move(step));
        return said;
    }
    bool undo() { return history.undo(engine.bank, engine.slots); }
};

}  // namespace ondrel::test
