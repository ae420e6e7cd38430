#include "record/recording_file.h"

#include <cerrno>

namespace ondrel {

int RecordingFile::open(const std::string& path) {
    std::string why;
    return file_.open(path, why) ? 0 : failure();
}

int RecordingFile::append(const uint8_t* data, size_t bytes) {
    return file_.write(data, bytes) ? 0 : failure();
}

int RecordingFile::finish(uint64_t length, const uint8_t* header, size_t header_bytes) {
    std::string why;
    // Only after a failed write is there anything to cut: it also forgets the failure.
    const bool cut = !file_.error().empty() || length < file_.bytes_written();
    if (file_.seekable() && !((!cut || file_.keep_first(length)) && file_.rewrite(0, header, header_bytes))) {
        const int e = failure();
        file_.abandon();
        return e;
    }
    return file_.commit(why) ? 0 : failure();
}

}  // namespace ondrel
