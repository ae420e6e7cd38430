#include "shell/path_settings.h"

#include <algorithm>
#include <cstring>
#include <filesystem>

#include "export/output_file.h"
#include "import/loader.h"
#include "import/sound_reader.h"

namespace ondrel {

namespace {
constexpr const char* kPathKey = "<Path>";
constexpr const char* kMusicKey = "<Music Path>";
constexpr const char* kSoundKey = "<Sound Path>";
constexpr size_t kReadSlack = 256;
constexpr size_t kMaxPathFileBytes = size_t{1} << 20;

bool is_directory(const std::string& path) {
    std::error_code ec;
    return !path.empty() && std::filesystem::is_directory(path, ec);
}
}  // namespace

PathSettings::PathSettings(std::string start_directory) : browser_directory(std::move(start_directory)) {
    menu = {{kAddMusicPathLabel, kAddMusicPathCode},
            {kAddSoundPathLabel, kAddSoundPathCode},
            {kRemovePathLabel, kRemovePathCode},
            {"", 0},
            {"", 0}};
}

size_t PathSettings::separator_index() const {
    for (size_t i = kFixedPathsItems; i < menu.size(); ++i)
        if (menu[i].label.empty()) return i;
    return menu.size();
}

PathsItemKind PathSettings::kind_of(size_t index) const {
    switch (index) {
        case 0: return PathsItemKind::AddMusicPath;
        case 1: return PathsItemKind::AddSoundPath;
        case 2: return PathsItemKind::RemovePath;
        case 3: return PathsItemKind::Separator;
        default: break;
    }
    if (index >= menu.size() || menu[index].label.empty()) return PathsItemKind::Separator;
    return index < separator_index() ? PathsItemKind::MusicDirectory : PathsItemKind::SoundDirectory;
}

std::vector<std::string> PathSettings::music_directories() const {
    std::vector<std::string> out;
    for (size_t i = kFixedPathsItems; i < menu.size(); ++i)
        if (kind_of(i) == PathsItemKind::MusicDirectory) out.push_back(menu[i].label);
    return out;
}

std::vector<std::string> PathSettings::sound_directories() const {
    std::vector<std::string> out;
    for (size_t i = kFixedPathsItems; i < menu.size(); ++i)
        if (kind_of(i) == PathsItemKind::SoundDirectory) out.push_back(menu[i].label);
    return out;
}

bool PathSettings::insert_directory(int index, const std::string& directory) {
    // An empty label would read as the separator and regroup the menu.
    if (directory.empty() || index < 0 || static_cast<size_t>(index) > menu.size()) return false;
    menu.insert(menu.begin() + index,
                PathsMenuItem{directory, kAddMusicPathCode + uint32_t(uint16_t(popadded))});
    ++popadded;
    return true;
}

bool PathSettings::add_music_directory(const std::string& directory) {
    if (!insert_directory(nopopmu, directory)) return false;
    ++nopopsd;
    return true;
}

bool PathSettings::add_sound_directory(const std::string& directory) {
    // Sound directories keep their order: the insertion point moves past each one.
    if (!insert_directory(nopopsd, directory)) return false;
    ++nopopsd;
    return true;
}

bool PathSettings::contains(PathsItemKind kind, const std::string& directory) const {
    for (size_t i = kFixedPathsItems; i < menu.size(); ++i)
        if (kind_of(i) == kind && menu[i].label == directory) return true;
    return false;
}

bool PathSettings::remove_directory(const std::string& directory) {
    bool removed = false;
    for (size_t i = menu.size(); i-- > kFixedPathsItems;) {
        const PathsItemKind kind = kind_of(i);
        if (menu[i].label != directory ||
            (kind != PathsItemKind::MusicDirectory && kind != PathsItemKind::SoundDirectory))
            continue;
        menu.erase(menu.begin() + static_cast<long>(i));
        --nopopsd;
        removed = true;
    }
    return removed;
}

PathsChoice PathSettings::choose(size_t index) {
    switch (kind_of(index)) {
        case PathsItemKind::AddMusicPath:
            if (contains(PathsItemKind::MusicDirectory, browser_directory)) return PathsChoice::Nothing;
            return add_music_directory(browser_directory) ? PathsChoice::AddedDirectory
                                                          : PathsChoice::Nothing;
        case PathsItemKind::AddSoundPath:
            if (contains(PathsItemKind::SoundDirectory, browser_directory)) return PathsChoice::Nothing;
            return add_sound_directory(browser_directory) ? PathsChoice::AddedDirectory
                                                          : PathsChoice::Nothing;
        case PathsItemKind::RemovePath:
            return remove_directory(browser_directory) ? PathsChoice::RemovedDirectory : PathsChoice::Nothing;
        case PathsItemKind::MusicDirectory:
        case PathsItemKind::SoundDirectory:
            if (!is_directory(menu[index].label)) return PathsChoice::MissingDirectory;
            browser_directory = menu[index].label;
            return PathsChoice::OpenedDirectory;
        case PathsItemKind::Separator: break;
    }
    return PathsChoice::Nothing;
}

std::string path_file_of(const std::string& thepath) {
    return (std::filesystem::path(thepath) / "ondrel.txt").string();
}

void read_info_path(PathSettings& settings, const std::string& thepath) {
    std::vector<uint8_t> bytes;
    std::string why;
    if (!read_file(path_file_of(thepath), bytes, why, kMaxPathFileBytes)) return;

    // The slack stays zero: a last line without its newline runs into it and ends there.
    std::vector<char> block(bytes.size() + kReadSlack, 0);
    std::copy(bytes.begin(), bytes.end(), block.begin());
    const long size = static_cast<long>(bytes.size());
    char* const text = block.data();
    long at = 0;

    // Each key is searched from where the previous value ended; the search gives up at the
    // first NUL, which the first match makes of every newline after it, so after "<Path>"
    // a key has to start the current line and a group ends at the first line of another.
    auto next_value = [&](const char* key, std::string& value) {
        char* found = findstr(text + at, key, size - at);
        if (!found) return false;
        value = found;
        at = static_cast<long>(found - text) + static_cast<long>(value.size()) + 1;
        return true;
    };

    std::string value;
    std::error_code ec;
    if (next_value(kPathKey, value) && std::filesystem::exists(value, ec)) settings.browser_directory = value;
    while (next_value(kMusicKey, value)) settings.add_music_directory(value);
    while (next_value(kSoundKey, value)) settings.add_sound_directory(value);
}

bool write_info_path(const PathSettings& settings, const std::string& thepath, std::string& why) {
    std::string text = kPathKey + settings.browser_directory + "\n";
    bool sound = false;
    for (size_t i = kFixedPathsItems; i < settings.menu.size(); ++i) {
        const std::string& label = settings.menu[i].label;
        if (label.empty()) {
            sound = true;
            continue;
        }
        text += (sound ? kSoundKey : kMusicKey) + label + "\n";
    }
    std::error_code ec;
    std::filesystem::create_directories(thepath, ec);
    if (ec) {
        why = "cannot create " + thepath + ": " + ec.message();
        return false;
    }
    return write_output_file(path_file_of(thepath), std::vector<uint8_t>(text.begin(), text.end()), why);
}

}  // namespace ondrel
