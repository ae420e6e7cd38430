#pragma once
#include <cstddef>
#include <cstdint>
#include <string>

#include "export/output_file.h"

namespace ondrel {

// The file of a disk recording (filed2d), written by the program's output-file rules: a
// file is written beside the chosen one and put in place when the recording stops, so the
// file the user sees is always a whole WAV; standard output or a pipe gets the sound as it
// comes. Errors are errno values.
class RecordingFile {
public:
    int open(const std::string& path);
    bool is_open() const { return file_.is_open(); }
    // False for a stream, whose header cannot be written again at the end.
    bool seekable() const { return file_.seekable(); }
    int append(const uint8_t* data, size_t bytes);
    // After a failure, only the bytes that reached the file.
    uint64_t position() const { return file_.bytes_written(); }
    // Keeps the first length bytes (no more than reached the file), writes header at offset
    // 0 where the file allows it, and puts the file in place.
    int finish(uint64_t length, const uint8_t* header, size_t header_bytes);
    void abandon() { file_.abandon(); }

private:
    int failure() const { return file_.error_number() ? file_.error_number() : EIO; }

    OutputFile file_;
};

}  // namespace ondrel
