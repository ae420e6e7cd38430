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
#include "import/loader.h"
#include "import/sound_reader.h"
#include "support/fake_audio_device.h"

namespace ondrel {
namespace {

using test::FakeDevice;

TEST(AudioThreadStress, EverythingAUserDoesWhileTheCallbackRuns) {
    const std::string song = ONDREL_DEMO_SONG;
    const std::string wav = "tests/import/cases/wav-16bit-96khz.wav";
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
            case 10:  // routes tracks through the units, the reverbs and echoes included
                for (int i = 0; i < 4; ++i) engine.rack.mnplusefx(static_cast<int>(rng() % 8));
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
