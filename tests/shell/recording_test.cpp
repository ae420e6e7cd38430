// Recording through the program's commands, as the recording panel drives it: the song's
// own output into the current instrument or a file chosen in the file panel, the input
// through the capture node, and no input at all.
#include "shell/recording.h"

#include <gtest/gtest.h>

#include <cstring>
#include <filesystem>
#include <fstream>

#include "shell/program_fixture.h"
#include "shell/recording_settings.h"
#include "support/fake_capture_input.h"
#include "support/wait_until.h"

namespace ondrel {
namespace {

namespace fs = std::filesystem;
const std::string kModule = "../shared/corpus/mod/ode2ptk.mod";
constexpr size_t kHeader = sizeof(p_s);  // what the sound's header covers of the bytes taken

std::vector<uint8_t> bytes_of(const std::vector<int16_t>& v) {
    std::vector<uint8_t> b(v.size() * 2);
    std::memcpy(b.data(), v.data(), b.size());
    return b;
}

class RecordingTest : public test::ProgramFixture {
protected:
    void SetUp() override {
        if (!fs::exists(kModule)) GTEST_SKIP() << kModule << " is missing";
        open({kModule});
        p.recording.directory = dir.path().string();
    }
    // Plays the song for frames frames through the render callback, as the sound device
    // would; what the recorder was handed: the output as 16-bit stereo.
    std::vector<int16_t> play(size_t frames) {
        std::vector<int16_t> taken;
        std::vector<float> buffer(2 * 512);
        for (size_t done = 0; done < frames; done += 512) {
            p.engine.mixer.BufferProc(nullptr, buffer.data(), buffer.size() * 4, AudioFormat{});
            for (float v : buffer) taken.push_back(static_cast<int16_t>(v * 32767));
        }
        return taken;
    }
    const p_s* instrument(int slot) const { return p.engine.bank.song_sample(slot); }
};

TEST_F(RecordingTest, TheSongsOutputRecordedInMemoryBecomesTheCurrentInstrumentAndUndoes) {
    p.engine.player.cursor.cursnd = 4;
    const p_s* before = instrument(4);
    set("RCsr", 1);
    set("RCfm", 1);  // stereo 16 bits
    run("reco");
    run("PLsg");
    const std::vector<uint8_t> taken = bytes_of(play(44100 / 2));
    ASSERT_NE(std::count(taken.begin(), taken.end(), 0), std::ptrdiff_t(taken.size())) << "a silent song";
    run("stre");
    const p_s* s = instrument(4);
    ASSERT_TRUE(s && s->length == taken.size() && s->stereo == 1);
    // The output as handed over, less the bytes the header was written on.
    EXPECT_EQ(0, std::memcmp(s->data, taken.data() + kHeader, taken.size() - kHeader));
    EXPECT_EQ(p.last_said(), "Recorded 0.5 s into instrument 5");
    EXPECT_EQ(p.history().undo_label(), "Record");
    run("UNDO");
    EXPECT_EQ(instrument(4), before);
}

TEST_F(RecordingTest, AMemoryRecordingStopsByItselfWhenItIsFull) {
    set("RCsr", 1);
    set("RCfm", 0);  // mono 16 bits: 8 s of sound
    run("reco");
    run("PLsg");
    play(8 * 44100 + 4096);
    p.run_pending();  // the recorder's 'stre', with nobody pressing Stop
    EXPECT_FALSE(p.recording.recorder.isRecording());
    ASSERT_NE(instrument(0), nullptr);
    EXPECT_GE(instrument(0)->length, kRecordLimit);
    EXPECT_LT(instrument(0)->length, kRecordLimit + 512 * 2) << "more than the buffer that reached the limit";
}

TEST_F(RecordingTest, ADiskRecordingGoesToTheFileChosenInTheFilePanel) {
    set("RCsr", 1);
    set("RCds", 1);  // a default file at once, shown in the panel
    const std::string first_default = dir.file("NewSound:1");
    EXPECT_TRUE(fs::exists(first_default));
    run("RCch");
    ASSERT_EQ(p.file_panel.mode, FilePanelRequest::Mode::Save);
    EXPECT_EQ(p.file_panel.directory + "/" + p.file_panel.suggested_name, first_default);
    fs::create_directory(dir.file("takes"));
    const std::string take = dir.file("takes/take.wav");
    p.file_chosen(take);
    p.run_pending();
    EXPECT_FALSE(fs::exists(first_default)) << "the unused default file stays behind";
    EXPECT_EQ(p.recording.directory, dir.file("takes"));

    run("reco");
    run("PLsg");
    const std::vector<uint8_t> taken = bytes_of(play(44100));
    run("stre");
    const std::vector<uint8_t> file = test::read_all(take);
    ASSERT_EQ(file.size(), 46 + taken.size());
    EXPECT_EQ(0, std::memcmp(file.data() + 46, taken.data(), taken.size()));
    EXPECT_EQ(p.last_said(), "Recorded 1.0 s to " + take);
    EXPECT_EQ(p.recording.recorder.d2dref(), dir.file("takes/NewSound:2")) << "the next one overwrites it";
}

TEST_F(RecordingTest, ADiskRecordingWithNowhereToGoAsksForTheFileThenStarts) {
    p.recording.directory = dir.file("gone");
    set("RCsr", 1);
    set("RCds", 1);
    p.file_panel_closed();  // the user would rather not choose yet
    run("reco");
    EXPECT_FALSE(p.recording.recorder.isRecording());
    p.file_chosen(dir.file("late.wav"));
    p.run_pending();
    EXPECT_TRUE(p.recording.recorder.isRecording());
    run("stre");
    EXPECT_EQ(fs::file_size(dir.file("late.wav")), 46u);
}

// The song's output still can be: the tests above record it with no capture device.
TEST_F(RecordingTest, WithoutACaptureDeviceTheInputIsNeitherMonitoredNorRecorded) {
    EXPECT_TRUE(p.recording.input_names().empty());
    run("moni");
    run("reco");
    EXPECT_FALSE(p.recording.busy());
    EXPECT_TRUE(p.alerts.empty()) << "the panel says it; nothing to alert";
}

TEST_F(RecordingTest, TheChosenInputIsMonitoredAndRecordedThroughTheCaptureNode) {
    std::vector<test::FakeInput*> made;
    p.recording.set_inputs({"Line In", "Mic"}, [&made](const std::string& device) {
        made.push_back(new test::FakeInput(device));
        return std::unique_ptr<CaptureSource>(made.back());
    });
    EXPECT_EQ(p.recording.input_names(), (std::vector<std::string>{"Default Input", "Line In", "Mic"}));
    set("RCin", 2);
    run("moni");
    ASSERT_TRUE(p.recording.input_connected());
    test::FakeInput& mic = *made.back();
    EXPECT_EQ(mic.name(), "Mic");
    set("RCin", 1);  // not while it is connected
    EXPECT_EQ(p.recording.chosen_input_name(), "Mic");

    run("reco");
    // The node starts 50 ms after the command: buffers from then on are recorded.
    std::vector<int16_t> frames(2 * 2205);
    mic.play(frames);
    for (size_t i = 0; i < frames.size(); ++i) frames[i] = static_cast<int16_t>(i * 7);
    mic.play(frames);
    ASSERT_TRUE(test::wait_until([&] { return p.recording.recorder.bytes_recorded() == frames.size() * 2; }));
    run("stre");  // the recording stops, the monitoring goes on
    EXPECT_TRUE(p.recording.recorder.isMonitoring());
    const std::vector<uint8_t> taken = bytes_of(frames);
    ASSERT_NE(instrument(0), nullptr);
    EXPECT_EQ(0, std::memcmp(instrument(0)->data, taken.data() + kHeader, taken.size() - kHeader));
    run("stre");
    EXPECT_FALSE(mic.is_open());
}

TEST_F(RecordingTest, ThePanelsChoicesAreKeptBetweenRunsUnlessTheyNoLongerFit) {
    const auto inputs = [](Recording& r) {
        r.set_inputs({"Line In"}, [](const std::string& d) { return std::make_unique<test::FakeInput>(d); });
    };
    inputs(p.recording);
    set("RCin", 1);
    set("RCfm", 2);
    set("RCgn", 300);
    std::string why;
    ASSERT_TRUE(write_recording_settings(p.recording, dir.file("config"), why)) << why;
    std::ofstream(dir.file("other.txt"))
        << "<Record Path>/no/such/dir\n<Record Input>Gone\n<Record Format>4\n"
           "<Record Gain>-1\n<Other>x\n";
    Engine engine;
    Recording next(engine.mixer, nullptr, "/");
    inputs(next);
    for (const std::string& file : {dir.file("config/recording.txt"), dir.file("other.txt")}) {
        fs::rename(file, dir.file("recording.txt"));
        read_recording_settings(next, dir.path().string());
        EXPECT_EQ(next.directory, dir.path().string());
        EXPECT_EQ(next.chosen_input_name(), "Line In");
        EXPECT_EQ(next.recorder.samplermode.load(), 2);
        EXPECT_EQ(next.recorder.vrvol.load(), 300);
    }
}

TEST_F(RecordingTest, TheAnalysersMenusSetItsSourceAndView) {
    run("FTv1");
    run("wfft");
    EXPECT_TRUE(p.windows.analyser);
    EXPECT_EQ(p.analyser.view(), kViewClassic) << "opening starts with the Classic view";
    EXPECT_EQ(p.engine.mixer.f_fftmode.load(), kAnalyseSong) << "and shows something at once";
    run("FFTi");
    EXPECT_EQ(p.engine.mixer.f_fftmode.load(), kAnalyseInput);
    run("FFTs");
    run("FTv1");
    run("PLsg");
    play(44100 / 2);
    p.analyser.Draw(p.engine.mixer.Bufferfft1);
    const auto& px = p.analyser.pixels();
    EXPECT_NE(std::count(px.begin(), px.begin() + kAnalyserWidth, 0u), kAnalyserWidth) << "a black radar row";
}

}  // namespace
}  // namespace ondrel
