#pragma once
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace ondrel {

// Every file the program writes goes through here, so the same rules hold for songs,
// sounds, renders, MIDI files, recordings and settings:
// - a regular file (or a new one) is written under a temporary name beside it and renamed
//   over it on commit, keeping its permissions; a file the user may not write is refused;
// - through a symbolic link, the file the link leads to is written that way; the link stays;
// - "-" (standard output), a FIFO, a device or a socket is written in place, streaming;
// - the first write error is kept and every later call fails: the temporary file is removed
//   and the previous file stays as it was.
// Not thread-safe: one thread writes one file (a recorder's writer thread owns its file).
class OutputFile {
public:
    OutputFile() = default;
    ~OutputFile() { abandon(); }
    OutputFile(const OutputFile&) = delete;
    OutputFile& operator=(const OutputFile&) = delete;

    // False with why set ("cannot write PATH: reason") when the destination cannot be used.
    bool open(const std::string& path, std::string& why);
    bool is_open() const { return fd_ >= 0; }

    // Buffered; false once any write has failed (see error()).
    bool write(const void* data, size_t bytes);
    // True when bytes already written can be rewritten (a regular file, or standard output
    // redirected to one without appending); a stream can only go forward.
    bool seekable() const { return seekable_; }
    // Overwrites bytes at an offset from the start of what this file wrote (a header
    // patched when a recording stops); false on a stream or after an error.
    bool rewrite(uint64_t offset, const void* data, size_t bytes);
    // After a failed write, only what reached the destination.
    uint64_t bytes_written() const { return written_ + buffered_; }
    // Keeps the first length bytes of what reached the file and forgets a write error, so
    // that what was written before a failure (a disk that filled up) can still be finished
    // and committed; false on a stream, or when length is more than was written.
    bool keep_first(uint64_t length);

    // Flushes everything and puts the file in place; false with why set, and then a regular
    // target is left as it was.
    bool commit(std::string& why);
    // Drops what was written: removes the temporary file, leaves the target as it was.
    void abandon();

    // The first failure, as one line; empty while all is well.
    const std::string& error() const { return error_; }
    // Its errno (an open refused for the file's permissions counts as EACCES); 0 when none.
    int error_number() const { return error_number_; }

private:
    bool open_replacement(const std::string& target, std::string& why);
    bool open_in_place(const std::string& target, bool is_stdout, std::string& why);
    bool flush();
    bool fail(const std::string& what, int err);
    void close_fd();

    int fd_ = -1;
    bool owns_fd_ = false;  // false for standard output, which stays open
    bool seekable_ = false;
    uint64_t base_ = 0;     // offset of our first byte in the file (standard output)
    uint64_t written_ = 0;  // bytes handed to the system
    size_t buffered_ = 0;
    std::vector<uint8_t> buffer_;
    std::string shown_;   // the path as the user gave it, for messages
    std::string target_;  // the file the rename lands on
    std::string temp_;    // our temporary file, while there is one
    std::string error_;
    int error_number_ = 0;
};

// Writes a whole file by the rules above; false with why set.
bool write_output_file(const std::string& path, const std::vector<uint8_t>& bytes, std::string& why);

}  // namespace ondrel
