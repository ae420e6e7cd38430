// The render callback on its own thread, as the sound card runs it, while the window
// thread does everything a user can: load, kill and create songs, replace sounds, edit
// cells, route tracks, start and stop. Built with ThreadSanitizer it must stay silent.
#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <filesystem>
#include <mutex>
#include <random>
#include <thread>

#include "engine/engine.h"
#include "export/otm_writer.h"
#include "export/wav_writer.h"
#include "import/loader.h"
#include "import/sound_reader.h"
#include "support/fake_audio_device.h"
#include "support/temp_dir.h"

namespace ondrel {
namespace {

using test::FakeDevice;

// A song with samples, notes, effect routing and commands in every track, saved to path.
void write_song(const std::string& path) {
    Engine e;
    TMOD& m = e.bank.current();
    m.nbtrack = 8;
    for (int i = 0; i < 4; ++i) {
        SampleRef s = make_sample(6000);
        for (uint32_t b = 0; b < 6000; ++b) s->data[b] = static_cast<uint8_t>(b * (i + 3));
        s->bits = i % 2 ? 16 : 8;
        s->framecode = s->bits == 16 ? 1 : 0;
        s->rate = 22050;
        s->volume = 100;
        s->loopon = i != 3;
        s->loopstart = 1000;
        s->loopend = 6000;
        s->flagword = i == 2 ? 31 : 0;
        e.bank.t_sound[static_cast<size_t>(i)] = std::move(s);
    }
    e.bank.Gofree(m.patbase);
    e.bank.patcreate(m.patbase, 8);
    Pattern* p = e.bank.song_pattern(0);
    for (int r = 0; r < 64; ++r)
        for (int t = 0; t < 8; ++t)
            if ((r + t) % 3 == 0)
                p->col[t][r] = {static_cast<uint8_t>(36 + (r * 7 + t) % 40),
                                0,
                                0,
                                static_cast<uint8_t>(1 + t % 4),
                                static_cast<uint8_t>(t == 5 ? 33 : (r % 16)),
                                static_cast<uint8_t>(t == 5 ? 11 : r)};
    m.tracke[2] = 10;
    m.tracke[3] = 16;
    std::string why;
    ASSERT_TRUE(save_otm(path, e.bank, 0, e.slots, why)) << why;
}

TEST(AudioThreadStress, EverythingAUserDoesWhileTheCallbackRuns) {
    test::TempDir dir;
    const std::string song = dir.file("stress.otm");
    write_song(song);
    const std::string wav = dir.file("hit.wav");
    {
        WavWriter w;
        std::string why;
        ASSERT_TRUE(w.open(wav, 1, 22050, WavSampleFormat::Pcm16, why));
        std::vector<float> tone(3000);
        for (size_t i = 0; i < tone.size(); ++i) tone[i] = static_cast<float>((i % 50) / 50.0 - 0.5);
        w.write(tone.data(), tone.size());
        ASSERT_TRUE(w.finish(why));
    }
    const std::string mod = "../shared/corpus/mod/crystals.mod";

    Engine engine;
    ASSERT_TRUE(load(song, engine.bank, engine.slots).ok);
    FakeDevice device(engine);
    device.start();
    std::mt19937 rng(42);
    const auto until = std::chrono::steady_clock::now() + std::chrono::milliseconds(1500);
    int operations = 0;
    while (std::chrono::steady_clock::now() < until) {
        ++operations;
        switch (rng() % 12) {
            case 0: load(song, engine.bank, engine.slots); break;
            case 1:
                if (std::filesystem::exists(mod)) load(mod, engine.bank, engine.slots);
                break;
            case 2:
                engine.bank.fmulload = 1;
                load(song, engine.bank, engine.slots);
                engine.bank.fmulload = 0;
                break;
            case 3:
                if (engine.bank.nbimod > 1 || rng() % 2) engine.bank.killmusic();
                break;
            case 4:
                if (engine.bank.nbimod < 10) engine.bank.newmusic();
                break;
            case 5: loadsnd(wav, "audio/x-wav", engine.bank, static_cast<int>(rng() % 6)); break;
            case 6: {
                std::lock_guard<StructureLock> guard(engine.bank.structure_lock());
                if (Pattern* p = engine.bank.song_pattern(engine.bank.current().sequence[0]))
                    if (p->col[0]) p->col[0][rng() % p->nrows] = {48, 64, 0, 1, 4, 0x33};
                break;
            }
            case 7: engine.player.start(rng() % 2); break;
            case 8: engine.player.stoppi(); break;
            case 9:
                engine.mixer.qual = static_cast<int16_t>(rng() % 2);
                engine.mixer.valpitch = static_cast<int16_t>(96 + rng() % 64);
                engine.mixer.mute[rng() % 8] = static_cast<uint8_t>(rng() % 2);
                break;
            case 10:
                engine.rack.mnplusefx(static_cast<int>(rng() % 8));
                if (rng() % 3 == 0) engine.rack.remove(engine.rack.clone(11));
                break;
            case 11: engine.player.audition_note({60, 0, 0, 1, 0, 0}, static_cast<int>(rng() % 8)); break;
        }
        std::this_thread::sleep_for(std::chrono::microseconds(500));
    }
    engine.player.stoppi();
    device.stop();
    EXPECT_GT(device.buffers.load(), 100);
    EXPECT_GT(operations, 100);
}

}  // namespace
}  // namespace ondrel
