#pragma once
#include <string>

namespace ondrel {

// The MIME type of a file from its content (libmagic); empty when it cannot be told.
std::string mime_type_of(const std::string& path);

}  // namespace ondrel
