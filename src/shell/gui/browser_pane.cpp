#include "shell/gui/browser_pane.h"

#include <imgui.h>

#include "shell/gui/menu_bar.h"
#include "shell/program.h"

namespace ondrel {

namespace {

ImVec4 colour_of(EntryKind kind) {
    switch (kind) {
        case EntryKind::Directory: return ImVec4(0.6f, 0.8f, 1.0f, 1);
        case EntryKind::Module: return ImVec4(1.0f, 1.0f, 1.0f, 1);
        case EntryKind::Sound: return ImVec4(0.6f, 1.0f, 0.6f, 1);
        case EntryKind::Other: break;
    }
    return ImVec4(0.55f, 0.55f, 0.6f, 1);
}

void post_path(Program& p, uint32_t code, const std::string& path) {
    ShellMessage m(code);
    m.refs.push_back(path);
    p.post(std::move(m));
}

void paths_menu(Program& p) {
    const auto& menu = p.paths.menu;
    for (size_t i = 0; i < menu.size(); ++i) {
        if (menu[i].label.empty()) {
            ImGui::Separator();
            continue;
        }
        ImGui::PushID(static_cast<int>(i));
        if (ImGui::MenuItem(menu[i].label.c_str()))
            p.post(ShellMessage(menu[i].code).with("index", static_cast<int64_t>(i)));
        ImGui::PopID();
    }
}

}  // namespace

void BrowserPane::draw_entries(Program& p, const std::vector<BrowserEntry>& entries, const char* id) {
    ImGui::PushID(id);
    for (const BrowserEntry& e : entries) {
        ImGui::PushStyleColor(ImGuiCol_Text, colour_of(e.kind));
        const std::string label = e.kind == EntryKind::Directory ? e.name + "/" : e.name;
        if (ImGui::Selectable(label.c_str(), selected_ == e.path, ImGuiSelectableFlags_AllowDoubleClick)) {
            selected_ = e.path;
            const bool twice = ImGui::IsMouseDoubleClicked(ImGuiMouseButton_Left);
            if (e.kind == EntryKind::Directory && twice) post_path(p, fourcc("BRgo"), e.path);
            if (e.kind == EntryKind::Module && twice) post_path(p, fourcc("refs"), e.path);
            if (e.kind == EntryKind::Sound) post_path(p, fourcc(twice ? "refs" : "PRVw"), e.path);
        }
        ImGui::PopStyleColor();
        if (ImGui::IsItemHovered() && e.kind == EntryKind::Sound)
            ImGui::SetTooltip("Click: listen. Double click: into instrument %d",
                              p.engine.player.cursor.cursnd + 1);
    }
    ImGui::PopID();
}

void BrowserPane::draw_search(Program& p) {
    AudioSearch& search = p.browser->search();
    search.take_results(found_);
    if (!search.running() && found_.empty()) return;
    const SearchProgress progress = search.progress();
    ImGui::Separator();
    if (search.running()) {
        ImGui::Text("Searching: %llu directories, %llu found",
                    static_cast<unsigned long long>(progress.directories),
                    static_cast<unsigned long long>(progress.found));
        ImGui::SameLine();
        if (ImGui::SmallButton("Cancel")) search.cancel();
        ImGui::TextDisabled("%s", progress.current.c_str());
    } else {
        ImGui::Text("%zu audio files under %s%s", found_.size(), search.root().c_str(),
                    progress.cancelled ? " (cancelled)" : "");
        ImGui::SameLine();
        if (ImGui::SmallButton("Clear")) found_.clear();
    }
    ImGui::BeginChild("##found", ImVec2(0, ImGui::GetContentRegionAvail().y * 0.45f), true);
    draw_entries(p, found_, "found");
    ImGui::EndChild();
}

void BrowserPane::draw(Program& p) {
    if (!p.browser) {
        ImGui::TextDisabled("No file browser in this run");
        return;
    }
    FileBrowser& browser = *p.browser;
    browser.update();
    if (ImGui::Button("Paths")) ImGui::OpenPopup("##paths");
    if (ImGui::BeginPopup("##paths")) {
        paths_menu(p);
        ImGui::EndPopup();
    }
    ImGui::SameLine();
    if (ImGui::Button("View")) ImGui::OpenPopup("##view");
    if (ImGui::BeginPopup("##view")) {
        draw_menu_items(p, Menu::Browser);
        ImGui::EndPopup();
    }
    ImGui::SameLine();
    if (p.engine.preview.playing() && ImGui::Button("Stop sound")) p.post(fourcc("PRVw"));
    ImGui::TextWrapped("%s%s", browser.directory().c_str(), browser.loading() ? "  (reading...)" : "");
    if (search_started_ != browser.search().running() && browser.search().running()) found_.clear();
    search_started_ = browser.search().running();
    draw_search(p);
    ImGui::BeginChild("##listing", ImVec2(0, 0), true);
    draw_entries(p, browser.entries(), "listing");
    ImGui::EndChild();
}

}  // namespace ondrel
