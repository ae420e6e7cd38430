#pragma once
#include <filesystem>
#include <string>

namespace ondrel {

// NewTempName: a fresh file "NewSound:N" in the recording directory, N taken from counter
// (incremented for each try), created empty and exclusively so no other recording takes
// it. 0 with path set; -1 when 26 numbers in a row were taken; or the directory's errno.
int NewTempName(const std::filesystem::path& directory, int& counter, std::string& path);

}  // namespace ondrel
