#pragma once
#include <cstdint>
#include <span>

#include "shell/keys.h"
#include "shell/shell_message.h"

namespace ondrel {

class Program;
using CommandHandler = void (*)(Program&, const ShellMessage&);
using CommandTest = bool (*)(const Program&);

enum class Menu : uint8_t {
    None,  // messages that no menu carries (between windows and threads, keys, buttons)
    File,
    Edit,
    Pattern,
    Position,
    Song,
    Windows,
    Music,
    Options,
    Midi,
    Browser,       // the file browser's own menus
    BrowserPaths,  // its paths menu
    Envelope,      // the instrument editor's envelope selector
    Analyser,      // the "FFT Window"'s menus
};

// One command: its code, its label and place in the menus, its shortcut, what it does,
// and when it can be chosen or shows a check mark. Every command lives in this one table.
struct CommandInfo {
    uint32_t code;
    const char* label;
    Menu menu;
    const char* submenu;  // null: directly in the menu
    KeyChord shortcut;
    CommandHandler handler;         // null: not available in this build
    CommandTest enabled = nullptr;  // null: always when there is a handler
    CommandTest checked = nullptr;  // null: not a toggle
    uint32_t family = 1;            // codes code .. code + family - 1 share the entry
};

// The whole table, in menu order.
std::span<const CommandInfo> command_table();
// The entry that handles code (a member of a family included), or null.
const CommandInfo* find_command(uint32_t code);
// The entry whose shortcut is chord, or null.
const CommandInfo* command_for_shortcut(const KeyChord& chord);
// Runs command's handler when it can be chosen; one without a handler says so in the
// status line rather than doing nothing unseen.
void run_command(Program& p, const CommandInfo& command, const ShellMessage& message);
const char* menu_title(Menu menu);

inline constexpr uint32_t kMaxSongMenuItems = 63;
inline constexpr uint32_t kMaxPathsMenuItems = 1024;  // 'GO00' + directories ever added

}  // namespace ondrel
