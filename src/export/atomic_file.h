#pragma once
#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

namespace ondrel {

// A file written under a temporary name beside its target and renamed over the target
// on commit, so a failed save never destroys the file the user had.
class ReplacingFile {
public:
    ReplacingFile() = default;
    ~ReplacingFile() { abandon(); }
    ReplacingFile(const ReplacingFile&) = delete;
    ReplacingFile& operator=(const ReplacingFile&) = delete;

    bool open(const std::string& path, std::string& why);
    std::FILE* stream() const { return file_; }
    // Flushes, syncs and renames; false with why set (the target is then untouched).
    bool commit(std::string& why);
    void abandon();

private:
    std::FILE* file_ = nullptr;
    std::string path_, temp_;
};

bool write_file_atomically(const std::string& path, const std::vector<uint8_t>& bytes, std::string& why);

}  // namespace ondrel
