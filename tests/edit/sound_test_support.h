#pragma once
// Small sounds built from their sample values, and an engine with an undo history.
#include <gtest/gtest.h>

#include <vector>

#include "edit/edit_history.h"
#include "edit/song_transaction.h"
#include "engine/engine.h"

namespace ondrel::test {

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
