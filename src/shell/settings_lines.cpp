#include "shell/settings_lines.h"

#include <cstdint>
#include <filesystem>

#include "export/output_file.h"

namespace ondrel {

bool write_settings_file(const std::string& thepath, const std::string& path, const std::string& text,
                         std::string& why) {
    std::error_code ec;
    std::filesystem::create_directories(thepath, ec);
    if (ec) {
        why = "cannot create " + thepath + ": " + ec.message();
        return false;
    }
    return write_output_file(path, std::vector<uint8_t>(text.begin(), text.end()), why);
}

}  // namespace ondrel
