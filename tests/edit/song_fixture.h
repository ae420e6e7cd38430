#pragma once
// Songs for edit tests: the whole current song as bytes, and a cell read like the editor
// reads one.
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

// Runs one edit of the current song as a transaction and commits it (into history when
// given); returns what the edit returned.
template <class Edit>
auto edit(Engine& engine, Edit&& e, EditHistory* history = nullptr) {
    SongTransaction t(engine.bank, engine.slots, "test");
    auto result = e(t);
    EditStep step = t.commit();
    if (history) history->push(std::move(step));
    return result;
}

}  // namespace ondrel::test
