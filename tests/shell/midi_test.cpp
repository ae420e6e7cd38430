// MIDI in the program: the internal synthesiser heard in the song's output, its alerts,
// notes from a MIDI keyboard entered at the cursor, and real ports under a JACK server.
#include <gtest/gtest.h>
#include <rtmidi/RtMidi.h>

#include <chrono>
#include <cmath>
#include <cstdio>
#include <deque>
#include <fstream>
#include <mutex>
#include <thread>

#include "jack_server.h"
#include "render/offline_render.h"
#include "shell/program_fixture.h"
#include "support/wait_until.h"

namespace ondrel {
namespace {

// A track of the program's empty song plays notes 60 and 64 on MIDI channel channel,
// with instrument 1, which has no sound; play starts from the first row.
void make_midi_song(Program& p, int channel, int track = 0) {
    p.engine.bank.current().trackword1[track] = static_cast<uint16_t>(channel);
    Pattern* pattern = p.engine.bank.song_pattern(0);
    pattern->col[track][0] = TNOTE{60, 0, 0, 1, 0, 0};
    pattern->col[track][8] = TNOTE{64, 0, 0, 1, 0, 0};
    p.engine.player.cursor.poscurv = 0;
}

float render_peak(Program& p, double seconds) {
    float peak = 0;
    render_offline(p.engine.mixer, p.engine.player, OfflineOptions{512, seconds},
                   [&](const float* frames, int count, double) {
                       for (int i = 0; i < 2 * count; ++i) peak = std::max(peak, std::fabs(frames[i]));
                       return true;
                   });
    return peak;
}

TEST(MidiSynth, MidiTracksSoundThroughTheSynthesiserAndOnlyWhileItIsOpen) {
    if (FluidSynthesiser::default_soundfont().empty()) GTEST_SKIP() << "no General MIDI SoundFont installed";
    Program p;
    make_midi_song(p, 1);
    EXPECT_EQ(render_peak(p, 0.5), 0.0f);  // no output open: the empty samples play, silently

    std::string why;
    ASSERT_TRUE(p.midi.open_synth(why, false)) << why;
    EXPECT_EQ(p.engine.player.papi.load(), &p.midi.router);
    const float heard = render_peak(p, 0.5);
    EXPECT_GT(heard, 0.01f);
    EXPECT_LE(heard, 1.0f);  // through the mixer's headroom and clip

    p.midi.close_synth();
    EXPECT_EQ(p.engine.player.papi.load(), nullptr);
    EXPECT_EQ(p.engine.mixer.synth(), nullptr);
    EXPECT_EQ(render_peak(p, 0.5), 0.0f);
}

TEST(MidiSynth, LaunchingAsksFirstAndABadSoundFontLeavesItClosed) {
    const std::string broken = ::testing::TempDir() + "/broken.sf2";
    std::ofstream(broken) << "RIFF this is no SoundFont";
    Program p;
    const auto shown = [&p] {
        const Alert* a = p.alerts.front();
        return a ? *a : Alert{"", "(no alert)", {}};
    };
    test::run(p, "MSYN");
    ASSERT_EQ(p.alerts.size(), 1u);
    EXPECT_EQ(shown().text, "Launch Internal Midi Synth ? This take some more resource ! ");
    EXPECT_EQ(shown().buttons, (std::vector<std::string>{"Yes", "No !!"}));
    p.alerts.answer(1);  // "No !!"
    EXPECT_FALSE(p.midi.synth_open());

    for (const std::string& soundfont : {broken, std::string("/no/such/file.sf2")}) {
        SCOPED_TRACE(soundfont);
        p.midi.soundfont = soundfont;
        test::run(p, "MSYN");
        p.alerts.answer(0);  // "Yes"
        ASSERT_EQ(p.alerts.size(), 1u);
        EXPECT_NE(shown().text.find(soundfont), std::string::npos) << shown().text;
        p.alerts.answer(0);
        EXPECT_FALSE(p.midi.synth_open());
        EXPECT_EQ(p.engine.player.papi.load(), nullptr);
    }
    std::remove(broken.c_str());

    if (FluidSynthesiser::default_soundfont().empty()) return;
    p.midi.soundfont.clear();
    test::run(p, "MSYN");
    p.alerts.answer(0);
    EXPECT_TRUE(p.midi.synth_open());
    test::run(p, "MSYN");
    EXPECT_EQ(shown().text, "Destroy Internal Midi Synth ? This free some resource !");
    p.alerts.answer(0);
    EXPECT_FALSE(p.midi.synth_open());
}

TEST(MidiInput, NotesPlayedAreEnteredAtTheCursorOnlyInEditMode) {
    Program p;
    const auto cell = [&p](int row) { return p.engine.bank.song_pattern(0)->col[0][row]; };
    const auto note = [&p](int n, int vel) {
        test::run(p, ShellMessage(fourcc("midi")).with("note", n).with("vel", vel));
    };
    note(62, 100);
    EXPECT_EQ(cell(0).note, 0);  // heard, not written
    p.post(fourcc("EDmd"));
    p.engine.player.cursor.cursnd = 2;
    p.engine.player.cursor.poscurx = kFieldVolume0;  // a MIDI key is no digit: the note goes in
    note(62, 100);
    note(70, 0);  // a note-on without velocity plays nothing
    note(74, 1);
    EXPECT_EQ(cell(0), (TNOTE{62, 0, 0, 3, 0, 0}));
    EXPECT_EQ(cell(1).note, 74);
    EXPECT_EQ(p.engine.player.cursor.poscurv, 2);
    // The range fields follow the last note: 36 below it, 60 above that, held in 0..127.
    EXPECT_STREQ(p.editor.midi_range_low.data(), "D  1");
    EXPECT_STREQ(p.editor.midi_range_high.data(), "D  6");
    note(20, 90);
    EXPECT_STREQ(p.editor.midi_range_low.data(), "C -2");
    EXPECT_STREQ(p.editor.midi_range_high.data(), "C  3");
    note(120, 90);
    EXPECT_STREQ(p.editor.midi_range_high.data(), "G  8");
}

TEST(MidiPorts, RealPortsCarryNotesInThroughAndOut) {
    test::JackServer jack;
    if (!jack.running()) GTEST_SKIP() << "no JACK server could be started";
    RtMidiOut keyboard(RtMidi::UNIX_JACK, "test keyboard");
    keyboard.openVirtualPort("keys");
    // What reaches the sink, handed over from JACK's thread.
    struct Received {
        std::mutex lock;
        std::deque<std::vector<unsigned char>> messages;
    } received;
    RtMidiIn sink(RtMidi::UNIX_JACK, "test sink");
    sink.setCallback(
        [](double, std::vector<unsigned char>* m, void* to) {
            auto* r = static_cast<Received*>(to);
            std::lock_guard<std::mutex> hold(r->lock);
            r->messages.push_back(*m);
        },
        &received);
    sink.openVirtualPort("sink");

    Program p;
    p.midi.start_ports("test keyboard:keys");
    ASSERT_TRUE(p.midi.ports()->available()) << p.midi.ports()->unavailable_reason();
    ASSERT_EQ(p.midi.ports()->input_name(), "test keyboard:keys");
    // Our own input is no output to choose: what we send would come back in for ever.
    EXPECT_EQ(p.midi.output_ports, std::vector<std::string>{"test sink:sink"});
    std::string why;
    ASSERT_TRUE(p.midi.choose_output("test sink:sink", why)) << why;

    // A note from the keyboard is entered, and passed through to the output.
    test::run(p, "EDmd");
    // JACK makes a connection in its own time: the keyboard plays until its note is in.
    std::vector<unsigned char> on{0x90, 64, 90};
    EXPECT_TRUE(test::wait_until([&] {
        p.run_pending();
        if (p.engine.bank.song_pattern(0)->col[0][0].note == 64) return true;
        keyboard.sendMessage(&on);
        std::this_thread::sleep_for(std::chrono::milliseconds(50));
        return false;
    }));
    const auto receive = [&received](const std::vector<unsigned char>& wanted) {
        return test::wait_until([&] {
            std::lock_guard<std::mutex> hold(received.lock);
            while (!received.messages.empty()) {
                const bool found = received.messages.front() == wanted;
                received.messages.pop_front();
                if (found) return true;
            }
            return false;
        });
    };
    EXPECT_TRUE(receive({0x90, 64, 90}));

    // The song's MIDI track reaches the port as the sequencer sends it.
    test::run(p, "EDmd");
    make_midi_song(p, 2, 1);  // beside the track the keyboard's note went to
    render_peak(p, 1.2);
    EXPECT_TRUE(receive({0x91, 60, 127}));
    EXPECT_TRUE(receive({0xC1, 1}));  // one change late: instrument 1 is sent at the next note
    EXPECT_TRUE(receive({0x81, 60, 100}));
    EXPECT_TRUE(receive({0x91, 64, 127}));

    // The port goes away: sending stops, the window is told once.
    sink.closePort();
    EXPECT_TRUE(test::wait_until([&p] {
        p.run_pending();
        return p.engine.player.papi.load() == nullptr;
    }));
    EXPECT_NE(p.last_said().find("went away"), std::string::npos) << p.last_said();
}

}  // namespace
}  // namespace ondrel
