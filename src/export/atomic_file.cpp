#include "export/atomic_file.h"

#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <filesystem>

namespace ondrel {

bool ReplacingFile::open(const std::string& path, std::string& why) {
    abandon();
    namespace fs = std::filesystem;
    const fs::path target(path);
    const fs::path dir = target.has_parent_path() ? target.parent_path() : fs::path(".");
    std::string leaf = ".";
    leaf += target.filename().string();
    leaf += ".XXXXXX";
    std::string temp = (dir / leaf).string();
    const int fd = mkstemp(temp.data());
    if (fd < 0) {
        why = "cannot write in " + dir.string() + ": " + std::strerror(errno);
        return false;
    }
    ::fchmod(fd, 0644);
    file_ = fdopen(fd, "wb");
    if (!file_) {
        why = std::string("cannot write ") + path + ": " + std::strerror(errno);
        ::close(fd);
        std::remove(temp.c_str());
        return false;
    }
    path_ = path;
    temp_ = temp;
    return true;
}

bool ReplacingFile::commit(std::string& why) {
    if (!file_) {
        why = "no file open";
        return false;
    }
    const bool written = !std::ferror(file_) && std::fflush(file_) == 0 && ::fsync(fileno(file_)) == 0;
    const int err = errno;
    const bool closed = std::fclose(file_) == 0;
    file_ = nullptr;
    if (!written || !closed) {
        why = "cannot write " + path_ + ": " + std::strerror(err);
        abandon();
        return false;
    }
    if (std::rename(temp_.c_str(), path_.c_str()) != 0) {
        why = "cannot replace " + path_ + ": " + std::strerror(errno);
        abandon();
        return false;
    }
    temp_.clear();
    return true;
}

void ReplacingFile::abandon() {
    if (file_) {
        std::fclose(file_);
        file_ = nullptr;
    }
    if (!temp_.empty()) {
        std::remove(temp_.c_str());
        temp_.clear();
    }
}

bool write_file_atomically(const std::string& path, const std::vector<uint8_t>& bytes, std::string& why) {
    ReplacingFile file;
    if (!file.open(path, why)) return false;
    if (!bytes.empty() && std::fwrite(bytes.data(), 1, bytes.size(), file.stream()) != bytes.size()) {
        why = "cannot write " + path + ": " + std::strerror(errno);
        return false;
    }
    return file.commit(why);
}

}  // namespace ondrel
