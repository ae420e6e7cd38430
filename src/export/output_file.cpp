#include "export/output_file.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstring>
#include <filesystem>
#include <mutex>
#include <random>

namespace ondrel {

namespace {

constexpr size_t kBufferBytes = 64 * 1024;
constexpr int kMaxLinkHops = 40;  // as the kernel's own limit

std::string reason(int err) {
    return std::strerror(err);
}

// A reader that goes away must give a write error, not kill the program.
void ignore_sigpipe() {
    static std::once_flag once;
    std::call_once(once, [] {
        struct sigaction now {};
        if (::sigaction(SIGPIPE, nullptr, &now) == 0 && now.sa_handler == SIG_DFL) {
            struct sigaction ignore {};
            ignore.sa_handler = SIG_IGN;
            ::sigaction(SIGPIPE, &ignore, nullptr);
        }
    });
}

// The file a chain of symbolic links ends on (the path itself when it is no link); the
// end need not exist yet. Relative links are taken from the folder of the link.
bool follow_links(const std::string& path, std::string& out, int& err) {
    namespace fs = std::filesystem;
    fs::path p(path);
    for (int hops = 0; hops < kMaxLinkHops; ++hops) {
        struct stat st {};
        if (::lstat(p.c_str(), &st) != 0 || !S_ISLNK(st.st_mode)) {
            out = p.string();
            return true;
        }
        std::error_code ec;
        const fs::path link = fs::read_symlink(p, ec);
        if (ec) {
            err = ec.value();
            return false;
        }
        p = link.is_absolute() ? link : p.parent_path() / link;
    }
    err = ELOOP;
    return false;
}

std::string folder_of(const std::string& path) {
    const std::filesystem::path p(path);
    return p.has_parent_path() ? p.parent_path().string() : std::string(".");
}

// A fresh file beside target, created with the usual 0666 less the umask.
int create_temporary(const std::string& target, std::string& name) {
    static std::mutex mutex;
    static std::mt19937_64 random{std::random_device{}()};
    const std::string stem = (std::filesystem::path(folder_of(target)) /
                              ("." + std::filesystem::path(target).filename().string() + ".part-"))
                                 .string();
    for (int attempt = 0; attempt < 100; ++attempt) {
        uint64_t tag;
        {
            std::lock_guard lock(mutex);
            tag = random();
        }
        char hex[17];
        std::snprintf(hex, sizeof hex, "%016llx", static_cast<unsigned long long>(tag));
        name = stem + hex;
        const int fd = ::open(name.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0666);
        if (fd >= 0 || errno != EEXIST) return fd;
    }
    errno = EEXIST;
    return -1;
}

}  // namespace

bool OutputFile::open(const std::string& path, std::string& why) {
    abandon();
    error_.clear();
    error_number_ = 0;
    written_ = base_ = 0;
    seekable_ = false;
    buffer_.resize(kBufferBytes);
    if (path == "-") {
        shown_ = "standard output";
        return open_in_place("", true, why);
    }
    shown_ = path;
    std::string target;
    int err = 0;
    if (!follow_links(path, target, err)) {
        error_number_ = err;
        why = "cannot write " + path + ": " + reason(err);
        return false;
    }
    struct stat st {};
    if (::stat(target.c_str(), &st) == 0) {
        if (S_ISDIR(st.st_mode)) {
            error_number_ = EISDIR;
            why = "cannot write " + path + ": " + reason(EISDIR);
            return false;
        }
        if (!S_ISREG(st.st_mode)) return open_in_place(target, false, why);
    } else if (errno != ENOENT) {
        error_number_ = errno;
        why = "cannot write " + path + ": " + reason(errno);
        return false;
    }
    return open_replacement(target, why);
}

bool OutputFile::open_replacement(const std::string& target, std::string& why) {
    struct stat st {};
    const bool exists = ::stat(target.c_str(), &st) == 0;
    if (exists) {
        // Root may write anything; like an editor, we still take a file that nobody may
        // write as one not to be replaced.
        if ((st.st_mode & 0222) == 0) {
            error_number_ = EACCES;
            why = "cannot write " + shown_ + ": the file is read-only";
            return false;
        }
        if (::faccessat(AT_FDCWD, target.c_str(), W_OK, AT_EACCESS) != 0) {
            error_number_ = errno;
            why = "cannot write " + shown_ + ": " + reason(errno);
            return false;
        }
    }
    std::string temp;
    const int fd = create_temporary(target, temp);
    if (fd < 0) {
        error_number_ = errno;
        why = "cannot write in " + folder_of(target) + ": " + reason(errno);
        return false;
    }
    if (exists) {
        ::fchmod(fd, st.st_mode & 07777);
        if (::fchown(fd, st.st_uid, st.st_gid) != 0 && ::fchown(fd, static_cast<uid_t>(-1), st.st_gid) != 0) {
            // Not ours to give away: the new file keeps our ownership, as an editor's would.
        }
    }
    fd_ = fd;
    owns_fd_ = true;
    seekable_ = true;
    target_ = target;
    temp_ = temp;
    return true;
}

bool OutputFile::open_in_place(const std::string& target, bool is_stdout, std::string& why) {
    if (is_stdout) {
        if (::isatty(STDOUT_FILENO)) {
            error_number_ = ENOTTY;
            why = "cannot write to standard output: it is a terminal";
            return false;
        }
        fd_ = STDOUT_FILENO;
        owns_fd_ = false;
    } else {
        // A FIFO waits here for its reader, as any writer into a pipe does.
        fd_ = ::open(target.c_str(), O_WRONLY | O_CLOEXEC | O_NOCTTY);
        owns_fd_ = true;
    }
    struct stat st {};
    if (fd_ < 0 || ::fstat(fd_, &st) != 0) {
        error_number_ = errno;
        why = "cannot write " + shown_ + ": " + reason(errno);
        close_fd();
        return false;
    }
    ignore_sigpipe();
    if (is_stdout && S_ISREG(st.st_mode) && !(::fcntl(fd_, F_GETFL) & O_APPEND)) {
        const off_t at = ::lseek(fd_, 0, SEEK_CUR);
        seekable_ = at >= 0;
        base_ = at >= 0 ? static_cast<uint64_t>(at) : 0;
    }
    return true;
}

bool OutputFile::fail(const std::string& what, int err) {
    if (error_.empty()) {
        error_ = what + " " + shown_ + ": " + reason(err);
        error_number_ = err;
    }
    return false;
}

bool OutputFile::flush() {
    if (!error_.empty()) return false;
    const uint8_t* p = buffer_.data();
    size_t left = buffered_;
    while (left > 0) {
        const ssize_t n = ::write(fd_, p, left);
        if (n < 0) {
            if (errno == EINTR) continue;
            buffered_ = 0;  // what did not reach the file is not counted as written
            return fail("cannot write", errno);
        }
        p += n;
        left -= static_cast<size_t>(n);
        written_ += static_cast<uint64_t>(n);
    }
    buffered_ = 0;
    return true;
}

bool OutputFile::write(const void* data, size_t bytes) {
    if (fd_ < 0 || !error_.empty()) return false;
    const auto* p = static_cast<const uint8_t*>(data);
    while (bytes > 0) {
        const size_t take = std::min(bytes, buffer_.size() - buffered_);
        std::memcpy(buffer_.data() + buffered_, p, take);
        buffered_ += take;
        p += take;
        bytes -= take;
        if (buffered_ == buffer_.size() && !flush()) return false;
    }
    return true;
}

bool OutputFile::rewrite(uint64_t offset, const void* data, size_t bytes) {
    if (fd_ < 0 || !seekable_ || !flush() || offset + bytes > written_) return false;
    const auto* p = static_cast<const uint8_t*>(data);
    while (bytes > 0) {
        const ssize_t n = ::pwrite(fd_, p, bytes, static_cast<off_t>(base_ + offset));
        if (n < 0) {
            if (errno == EINTR) continue;
            return fail("cannot write", errno);
        }
        p += n;
        offset += static_cast<uint64_t>(n);
        bytes -= static_cast<size_t>(n);
    }
    return true;
}

bool OutputFile::keep_first(uint64_t length) {
    if (fd_ < 0 || !seekable_ || length > written_) return false;
    buffered_ = 0;
    if (::ftruncate(fd_, static_cast<off_t>(base_ + length)) != 0 ||
        ::lseek(fd_, static_cast<off_t>(base_ + length), SEEK_SET) < 0)
        return fail("cannot write", errno);
    written_ = length;
    error_.clear();
    error_number_ = 0;
    return true;
}

bool OutputFile::commit(std::string& why) {
    if (fd_ < 0) {
        why = error_.empty() ? "cannot write " + shown_ + ": nothing open" : error_;
        return false;
    }
    // A pipe or a device cannot be synced; a replacement must be on disk before the rename.
    if (flush() && !temp_.empty() && ::fsync(fd_) != 0) fail("cannot write", errno);
    if (owns_fd_ && ::close(fd_) != 0) fail("cannot write", errno);
    fd_ = -1;
    if (error_.empty() && !temp_.empty() && ::rename(temp_.c_str(), target_.c_str()) != 0)
        fail("cannot replace", errno);
    if (!error_.empty()) {
        why = error_;
        abandon();
        return false;
    }
    temp_.clear();
    return true;
}

void OutputFile::close_fd() {
    if (fd_ >= 0 && owns_fd_) ::close(fd_);
    fd_ = -1;
}

void OutputFile::abandon() {
    close_fd();
    buffered_ = 0;
    if (!temp_.empty()) {
        ::unlink(temp_.c_str());
        temp_.clear();
    }
}

bool write_output_file(const std::string& path, const std::vector<uint8_t>& bytes, std::string& why) {
    OutputFile file;
    if (!file.open(path, why)) return false;
    if (!file.write(bytes.data(), bytes.size())) {
        why = file.error();
        return false;
    }
    return file.commit(why);
}

}  // namespace ondrel
