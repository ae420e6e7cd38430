#include "shell/gui/menu_bar.h"

#include <imgui.h>

#include <cstring>
#include <string>

#include "shell/command_table.h"
#include "shell/program.h"

namespace ondrel {

namespace {

constexpr Menu kMainMenus[] = {Menu::File,    Menu::Edit,  Menu::Pattern, Menu::Position, Menu::Song,
                               Menu::Windows, Menu::Music, Menu::Options, Menu::Midi};

bool can_choose(const Program& p, const CommandInfo& c) {
    return c.handler && (!c.enabled || c.enabled(p));
}

void command_item(Program& p, const CommandInfo& c) {
    const std::string keys = chord_text(c.shortcut);
    const bool checked = c.checked && c.checked(p);
    ImGui::PushID(static_cast<int>(c.code));
    if (ImGui::MenuItem(c.label, keys.empty() ? nullptr : keys.c_str(), checked, can_choose(p, c)))
        p.post(c.code);
    ImGui::PopID();
}

// The songs in memory, one item each, after the song commands.
void song_items(Program& p, const CommandInfo& c) {
    ImGui::Separator();
    const SongBank& bank = p.engine.bank;
    for (int s = 0; s < bank.nbimod; ++s) {
        const char* name = bank.timod[s]->name;
        std::string label = name[0] ? name : c.label;
        if (p.song_dirty(s)) label += " *";
        ImGui::PushID(s);
        if (ImGui::MenuItem(label.c_str(), nullptr, s == bank.noimod))
            p.post(c.code + static_cast<uint32_t>(s));
        ImGui::PopID();
    }
}

}  // namespace

void draw_menu_items(Program& p, Menu menu) {
    const auto table = command_table();
    for (size_t i = 0; i < table.size(); ++i) {
        const CommandInfo& c = table[i];
        if (c.menu != menu) continue;
        if (c.family > 1) {
            song_items(p, c);
            continue;
        }
        if (!c.submenu) {
            command_item(p, c);
            continue;
        }
        // A run of entries with the same submenu.
        size_t end = i;
        while (end < table.size() && table[end].menu == menu && table[end].submenu &&
               std::strcmp(table[end].submenu, c.submenu) == 0)
            ++end;
        if (ImGui::BeginMenu(c.submenu)) {
            for (size_t j = i; j < end; ++j) command_item(p, table[j]);
            ImGui::EndMenu();
        }
        i = end - 1;
    }
}

float draw_menu_bar(Program& p) {
    float height = 0;
    if (ImGui::BeginMainMenuBar()) {
        for (Menu menu : kMainMenus) {
            bool any = false;
            for (const CommandInfo& c : command_table()) any = any || c.menu == menu;
            if (!any) continue;
            if (ImGui::BeginMenu(menu_title(menu))) {
                draw_menu_items(p, menu);
                ImGui::EndMenu();
            }
        }
        height = ImGui::GetWindowSize().y;
        ImGui::EndMainMenuBar();
    }
    return height;
}

}  // namespace ondrel
