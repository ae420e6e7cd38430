#pragma once
#include <cstddef>
#include <string>

namespace ondrel {

// Extended attributes of a file, by their full names ("user.on_v"). Where the file, the
// attribute or the file system's support is missing, reads find nothing and writes do
// nothing; callers keep their values then.

// Reads the attribute into buf; the number of bytes read, or -1 when there is none or it is
// longer than size.
long read_file_attribute(const std::string& path, const char* name, void* buf, size_t size);

// Sets the attribute; false when it could not be written.
bool write_file_attribute(const std::string& path, const char* name, const void* data, size_t size);

}  // namespace ondrel
