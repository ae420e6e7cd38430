#pragma once
// The program driven as its window drives it: a message posted, then the queue run.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "shell/program.h"
#include "support/temp_dir.h"

namespace ondrel::test {

// A command's code from its four letters, which need not be a literal.
inline uint32_t code_of(const char* text) {
    return uint32_t(uint8_t(text[0])) << 24 | uint32_t(uint8_t(text[1])) << 16 |
           uint32_t(uint8_t(text[2])) << 8 | uint32_t(uint8_t(text[3]));
}

inline void run(Program& p, ShellMessage m) {
    p.post(std::move(m));
    p.run_pending();
}
inline void run(Program& p, const char* code) {
    run(p, ShellMessage(code_of(code)));
}

// Files opened the way a drop on the window opens them.
inline void open_files(Program& p, std::vector<std::string> paths) {
    ShellMessage m(fourcc("refs"));
    m.refs = std::move(paths);
    run(p, std::move(m));
}

class ProgramFixture : public ::testing::Test {
protected:
    void run(const char* code) { test::run(p, code); }
    void set(const char* code, int64_t value) {
        test::run(p, ShellMessage(code_of(code)).with("value", value));
    }
    void open(std::vector<std::string> paths) { open_files(p, std::move(paths)); }

    TempDir dir;  // outlives the program, which may still remove a file of its own in it
    Program p;
};

}  // namespace ondrel::test
