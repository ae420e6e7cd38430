#pragma once
#include <cstdint>
#include <string>
#include <vector>

#include "playback/messages.h"

namespace ondrel {

// One item of the paths menu: a fixed command, a separator (empty label) or a favourite
// directory (its path as label).
struct PathsMenuItem {
    std::string label;
    uint32_t code = 0;
};

// The fixed items the menu starts with; they are never saved.
inline constexpr uint32_t kAddMusicPathCode = fourcc("GO00");
inline constexpr uint32_t kAddSoundPathCode = fourcc("GO01");
inline constexpr uint32_t kRemovePathCode = fourcc("GO02");
inline constexpr const char* kAddMusicPathLabel = "Add Path To music";
inline constexpr const char* kAddSoundPathLabel = "Add Path To sound";
inline constexpr const char* kRemovePathLabel = "Remove path";
inline constexpr int kFixedPathsItems = 4;  // the three commands and a separator

enum class PathsItemKind {
    AddMusicPath,
    AddSoundPath,
    RemovePath,
    Separator,
    MusicDirectory,
    SoundDirectory
};

// What choosing an item did.
enum class PathsChoice {
    Nothing,           // a separator, an index out of range, or nothing to add or remove
    AddedDirectory,    // the browser's directory joined the favourites
    RemovedDirectory,  // the browser's directory left the favourites
    OpenedDirectory,   // the browser moved to the chosen favourite
    MissingDirectory,  // the chosen favourite is gone; the browser stays where it was
};

// The browser's current directory and the paths menu with its favourite music and sound
// directories, as the path file "ondrel.txt" keeps them.
//
// A directory item's code is 'GO00' + popadded at the time it was added, so the first
// favourite carries 'GO00' like "Add Path To music", the second 'GO01' like "Add Path To
// sound", and so on. Codes therefore never tell items apart: the window posts the code
// with the item's index, and choose() acts on the item at that index.
class PathSettings {
public:
    // The menu as the window builds it: the fixed items, then the separator between music
    // (none yet) and sound (none yet) directories.
    explicit PathSettings(std::string start_directory);

    std::string browser_directory;
    std::vector<PathsMenuItem> menu;
    int16_t nopopmu = kFixedPathsItems;      // where the next music directory goes
    int16_t nopopsd = kFixedPathsItems + 1;  // where the next sound directory goes (the end)
    int16_t popadded = 0;                    // directory items added so far

    PathsItemKind kind_of(size_t index) const;
    std::vector<std::string> music_directories() const;
    std::vector<std::string> sound_directories() const;

    // Adds a favourite the way the path file is read: music ahead of the earlier music
    // entries, sound after the earlier sound entries. False when the insertion point lies
    // outside the menu.
    bool add_music_directory(const std::string& directory);
    bool add_sound_directory(const std::string& directory);
    // Removes every favourite (music or sound) naming directory; false when none does.
    bool remove_directory(const std::string& directory);

    // The item at index was chosen in the menu: "Add Path To music" / "Add Path To sound"
    // add the browser's directory (once per group), "Remove path" removes it, a favourite
    // moves the browser there when it still exists.
    PathsChoice choose(size_t index);

private:
    bool insert_directory(int index, const std::string& directory);
    bool contains(PathsItemKind kind, const std::string& directory) const;
    size_t separator_index() const;
};

// The path file of the settings directory thepath.
std::string path_file_of(const std::string& thepath);

// Reads thepath/ondrel.txt into settings; a missing or unreadable file leaves them as they
// are. Music directories are inserted one ahead of the other, so their order flips at each
// start; a "<Path>" naming nothing on disk is ignored.
void read_info_path(PathSettings& settings, const std::string& thepath);

// Writes thepath/ondrel.txt (creating thepath): "<Path>", then the menu's directories in
// menu order. False with why set when it could not be written.
bool write_info_path(const PathSettings& settings, const std::string& thepath, std::string& why);

}  // namespace ondrel
