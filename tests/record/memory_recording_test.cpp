// Recording into memory: the capture block becomes the current slot's sound.
#include <cstring>
#include <tuple>

#include "record/record_format.h"
#include "recorder_fixture.h"

namespace ondrel::test {
namespace {

class MemoryRecordingTest : public RecorderFixture {
protected:
    void SetUp() override { engine.mixer.frecmusic = 1; }
    void start_memory(int mode) {
        recorder.samplermode = static_cast<uint16_t>(mode);
        recorder.soundrecoutput = 0;
        recorder.Record(kMsgReco);
    }
};

TEST_F(MemoryRecordingTest, StopsItselfAtTheLimitAndBecomesTheSlotsSound) {
    struct Case {
        int mode;
        int16_t bits, framecode;
        uint8_t stereo;
    };
    const Case cases[] = {{0, 16, 1, 0}, {1, 16, 2, 1}, {2, 8, 0, 0}, {3, 8, 1, 1}};
    for (const auto& c : cases) {
        SCOPED_TRACE(c.mode);
        start_memory(c.mode);
        const size_t align = record_format(c.mode).block_align;
        // 4096-frame buffers until one finds the block full.
        const size_t per_buffer = 4096 * align;
        const size_t buffers_to_fill = (kRecordLimit + per_buffer - 1) / per_buffer;
        Message m;
        feed(buffers_to_fill * 4096, 4096);
        EXPECT_FALSE(recorder.poll(m)) << "not asked to stop before a buffer finds it full";
        feed(4096, 4096);
        ASSERT_TRUE(recorder.poll(m));
        EXPECT_EQ(m.code, kMsgStre);
        EXPECT_EQ(recorder.bytes_recorded(), buffers_to_fill * per_buffer)
            << "the full buffer stored nothing";

        RecordingResult r = recorder.StopRecording();
        ASSERT_TRUE(r.sound);
        const p_s& s = *r.sound;
        EXPECT_EQ(
            std::tie(s.length, s.rate, s.bits, s.stereo, s.framecode),
            std::make_tuple(uint32_t(buffers_to_fill * per_buffer), 44100u, c.bits, c.stereo, c.framecode));
        EXPECT_EQ(std::tie(s.loopon, s.loopstart, s.loopend, s.refnote, s.volume),
                  std::make_tuple(uint16_t{0}, 0u, s.length, int16_t{72}, int16_t{128}));
        // The header sits on the first bytes captured: the data begin that many bytes in.
        EXPECT_EQ(s.data, reinterpret_cast<const uint8_t*>(&s) + sizeof(p_s));
        const auto in = ramp_frames(sizeof(p_s) / align + 8,
                                    next_frame - static_cast<uint32_t>((buffers_to_fill + 1) * 4096));
        std::vector<uint8_t> first(in.size() * 2);
        first.resize(convert_frames(c.mode, false, 1.0, in.data(), in.size() / 2, first.data()));
        EXPECT_EQ(0, std::memcmp(s.data, first.data() + sizeof(p_s), first.size() - sizeof(p_s)));
        install_recorded_sound(engine.bank, 5, std::move(r.sound));
        EXPECT_EQ(engine.bank.song_sample(5)->length, buffers_to_fill * per_buffer);
    }
    const std::string text = printed();
    EXPECT_NE(text.find("len 708608   \n"), std::string::npos) << text;
    EXPECT_NE(text.find(" pointe sur \n"), std::string::npos);
}

TEST_F(MemoryRecordingTest, AStopBeforeAnySoundTakesNothing) {
    start_memory(1);
    const RecordingResult r = recorder.StopRecording();
    EXPECT_TRUE(r.stopped);
    EXPECT_FALSE(r.sound);
    EXPECT_EQ(printed(), "stoppe enreigstre\nstoppe enreigstre BREAK !!! \n");
}

TEST_F(MemoryRecordingTest, MonitoringFillsTheMixersRingAndTheMeters) {
    engine.mixer.frecmusic = 0;  // the input is what is monitored; it is fed by hand here
    recorder.Record(kMsgMoni);
    EXPECT_TRUE(recorder.isMonitoring());
    ASSERT_EQ(engine.alert_log.shown.size(), 1u) << "no input to connect";
    EXPECT_EQ(engine.alert_log.shown[0].text,
              "Cannot connect to the selected sound input: No such device.\n[13]");
    recorder.vrvol = 64;
    const std::vector<int16_t> frames = {8192, -32768, 100, 0};
    Recorder::RecordFile(&recorder, 0, frames.data(), frames.size() * 2, AudioFormat{});
    EXPECT_EQ(recorder.maxg, 2);  // 4096 / 2048
    EXPECT_EQ(recorder.maxd, 8);  // 16384 / 2048
    // The mixer reads from half way round the ring, where starting put it.
    engine.mixer.f_fftmode = 0;
    std::vector<float> out(2 * 4096);
    engine.mixer.BufferProc(nullptr, out.data(), out.size() * 4, AudioFormat{});
    EXPECT_FLOAT_EQ(out[0], 0.0f);
    const size_t at = 2 * (4096 - 2048);  // frame 2048 of the buffer reads ring value 0
    EXPECT_FLOAT_EQ(out[at], 4096 / 32768.0f);
    EXPECT_FLOAT_EQ(out[at + 1], -16384 / 32768.0f);
    EXPECT_FLOAT_EQ(out[at + 2], 50 / 32768.0f);
    recorder.StopRecording();
    EXPECT_FALSE(recorder.isMonitoring());
    EXPECT_NE(printed().find("lance vox !! \nCannot connect"), std::string::npos);
}

}  // namespace
}  // namespace ondrel::test
