#include <cctype>

#include "import/module_reader.h"

namespace ondrel {

const std::vector<ModuleReaderEntry>& module_readers() {
    static const std::vector<ModuleReaderEntry> table = {
        {"", "ProTracker Module & compatible", read_mod}, {".mtm", "Multi Tracker Module", read_mtm},
        {".otm", "Ondrel Tracker Module", read_otm},      {".s3m", "Scream Tracker Module", read_s3m},
        {".xm", "FastTracker Module", nullptr},
    };
    return table;
}

namespace {
bool ends_with_nocase(const std::string& s, const char* tail) {
    const std::string t(tail);
    if (t.empty() || t.size() > s.size()) return false;
    for (size_t i = 0; i < t.size(); ++i)
        if (std::tolower(static_cast<unsigned char>(s[s.size() - t.size() + i])) != t[i]) return false;
    return true;
}
}  // namespace

const ModuleReaderEntry& reader_for(const std::string& path) {
    const auto& table = module_readers();
    const ModuleReaderEntry* chosen = &table.front();
    for (const auto& entry : table)
        if (ends_with_nocase(path, entry.extension)) chosen = &entry;
    return *chosen;
}

}  // namespace ondrel
