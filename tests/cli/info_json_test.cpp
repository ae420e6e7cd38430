// `ondrel info --json` of the corpus modules and sounds, of the format cases and of the
// demo song, each against one reviewed expected file in tests/cli/expected/. With
// ONDREL_UPDATE_EXPECTED set, the expected files are written instead (review them).
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <sstream>

#include "cli/commands.h"

namespace ondrel {
namespace {

namespace fs = std::filesystem;

// One line per top-level field, per pattern and per sample, so that expected files read
// and compare line by line.
std::string by_lines(const std::string& json) {
    std::string out;
    int depth = 0;
    bool in_string = false;
    for (size_t i = 0; i < json.size(); ++i) {
        const char c = json[i];
        if (!in_string && (c == '"' || c == '{') && depth >= 1 && depth <= 2 &&
            std::string(",{[").find(json[i - 1]) != std::string::npos)
            out += '\n';
        out += c;
        if (in_string && c == '\\') {
            out += json[++i];
        } else if (c == '"') {
            in_string = !in_string;
        } else if (!in_string) {
            depth += (c == '{' || c == '[') - (c == '}' || c == ']');
        }
    }
    return out;
}

std::string info_json(const std::string& path) {
    std::ostringstream out, err;
    std::streambuf* old_out = std::cout.rdbuf(out.rdbuf());
    std::streambuf* old_err = std::cerr.rdbuf(err.rdbuf());
    const int code = cmd_info({"--json", path});
    std::cout.rdbuf(old_out);
    std::cerr.rdbuf(old_err);
    EXPECT_EQ(code, 0) << path << ": " << err.str();
    return by_lines(out.str());
}

// Compares with expected line by line; reports the first difference.
void expect_as_reviewed(const std::string& path, const fs::path& expected) {
    SCOPED_TRACE(path);
    const std::string actual = info_json(path);
    if (std::getenv("ONDREL_UPDATE_EXPECTED")) {
        std::ofstream(expected) << actual;
        return;
    }
    std::ifstream in(expected);
    std::istringstream got(actual);
    std::string want_line, got_line;
    for (int line = 1; std::getline(in, want_line); ++line) {
        if (!std::getline(got, got_line)) got_line = "(end)";
        if (want_line == got_line) continue;
        size_t at = 0;
        while (at < want_line.size() && at < got_line.size() && want_line[at] == got_line[at]) ++at;
        const size_t from = at > 60 ? at - 60 : 0;
        FAIL() << expected << " line " << line << " column " << at + 1 << "\n  expected ..."
               << want_line.substr(from, 140) << "\n  actual   ..." << got_line.substr(from, 140);
    }
    EXPECT_FALSE(std::getline(got, got_line)) << expected << " ends before the output: " << got_line;
}

// Each expected file NAME.json names its source: the format case NAME (built byte by byte,
// see tests/import/cases/README.md), the demo song, or a file NAME of the shared corpus.
TEST(InfoJson, EveryFileReadsAsReviewed) {
    const fs::path cases = "tests/import/cases", corpus = "../shared/corpus";
    int compared = 0;
    for (const auto& e : fs::directory_iterator("tests/cli/expected")) {
        const std::string name = e.path().stem().string();
        fs::path source = cases / name;
        if (name == "demo.otm") source = ONDREL_DEMO_SONG;
        for (const char* folder : {"mod", "s3m", "mtm", "sound"})
            if (!fs::exists(source)) source = corpus / folder / name;
        if (!fs::exists(source)) {
            std::cout << "skipped: " << name << " is not in " << corpus << "\n";
            continue;
        }
        expect_as_reviewed(source.string(), e.path());
        ++compared;
    }
    EXPECT_GE(compared, 15);  // the format cases and the demo song at least
}

}  // namespace
}  // namespace ondrel
