#include "record/temp_name.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>

namespace ondrel {

int NewTempName(const std::filesystem::path& directory, int& counter, std::string& path) {
    std::error_code ec;
    if (!std::filesystem::is_directory(directory, ec)) return ec ? ec.value() : ENOTDIR;
    for (int tries = 0; tries < 26; ++tries) {
        char leaf[32];
        std::snprintf(leaf, sizeof leaf, "NewSound:%d", ++counter);
        const std::string candidate = (directory / leaf).string();
        const int fd = ::open(candidate.c_str(), O_RDWR | O_CREAT | O_EXCL, 0666);
        if (fd >= 0) {
            ::close(fd);
            path = candidate;
            return 0;
        }
        if (errno != EEXIST) return errno;
    }
    return -1;
}

}  // namespace ondrel
