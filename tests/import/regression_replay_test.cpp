// The regression corpus: damaged and hostile files (fuzzing findings in
// tests/import/regression/, files found by fuzzing other players in the shared corpus) and
// the format cases of tests/import/cases/.
// Every reader reads every file, with an outcome as reviewed in
// tests/import/regression/expected.txt, and each file's own reader reads every truncation
// of it. Nothing may read outside the bytes (the sanitizer builds watch) nor hand the
// player a record out of its bounds. With ONDREL_UPDATE_EXPECTED set, the outcomes are
// written instead (review them).
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>

#include "import/module_reader.h"
#include "import/sound_reader.h"
#include "support/temp_dir.h"

namespace ondrel {
namespace {

namespace fs = std::filesystem;

void expect_bounded(const p_s& s, const std::string& where) {
    SCOPED_TRACE(where);
    EXPECT_LE(s.length, kMaxSampleBytes);
    EXPECT_TRUE(s.length == 0 || s.data);
    EXPECT_LE(s.loopend, s.length);
    EXPECT_LE(s.loopstart, s.length);
    EXPECT_TRUE(!s.loopon || s.loopstart <= s.loopend);
    EXPECT_TRUE(s.bits == 8 || s.bits == 16);
    EXPECT_EQ(s.framecode, frame_code(s.bits, s.stereo));
}

// Reads bytes with one reader; returns its outcome in one line.
std::string outcome(const std::string& reader, const std::vector<uint8_t>& bytes, const std::string& where) {
    static const std::pair<const char*, ModuleReaderFn> modules[] = {
        {"otm", read_otm}, {"mod", read_mod}, {"s3m", read_s3m}, {"mtm", read_mtm}};
    static const std::pair<const char*, SoundKind> sounds[] = {{"avr", SoundKind::Avr},
                                                               {"aiff", SoundKind::Aiff},
                                                               {"wav", SoundKind::Wav},
                                                               {"aif", SoundKind::FixedHeader}};
    ByteReader file(bytes);
    std::ostringstream o;
    for (const auto& [name, read] : modules) {
        if (reader != name) continue;
        ModuleRead out;
        if (!read(file, out)) return "refused";
        const TMOD& m = *out.song.mod;
        EXPECT_GE(m.nbtrack, 1) << where;
        EXPECT_LE(m.nbtrack, kTracks) << where;
        int patterns = 0, samples = 0;
        uint64_t bytes_read = 0;
        for (int p = 0; p < kPatternsPerSong; ++p) {
            EXPECT_GE(m.rows[p], 1) << where;
            EXPECT_LE(m.rows[p], kMaxRows) << where;
            patterns += out.song.patterns[p] != nullptr;
        }
        for (const SampleRef& s : out.song.samples)
            if (s) {
                expect_bounded(*s, where);
                ++samples;
                bytes_read += s->length;
            }
        o << (out.truncated ? "cut" : "whole") << " tracks " << int(m.nbtrack) << " positions "
          << int(m.nbpos) << " patterns " << patterns << " samples " << samples << " bytes " << bytes_read;
        return o.str();
    }
    for (const auto& [name, kind] : sounds) {
        if (reader != name) continue;
        SampleRef s;
        std::string why;
        if (!read_sound(file, kind, "/regression/x", "x", s, why)) return "refused";
        expect_bounded(*s, where);
        o << "bits " << s->bits << " stereo " << int(s->stereo) << " bytes " << s->length << " loop "
          << s->loopon << " " << s->loopstart << ".." << s->loopend;
        return o.str();
    }
    return "no such reader";
}

std::vector<fs::path> inputs() {
    std::vector<fs::path> files;
    for (const char* dir : {"tests/import/cases", "tests/import/regression", "../shared/corpus/malformed"})
        if (fs::exists(dir))
            for (const auto& e : fs::directory_iterator(dir))
                if (e.path().filename() != "expected.txt" && e.path().extension() != ".md")
                    files.push_back(e.path());
    std::sort(files.begin(), files.end(),
              [](const fs::path& a, const fs::path& b) { return a.filename() < b.filename(); });
    return files;
}

const char* const kReaders[] = {"otm", "mod", "s3m", "mtm", "avr", "aiff", "wav", "aif"};

TEST(RegressionReplay, EveryReaderReadsEveryFileAsReviewed) {
    const fs::path expected_path = "tests/import/regression/expected.txt";
    std::map<std::string, std::string> expected;
    std::ifstream in(expected_path);
    for (std::string line; std::getline(in, line);)
        if (const size_t colon = line.find(": "); colon != std::string::npos && line[0] != '#')
            expected[line.substr(0, colon)] = line.substr(colon + 2);
    std::ostringstream written;
    written << "# input reader: outcome of reading the whole file\n";
    int compared = 0;
    for (const fs::path& path : inputs()) {
        const std::vector<uint8_t> bytes = test::read_all(path.string());
        for (const char* reader : kReaders) {
            const std::string key = path.filename().string() + " " + reader;
            const std::string got = outcome(reader, bytes, key);
            written << key << ": " << got << "\n";
            if (std::getenv("ONDREL_UPDATE_EXPECTED")) continue;
            const auto want = expected.find(key);
            if (want == expected.end()) {
                if (path.parent_path().filename() == "malformed")
                    std::cout << "not reviewed yet: " << key << "\n";
                else
                    ADD_FAILURE() << key << " is not in " << expected_path;
                continue;
            }
            EXPECT_EQ(got, want->second) << key;
            ++compared;
        }
    }
    if (std::getenv("ONDREL_UPDATE_EXPECTED"))
        std::ofstream(expected_path) << written.str();
    else
        EXPECT_GT(compared, 0);
}

TEST(RegressionReplay, EveryTruncationStaysInBounds) {
    for (const fs::path& path : inputs()) {
        std::string reader = path.extension().string().substr(1);
        std::transform(reader.begin(), reader.end(), reader.begin(), ::tolower);
        const std::vector<uint8_t> whole = test::read_all(path.string());
        // Every cut in the headers, then about a hundred across the rest.
        const size_t step = std::max<size_t>(1, whole.size() / 100);
        for (size_t n = 0; n < whole.size(); n += n < 256 ? 1 : step) {
            // An exactly sized copy, so that a read past the end trips the sanitizer.
            const std::vector<uint8_t> part(whole.begin(), whole.begin() + static_cast<long>(n));
            outcome(reader, part, path.filename().string() + " cut at " + std::to_string(n));
            if (HasFailure()) return;
        }
    }
}

}  // namespace
}  // namespace ondrel
