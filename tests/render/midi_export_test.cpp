#include "render/midi_export.h"

#include <algorithm>
#include <cstdio>
#include <cstring>

#include "playback/song_fixture.h"
#include "support/midi_file_reader.h"

namespace ondrel {
namespace {

// What the MIDI output receives, the frame of its step in place of a tick.
class LiveOutput : public MidiOut {
public:
    explicit LiveOutput(const Player& player) : player_(player) {}
    std::vector<test::ReadMessage> heard;
    void NoteOn(uint8_t c, uint8_t n, uint8_t v, uint64_t) override { add(0x90 | (c - 1), n, v); }
    void NoteOff(uint8_t c, uint8_t n, uint8_t v, uint64_t) override { add(0x80 | (c - 1), n, v); }
    void ProgramChange(uint8_t c, uint8_t p, uint64_t) override { add(0xC0 | (c - 1), p, 0); }

private:
    void add(int status, uint8_t d1, uint8_t d2) {
        heard.push_back({uint32_t(player_.step_frame), uint8_t(status), d1, d2});
    }
    const Player& player_;
};

std::string text(const test::ReadMessage& m) {
    char s[16];
    std::snprintf(s, sizeof s, (m.status & 0xF0) == 0xC0 ? "%X %d" : "%X %d %d", m.status, m.data1, m.data2);
    return s;
}

bool on_channel(const test::ReadMessage& m, int channel) {
    return (m.status & 0x0F) == channel - 1;
}

class MidiExportTest : public test::SongFixture {
protected:
    // The file, checked: no message after the end, and no note left sounding.
    test::ReadMidi exported(double max_seconds = 0) {
        const test::ReadMidi f =
            test::read_midi(midi_file_bytes(song_to_midi(engine, {{1024, max_seconds}, nullptr}).file));
        for (const test::ReadTrack& t : f.tracks) {
            int sounding = -1;
            for (const test::ReadMessage& m : t.messages) {
                if ((m.status & 0xF0) == 0x90 && m.data2) sounding = m.data1;
                if ((m.status & 0xF0) == 0x80 && m.data1 == sounding) sounding = -1;
                EXPECT_LE(m.tick, f.tracks[0].end_tick);
            }
            EXPECT_EQ(sounding, -1) << t.name;
        }
        return f;
    }
};

// Tracks 0 and 1 share channel 3, track 2 has channel 5, track 3 none. Tracks 2 and 3 take
// free voices from the top: track 2's velocities depend on track 3 playing its samples.
// Speed and tempo changes, a pattern break, note and pattern delays, a jump over a
// position, and a jump back that ends the song.
TEST_F(MidiExportTest, MidiTracksCarryWhatTheOutputGetsAtTheSequencersTimes) {
    make_song(4, {0, 1, 2, 1}, {16, 16, 16});
    p_s& held = add_sample(1, 64);  // sounds on, so that its voice stays taken
    held.loopon = 1;
    held.loopend = 1000;
    add_sample(2, 100);
    song().trackword1[0] = song().trackword1[1] = 3;
    song().trackword1[2] = 5;
    song().nbvoice[2] = song().nbvoice[3] = 127;
    // clang-format off
    const test::Put cells[] = {
        {0, 0, 0, 48, 1},         {0, 0, 1, 55, 2, 0, 0, 32}, {0, 0, 2, 50, 2}, {0, 0, 3, 60, 1},
        {0, 1, 2, 52, 0},         {0, 2, 0, 0, 0, 15, 3},     {0, 4, 0, 50, 2}, {0, 6, 1, 0, 0, 15, 0x60},
        {0, 8, 1, 57, 0},         {0, 8, 0, 52, 0, 14, 0xD2}, {0, 10, 0, 53, 0, 14, 0xE2},
        {0, 12, 0, 0, 0, 13, 2},  {1, 2, 0, 60, 1},           {1, 2, 3, 62, 2}, {1, 5, 1, 59, 1},
        {1, 8, 2, 0, 0, 15, 120}, {1, 10, 2, 0, 0, 11, 3},    {2, 0, 0, 70, 1},
    };
    // clang-format on
    for (const test::Put& c : cells) put(c);
    TMOD before;
    std::memcpy(static_cast<void*>(&before), &song(), sizeof before);

    const test::ReadMidi f = exported();
    EXPECT_EQ(std::memcmp(&before, &song(), sizeof before), 0);  // the export played a copy
    // Each track's own notes, also where tracks share a channel; track 3 on channel 1.
    std::vector<std::string> firsts;
    for (size_t i = 1; i < f.tracks.size(); ++i)
        firsts.push_back(f.tracks[i].name + ": " + text(f.tracks[i].messages[0]));
    EXPECT_EQ(firsts, (std::vector<std::string>{"Track 1: 92 48 63", "Track 2: 92 55 31", "Track 3: 94 50 99",
                                                "Track 4: C0 0"}));
    // 125 BPM, then 96 (steps of 574 frames), then 120 (459): 48 steps a quarter note,
    // from a step's start, so that every step after a tempo is 20 ticks.
    std::vector<uint32_t> tempi;
    for (const auto& [tick, us] : f.tempo) tempi.push_back(us);
    EXPECT_EQ(tempi, (std::vector<uint32_t>{480000, 624762, 499592}));
    for (const test::ReadTrack& t : f.tracks)
        for (const test::ReadMessage& m : t.messages) {
            const uint32_t from =
                std::prev(std::upper_bound(f.tempo.begin(), f.tempo.end(), std::pair{m.tick, ~0u}))->first;
            EXPECT_LE(std::abs(int((m.tick - from + 10) % 20) - 10), 1) << t.name << " at " << m.tick;
        }

    LiveOutput live(player);
    player.papi = &live;
    render_offline(engine.mixer, player, {1024, 0}, [](const float*, int, double) { return true; });
    for (const int channel : {3, 5}) {
        // All but the note-off ending a track: the sequencer's own come before a note-on.
        std::vector<test::ReadMessage> in_file, heard;
        for (const test::ReadTrack& t : f.tracks) {
            const bool released = !t.messages.empty() && (t.messages.back().status & 0xF0) == 0x80;
            std::copy_if(t.messages.begin(), t.messages.end() - released, std::back_inserter(in_file),
                         [&](auto& m) { return on_channel(m, channel); });
        }
        std::stable_sort(in_file.begin(), in_file.end(), [](auto& a, auto& b) { return a.tick < b.tick; });
        std::copy_if(live.heard.begin(), live.heard.end(), std::back_inserter(heard),
                     [&](auto& m) { return on_channel(m, channel); });
        ASSERT_EQ(in_file.size(), heard.size()) << "channel " << channel;
        for (size_t i = 0; i < heard.size(); ++i) {
            EXPECT_EQ(text(in_file[i]), text(heard[i])) << "channel " << channel << ", message " << i;
            EXPECT_LE(std::abs(in_file[i].tick - test::tick_at_seconds(f, heard[i].tick / 44100.0)), 0.5)
                << "channel " << channel << ", message " << i;
        }
    }
    // A time limit ends every track there (the checks of exported()).
    const test::ReadMidi cut = exported(1.5);
    EXPECT_LE(std::abs(cut.tracks[0].end_tick - test::tick_at_seconds(cut, 1.5)), 0.5);
}

// Tracks 0 and 1 hold channels 1 and 3; the fourteen others get 2, 4..9, 11..16, then 2.
// Each note comes after its own instrument as program unless the channel has it already:
// track 15 shares channel 2 and its programs with track 2.
TEST_F(MidiExportTest, TracksWithoutAChannelGetFreeOnesAndTheirOwnInstruments) {
    make_song(16, {0}, {8});
    add_sample(1, 64);
    add_sample(2, 100);
    song().trackword1[0] = 1;
    song().trackword1[1] = 3;
    for (int t = 2; t < 16; ++t) put(0, 0, t, 40 + t, 1);
    for (const test::Put& c :
         {test::Put{0, 1, 15, 70, 2}, {0, 2, 2, 62, 2}, {0, 3, 2, 64, 0}, {0, 4, 2, 65, 1}})
        put(c);

    const test::ReadMidi f = exported();
    ASSERT_EQ(f.tracks.size(), 15u);
    const int channels[] = {2, 4, 5, 6, 7, 8, 9, 11, 12, 13, 14, 15, 16, 2};
    std::vector<std::string> got[14];
    for (int i = 0; i < 14; ++i) {
        EXPECT_EQ(f.tracks[size_t(i) + 1].name, "Track " + std::to_string(i + 3));
        for (const test::ReadMessage& m : f.tracks[size_t(i) + 1].messages) {
            EXPECT_TRUE(on_channel(m, channels[i])) << i;
            got[i].push_back(text(m));
        }
    }
    EXPECT_EQ(got[0], (std::vector<std::string>{"C1 0", "91 42 63", "81 42 100", "91 62 99", "81 62 100",
                                                "91 64 99", "81 64 100", "C1 0", "91 65 63", "81 65 100"}));
    EXPECT_EQ(got[13], (std::vector<std::string>{"91 55 63", "81 55 100", "C1 1", "91 70 99", "81 70 100"}));
}

// 64 rows of 12 steps are 16 quarter notes; the last buffer's rest comes after them.
TEST_F(MidiExportTest, ASongWithoutNotesGivesItsTempoTrackAlone) {
    make_song(4, {0}, {64});
    std::strcpy(song().name, "Quiet");
    const test::ReadMidi f = exported();
    ASSERT_EQ(f.tracks.size(), 1u);
    EXPECT_EQ(f.tracks[0].name, "Quiet");
    EXPECT_EQ(f.tempo, (std::vector<std::pair<uint32_t, uint32_t>>{{0, 480000}}));
    EXPECT_TRUE(f.tracks[0].end_tick >= 16 * 960 && f.tracks[0].end_tick <= 16 * 960 + 1024 * 20 / 441);
}

}  // namespace
}  // namespace ondrel
