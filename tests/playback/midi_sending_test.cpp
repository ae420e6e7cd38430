#include <cstdio>
#include <string>

#include "song_fixture.h"

namespace ondrel {
namespace {

// Keeps what the sequencer sends, one line each.
class RecordingMidi : public MidiOut {
public:
    std::vector<std::string> sent;
    void NoteOn(uint8_t c, uint8_t n, uint8_t v, uint64_t) override { add("on", c, n, v); }
    void NoteOff(uint8_t c, uint8_t n, uint8_t v, uint64_t) override { add("off", c, n, v); }
    void ProgramChange(uint8_t c, uint8_t p, uint64_t) override { add("program", c, p, -1); }

private:
    void add(const char* what, int c, int a, int b) {
        char line[64];
        if (b >= 0)
            std::snprintf(line, sizeof line, "%s %d %d %d", what, c, a, b);
        else
            std::snprintf(line, sizeof line, "%s %d %d", what, c, a);
        sent.push_back(line);
    }
};

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

TEST_F(MidiSending, NotesGoToTheChannelInsteadOfTheSampleVoice) {
    put(0, 0, 0, 60, 1);
    put(0, 1, 0, 62, 0, 0, 0, 32);
    play();
    calls(1);
    EXPECT_EQ(voice(0).active, 0);
    EXPECT_EQ(tr.notesended[0], 61);
    rows(1);
    EXPECT_EQ(midi.sent, (std::vector<std::string>{"on 3 60 63", "off 3 60 100", "on 3 62 31"}));
}

TEST_F(MidiSending, VolumeZeroIsSentAsFullVelocity) {
    put(0, 0, 0, 60, 2);  // sample 2 has volume 0
    play();
    calls(1);
    EXPECT_EQ(midi.sent, (std::vector<std::string>{"on 3 60 127"}));
}

TEST_F(MidiSending, ProgramChangesArriveOneChangeLate) {
    put(0, 0, 0, 60, 1);
    put(0, 1, 0, 60, 2);
    put(0, 2, 0, 60, 2);
    put(0, 3, 0, 60, 1);
    play();
    rows(4);
    std::vector<std::string> programs;
    for (const auto& s : midi.sent)
        if (s.rfind("program", 0) == 0) programs.push_back(s);
    EXPECT_EQ(programs, (std::vector<std::string>{"program 3 1", "program 3 2"}));
    EXPECT_EQ(tr.instsended[0], 2);
}

TEST_F(MidiSending, WithoutAnOutputTheSampleVoicePlays) {
    player.papi = nullptr;
    put(0, 0, 0, 60, 1);
    play();
    calls(1);
    EXPECT_EQ(voice(0).active, 1);
    EXPECT_EQ(tr.notesended[0], 0);
}

TEST_F(MidiSending, TracksWithoutAChannelKeepTheirSamples) {
    put(0, 0, 1, 60, 1);
    play();
    calls(1);
    EXPECT_EQ(voice(1).active, 1);
    EXPECT_TRUE(midi.sent.empty());
}

}  // namespace
}  // namespace ondrel
