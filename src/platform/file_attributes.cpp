#include "platform/file_attributes.h"

#include <sys/xattr.h>

namespace ondrel {

long read_file_attribute(const std::string& path, const char* name, void* buf, size_t size) {
    const ssize_t n = ::getxattr(path.c_str(), name, buf, size);
    return n < 0 ? -1 : static_cast<long>(n);
}

bool write_file_attribute(const std::string& path, const char* name, const void* data, size_t size) {
    return ::setxattr(path.c_str(), name, data, size, 0) == 0;
}

}  // namespace ondrel
