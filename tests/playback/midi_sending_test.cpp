#include <string>

#include "song_fixture.h"

namespace ondrel {
namespace {

// Keeps what the sequencer sends, one line each.
class RecordingMidi : public MidiOut {
public:
    std::vector<std::string> sent;
    void NoteOn(uint8_t c, uint8_t n, uint8_t v, uint64_t) override { add("on", {c, n, v}); }
    void NoteOff(uint8_t c, uint8_t n, uint8_t v, uint64_t) override { add("off", {c, n, v}); }
    void ProgramChange(uint8_t c, uint8_t p, uint64_t) override { add("program", {c, p}); }

private:
    void add(std::string line, std::initializer_list<int> values) {
        for (int v : values) line += " " + std::to_string(v);
        sent.push_back(line);
    }
};

// Track 0 sends to channel 3; sample 1 has volume 64, sample 2 volume 0.
class MidiSending : public test::SongFixture {
protected:
    RecordingMidi midi;
    void SetUp() override {
        make_song(2, {0});
        add_sample(1, 64);
        add_sample(2, 0);
        song().trackword1[0] = 3;
        player.papi = &midi;
    }
};

TEST_F(MidiSending, WhatTheCellsSend) {
    using Lines = std::vector<std::string>;
    struct Case {
        const char* what;
        std::vector<test::Put> cells;
        int calls;
        Lines sent;
    };
    const Case cases[] = {
        {"notes, the volume as velocity, the last note off first",
         {{0, 0, 0, 60, 1}, {0, 1, 0, 62, 0, 0, 0, 32}},
         13,
         {"on 3 60 63", "off 3 60 100", "on 3 62 31"}},
        {"volume 0 as full velocity", {{0, 0, 0, 60, 2}}, 1, {"on 3 60 127"}},
        {"programs one change late",
         {{0, 0, 0, 60, 1}, {0, 1, 0, 60, 2}, {0, 2, 0, 60, 2}, {0, 3, 0, 60, 1}},
         37,
         {"on 3 60 63", "program 3 1", "off 3 60 100", "on 3 60 127", "program 3 2", "off 3 60 100",
          "on 3 60 127", "off 3 60 100", "on 3 60 63"}},
        {"a note delay of 0 triggers in both passes",
         {{0, 0, 0, 48, 1, 14, 0xD0}},
         1,
         {"on 3 48 63", "off 3 48 100", "on 3 48 63"}},
        {"a track without a channel keeps its samples", {{0, 0, 1, 60, 1}}, 1, {}},
    };
    for (const Case& c : cases) {
        make_song(2, {0});
        for (const test::Put& p : c.cells) put(p);
        midi.sent.clear();
        play();
        calls(c.calls);
        EXPECT_EQ(midi.sent, c.sent) << c.what;
        EXPECT_EQ(voice(0).active, 0) << c.what;  // the channel's notes start no sample voice
        EXPECT_EQ(voice(1).active, c.cells[0].track == 1) << c.what;
        player.stoppi();
        tr.notesended[0] = tr.instsended[0] = 0;
        voice(0).instrument = 0;
    }
}

TEST_F(MidiSending, WithoutAnOutputTheSampleVoicePlays) {
    player.papi = nullptr;
    put(0, 0, 0, 60, 1);
    play();
    calls(1);
    EXPECT_EQ(voice(0).active, 1);
    EXPECT_EQ(tr.notesended[0], 0);
}

}  // namespace
}  // namespace ondrel
