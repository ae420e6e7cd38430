// The desktop window's cost: CPU time per frame with a 32-track pattern on screen (software
// renderer, 1280x800), how long a frame holds the audio lock, and the audio callback's
// load with the window drawing as fast as it can against the window idle. Needs a display:
// run it under xvfb-run (scripts/bench.sh does).
#include <time.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <mutex>
#include <thread>
#include <vector>

#include "platform/sdl_audio_output.h"
#include "shell/gui/gui_host.h"
#include "shell/gui/main_window.h"
#include "shell/program.h"

namespace {

using namespace ondrel;

double thread_cpu_us() {
    timespec t{};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &t);
    return double(t.tv_sec) * 1e6 + double(t.tv_nsec) / 1e3;
}

void fill_song(Program& p) {
    p.edit("bench song", [](SongTransaction& t) {
        TMOD& m = t.record();
        m.nbtrack = 32;
        auto pattern = make_pattern(32, m.rows[0]);
        for (int track = 0; track < 32; ++track)
            for (int row = 0; row < pattern->nrows; row += 2)
                pattern->col[track][row] = TNOTE{
                    uint8_t(48 + (row + track) % 24), uint8_t(row % 3 ? 64 : 0), 0,
                    uint8_t(1 + track % 8),           uint8_t(row % 4 ? 0 : 12), uint8_t(row % 4 ? 0 : 40)};
        t.set_pattern(0, std::move(pattern));
    });
    p.engine.bank.nbvoie = 32;
}

struct Figures {
    double median_us, p95_us;
};

Figures measure_frames(GuiHost& host, Program& p, MainWindow& window, int frames) {
    std::vector<double> cost;
    for (int i = 0; i < frames; ++i) {
        const double start = thread_cpu_us();
        host.frame(p, window);
        cost.push_back(thread_cpu_us() - start);
    }
    std::sort(cost.begin(), cost.end());
    return {cost[cost.size() / 2], cost[cost.size() * 95 / 100]};
}

double average_load(Program& p, const std::function<void()>& meanwhile, double seconds) {
    double sum = 0;
    int n = 0;
    const auto end = std::chrono::steady_clock::now() + std::chrono::duration<double>(seconds);
    while (std::chrono::steady_clock::now() < end) {
        meanwhile();
        sum += p.engine.mixer.powermusic.load();
        ++n;
    }
    return n ? sum / n : 0;
}

}  // namespace

int main() {
    setenv("ONDREL_RENDERER", "software", 0);
    setenv("SDL_AUDIODRIVER", "dummy", 0);
    Program program;
    fill_song(program);
    GuiHost host;
    std::string why;
    if (!host.open(why)) {
        std::fprintf(stderr, "gui_frame_bench: %s (run it under xvfb-run)\n", why.c_str());
        return 2;
    }
    SdlAudioOutput audio(program.engine.mixer, program.engine.player, program.engine.bank);
    const bool sound = audio.open(512, why);
    MainWindow window(program, host.renderer());
    measure_frames(host, program, window, 30);  // fonts, first layouts

    const Figures still = measure_frames(host, program, window, 300);
    program.post(fourcc("PLsg"));
    const Figures playing = measure_frames(host, program, window, 300);
    std::printf("renderer: %s\n", host.renderer_name());
    std::printf("frame CPU, 32 tracks on screen, stopped: median %.0f us, 95%% %.0f us\n", still.median_us,
                still.p95_us);
    std::printf("frame CPU, 32 tracks on screen, playing: median %.0f us, 95%% %.0f us\n", playing.median_us,
                playing.p95_us);

    // What a frame holds the audio lock for: one copy of the song record.
    std::vector<double> held;
    TMOD copy;
    for (int i = 0; i < 2000; ++i) {
        const auto start = std::chrono::steady_clock::now();
        {
            std::lock_guard<StructureLock> guard(program.engine.bank.structure_lock());
            std::memcpy(static_cast<void*>(&copy), &program.engine.bank.current(), sizeof copy);
        }
        held.push_back(
            std::chrono::duration<double, std::micro>(std::chrono::steady_clock::now() - start).count());
    }
    std::sort(held.begin(), held.end());
    std::printf("audio lock held per frame: median %.2f us, max %.2f us\n", held[held.size() / 2],
                held.back());

    if (sound) {
        const double idle = average_load(
            program, [] { std::this_thread::sleep_for(std::chrono::milliseconds(5)); }, 2);
        const double busy = average_load(
            program, [&] { host.frame(program, window); }, 2);
        std::printf("audio callback load while playing (%s): window idle %.3f%%, window drawing %.3f%%\n",
                    audio.driver(), idle * 100, busy * 100);
    }
    audio.close();
    return 0;
}
