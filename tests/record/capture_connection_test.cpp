// The recorder fed by an input through the capture node.
#include "record/capture_connection.h"

#include "recorder_fixture.h"
#include "support/fake_capture_input.h"
#include "support/wait_until.h"

namespace ondrel::test {
namespace {

class CaptureConnectionTest : public RecorderFixture {
protected:
    FakeInput input;
    SoundConsumer node;
    CaptureConnection connection{node, &input, diagnostics};
    void SetUp() override { recorder.set_input(&connection); }
    // The recorder outlives the connection here: it must not reach for it when it goes.
    void TearDown() override { recorder.set_input(nullptr); }
};

TEST_F(CaptureConnectionTest, RecordsTheInputFromFiftyMillisecondsOn) {
    recorder.samplermode = 0;
    recorder.Record(kMsgReco);
    ASSERT_TRUE(connection.connected());
    input.play(ramp_frames(2205, 0));    // 50 ms from the start command: not recorded
    input.play(ramp_frames(441, 2205));  // from the start time on
    input.play(ramp_frames(441, 2646));
    ASSERT_TRUE(wait_until([&] { return recorder.bytes_recorded() == 2 * 441 * 2; }));
    RecordingResult r = recorder.StopRecording();
    EXPECT_FALSE(connection.connected());
    EXPECT_FALSE(input.is_open());
    ASSERT_TRUE(r.sound);
    EXPECT_EQ(r.sound->length, 2u * 441 * 2);
    // Mono: the left values from 2205 on with the low bit cleared; the header covers the
    // first of them.
    const auto* data = reinterpret_cast<const int16_t*>(r.sound->data);
    const size_t skipped = sizeof(p_s) / 2;
    EXPECT_EQ(data[0], static_cast<int16_t>((2205 + skipped) & ~1));
    EXPECT_EQ(data[1], static_cast<int16_t>((2205 + skipped + 1) & ~1));
}

TEST_F(CaptureConnectionTest, AnInputThatCannotBeOpenedIsPrintedAndAlerted) {
    input.refuse = true;
    recorder.Record(kMsgMoni);
    EXPECT_NE(printed().find(
                  "CaptureWindow::MakeRecordConnection(): couldn't get free outputs from audio input node\n"),
              std::string::npos);
    ASSERT_EQ(engine.alert_log.shown.size(), 1u);
    EXPECT_EQ(engine.alert_log.shown[0].text,
              "Cannot connect to the selected sound input: Input/output error.\n[5]");
    EXPECT_FALSE(connection.connected());
}

TEST(CaptureConnection, FourPortErrorsInARowStopTheRecording) {
    Engine engine;
    FakeInput input;
    auto port = std::make_unique<LocalPort>();
    LocalPort& raw = *port;
    SoundConsumer node("SoundConsumer", nullptr, nullptr, nullptr, std::move(port));
    CaptureConnection connection(node, &input, nullptr);
    Recorder recorder(engine.mixer, &engine.alert_log, &connection, nullptr);
    recorder.Record(kMsgReco);
    ASSERT_TRUE(connection.connected());
    Message m;
    EXPECT_FALSE(recorder.poll(m));
    testing::internal::CaptureStderr();
    raw.close();  // every read fails from now on
    EXPECT_TRUE(wait_until([&] { return recorder.poll(m); }));
    const std::string errors = testing::internal::GetCapturedStderr();
    EXPECT_EQ(m.code, kMsgStre);
    EXPECT_FALSE(node.serving());
    size_t lines = 0;
    for (size_t at = 0; (at = errors.find("SoundConsumer: error 0x00000009\n", at)) != std::string::npos;
         ++at)
        ++lines;
    EXPECT_EQ(lines, 4u);
    EXPECT_TRUE(recorder.StopRecording().stopped);
}

}  // namespace
}  // namespace ondrel::test
