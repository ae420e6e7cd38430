// Every module of the corpus, damaged ones included, renders through the mixer without
// reading outside its samples (the sanitizer builds watch), and the sound ones are heard.
#include <gtest/gtest.h>

#include <cmath>
#include <filesystem>
#include <set>
#include <string>

#include "engine/engine.h"
#include "import/loader.h"
#include "render/offline_render.h"

namespace ondrel {
namespace {

TEST(CorpusRender, EveryModulePlaysItsFirstSeconds) {
    const std::filesystem::path corpus = "../shared/corpus";
    if (!std::filesystem::exists(corpus)) GTEST_SKIP() << corpus << " is not here";
    int rendered = 0;
    for (const char* folder : {"mod", "s3m", "mtm", "malformed"}) {
        if (!std::filesystem::exists(corpus / folder)) continue;
        for (const auto& entry : std::filesystem::directory_iterator(corpus / folder)) {
            for (int quality = 0; quality < 2; ++quality) {
                Engine engine;
                if (!load(entry.path().string(), engine.bank, engine.slots).ok) continue;
                engine.mixer.qual = static_cast<int16_t>(quality);
                double peak = 0;
                render_offline(engine.mixer, engine.player, {1024, 4.0}, [&](const float* f, int n, double) {
                    for (int i = 0; i < 2 * n; ++i) {
                        EXPECT_TRUE(std::isfinite(f[i]));
                        peak = std::max(peak, static_cast<double>(std::fabs(f[i])));
                    }
                    return true;
                });
                EXPECT_LE(peak, 1.0) << entry.path();
                // zob-the-zob carries no sample data; the others have signatures ("FEST",
                // "CD61", "TDZ3") that the MOD family does not know, so they read as
                // 15-sample files and their sounds are not where such a file has them.
                static const std::set<std::string> kNotHeard = {"zob-the-zob.mod", "Gaffeltruck.mod",
                                                                "TDZ3.MOD", "pattern_loop_octalyser.mod",
                                                                "pattern_jump_octalyser_break.mod"};
                const std::string name = entry.path().filename().string();
                if (std::string(folder) != "malformed" && !kNotHeard.count(name)) {
                    EXPECT_GT(peak, 0.01) << entry.path() << " is silent";
                }
                ++rendered;
            }
        }
    }
    EXPECT_GT(rendered, 0);
}

}  // namespace
}  // namespace ondrel
