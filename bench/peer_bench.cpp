// Renders every corpus module to memory with our engine ("Interpolation" on) and, in the
// same run, with two other players used only as yardsticks (linear interpolation both),
// and prints each one's speed in times real time, median of several runs.
#include <libopenmpt/libopenmpt.h>
#include <xmp.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "engine/engine.h"
#include "import/loader.h"
#include "render/offline_render.h"

namespace {

using Clock = std::chrono::steady_clock;
constexpr int kRate = 44100;
constexpr int kFrames = 1024;
constexpr double kMaxSeconds = 600;

struct Run {
    double audio_seconds = 0;
    double work_seconds = 0;
    double x() const { return work_seconds > 0 ? audio_seconds / work_seconds : 0; }
};

// One timed render of a song: audio seconds made and seconds spent.
using RenderOnce = std::function<Run()>;

// Renders again and again until enough work is timed for the clock to measure a short
// song as well as a long one.
Run repeated(const RenderOnce& once) {
    constexpr double kMinWorkSeconds = 0.05;
    Run total;
    do {
        const Run r = once();
        if (r.audio_seconds <= 0) return total;
        total.audio_seconds += r.audio_seconds;
        total.work_seconds += r.work_seconds;
    } while (total.work_seconds < kMinWorkSeconds);
    return total;
}

// The players take turns run by run, so that a slow spell of a shared machine falls on
// all of them alike; each one's median run.
std::vector<Run> medians_of(int runs, const std::vector<RenderOnce>& players) {
    std::vector<std::vector<Run>> all(players.size());
    for (int i = 0; i < runs; ++i)
        for (size_t p = 0; p < players.size(); ++p) all[p].push_back(repeated(players[p]));
    std::vector<Run> medians;
    for (auto& runs_of_one : all) {
        std::sort(runs_of_one.begin(), runs_of_one.end(),
                  [](const Run& a, const Run& b) { return a.x() < b.x(); });
        medians.push_back(runs_of_one[runs_of_one.size() / 2]);
    }
    return medians;
}

// Each player loads its module once (not timed), then renders it from the start as often
// as asked, as someone playing a song again would.

class Ours {
public:
    explicit Ours(const std::string& path) : path_(path) {}
    Run render() {
        Run r;
        // Playing leaves the song where it ended (its position, speed and tempo, voices still
        // sounding): a fresh load, not timed, so that each run renders the song from its start.
        auto engine = std::make_unique<ondrel::Engine>();
        if (!ondrel::load(path_, engine->bank, engine->slots).ok) return r;
        engine->mixer.qual = 1;
        uint64_t frames = 0;
        const auto start = Clock::now();
        ondrel::render_offline(engine->mixer, engine->player, {kFrames, kMaxSeconds},
                               [&](const float*, int n, double) {
                                   frames += static_cast<uint64_t>(n);
                                   return true;
                               });
        r.work_seconds = std::chrono::duration<double>(Clock::now() - start).count();
        r.audio_seconds = static_cast<double>(frames) / kRate;
        return r;
    }

private:
    std::string path_;
};

class Openmpt {
public:
    explicit Openmpt(const std::vector<char>& data)
        : mod_(openmpt_module_create_from_memory2(data.data(), data.size(), nullptr, nullptr, nullptr,
                                                  nullptr, nullptr, nullptr, nullptr)) {
        if (mod_) openmpt_module_set_render_param(mod_, OPENMPT_MODULE_RENDER_INTERPOLATIONFILTER_LENGTH, 2);
    }
    ~Openmpt() {
        if (mod_) openmpt_module_destroy(mod_);
    }
    Run render() {
        Run r;
        if (!mod_) return r;
        openmpt_module_set_position_seconds(mod_, 0.0);
        uint64_t frames = 0;
        const auto start = Clock::now();
        while (frames < kMaxSeconds * kRate) {
            const size_t n =
                openmpt_module_read_interleaved_float_stereo(mod_, kRate, kFrames, buffer_.data());
            if (n == 0) break;
            frames += n;
        }
        r.work_seconds = std::chrono::duration<double>(Clock::now() - start).count();
        r.audio_seconds = static_cast<double>(frames) / kRate;
        return r;
    }

private:
    openmpt_module* mod_;
    std::vector<float> buffer_ = std::vector<float>(2 * kFrames);
};

class Xmp {
public:
    explicit Xmp(const std::vector<char>& data) : ctx_(xmp_create_context()) {
        ok_ = xmp_load_module_from_memory(ctx_, data.data(), static_cast<long>(data.size())) == 0;
    }
    ~Xmp() {
        if (ok_) xmp_release_module(ctx_);
        xmp_free_context(ctx_);
    }
    Run render() {
        Run r;
        if (!ok_) return r;
        xmp_start_player(ctx_, kRate, 0);
        xmp_set_player(ctx_, XMP_PLAYER_INTERP, XMP_INTERP_LINEAR);
        uint64_t frames = 0;
        const auto start = Clock::now();
        while (frames < kMaxSeconds * kRate) {
            if (xmp_play_buffer(ctx_, buffer_.data(), static_cast<int>(buffer_.size() * 2), 1) != 0) break;
            frames += kFrames;
        }
        r.work_seconds = std::chrono::duration<double>(Clock::now() - start).count();
        r.audio_seconds = static_cast<double>(frames) / kRate;
        xmp_end_player(ctx_);
        return r;
    }

private:
    xmp_context ctx_;
    bool ok_ = false;
    std::vector<int16_t> buffer_ = std::vector<int16_t>(2 * kFrames);
};

}  // namespace

int main(int argc, char** argv) {
    std::string corpus = "../shared/corpus";
    int runs = 5;
    bool ours_only = false;  // for profiling our side alone
    for (int i = 1; i < argc; ++i) {
        if (!std::strcmp(argv[i], "--ours-only"))
            ours_only = true;
        else if (!std::strcmp(argv[i], "--runs") && i + 1 < argc)
            runs = std::max(1, std::atoi(argv[++i]));
        else if (!std::strcmp(argv[i], "--corpus") && i + 1 < argc)
            corpus = argv[++i];
        else {
            std::fprintf(stderr, "usage: bench_peers [--runs N] [--corpus DIR] [--ours-only]\n");
            return 2;
        }
    }
    std::vector<std::filesystem::path> files;
    for (const char* folder : {"mod", "s3m", "mtm"}) {
        const auto dir = std::filesystem::path(corpus) / folder;
        if (!std::filesystem::exists(dir)) continue;
        for (const auto& e : std::filesystem::directory_iterator(dir)) files.push_back(e.path());
    }
    std::sort(files.begin(), files.end());
    if (files.empty()) {
        std::fprintf(stderr, "bench_peers: no modules under %s\n", corpus.c_str());
        return 1;
    }
    std::printf("%-36s %8s %9s %9s %9s %8s %8s\n", "module", "song s", "ours x", "openmpt x", "xmp x",
                "/openmpt", "/xmp");
    double worst = 1e9;
    for (const auto& path : files) {
        std::ifstream in(path, std::ios::binary);
        std::vector<char> data((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
        Ours ours(path.string());
        // A first render of each, not counted, warms them alike.
        const double song_seconds = ours.render().audio_seconds;
        if (song_seconds <= 0) {  // a file our loader refuses (another format under a .mod name)
            std::printf("%-36s refused by our loader, left out\n", path.filename().string().c_str());
            continue;
        }
        if (ours_only) {
            std::printf("%-36s %8.1f %9.0f\n", path.filename().string().c_str(), song_seconds,
                        medians_of(runs, {[&] { return ours.render(); }})[0].x());
            continue;
        }
        Openmpt openmpt(data);
        Xmp xmp(data);
        openmpt.render();
        xmp.render();
        const std::vector<Run> m = medians_of(
            runs,
            {[&] { return ours.render(); }, [&] { return openmpt.render(); }, [&] { return xmp.render(); }});
        const Run &a = m[0], &b = m[1], &c = m[2];
        const double vs_openmpt = b.x() > 0 ? a.x() / b.x() : 0;
        const double vs_xmp = c.x() > 0 ? a.x() / c.x() : 0;
        const double fastest_peer = std::max(b.x(), c.x());
        if (fastest_peer > 0) worst = std::min(worst, a.x() / fastest_peer);
        std::printf("%-36s %8.1f %9.0f %9.0f %9.0f %8.2f %8.2f\n", path.filename().string().c_str(),
                    song_seconds, a.x(), b.x(), c.x(), vs_openmpt, vs_xmp);
    }
    std::printf("\nslowest ratio of ours to the faster peer: %.2f\n", worst);
    return 0;
}
