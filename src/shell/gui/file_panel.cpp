#include "shell/gui/file_panel.h"

#include <imgui.h>

#include <algorithm>
#include <cstdio>
#include <filesystem>

#include "import/sound_reader.h"
#include "shell/program.h"

namespace ondrel {

namespace fs = std::filesystem;

namespace {
// Modules, then sounds, then the rest, as opening them would sort them.
int order_of(int kind) {
    return kind == kModuleFile ? 0 : kind == kSoundFile ? 1 : 2;
}

void copy_text(char* to, size_t size, const std::string& from) {
    std::snprintf(to, size, "%s", from.c_str());
}
}  // namespace

void FilePanel::list(const std::string& directory) {
    directory_ = directory;
    copy_text(directory_text_, sizeof directory_text_, directory);
    entries_.clear();
    error_.clear();
    std::error_code ec;
    for (fs::directory_iterator it(directory, fs::directory_options::skip_permission_denied, ec), end;
         !ec && it != end; it.increment(ec)) {
        Entry e;
        e.name = it->path().filename().string();
        if (e.name.empty() || e.name[0] == '.') continue;
        std::error_code type_ec;
        e.directory = it->is_directory(type_ec);
        e.kind = e.directory ? kOtherFile : returntype(e.name, "");
        entries_.push_back(std::move(e));
    }
    if (ec) error_ = "cannot read " + directory + ": " + ec.message();
    std::sort(entries_.begin(), entries_.end(), [](const Entry& a, const Entry& b) {
        if (a.directory != b.directory) return a.directory;
        if (order_of(a.kind) != order_of(b.kind)) return order_of(a.kind) < order_of(b.kind);
        return a.name < b.name;
    });
}

void FilePanel::choose(Program& p, const std::string& name) {
    if (name.empty()) return;
    const fs::path path = fs::path(name).is_absolute() ? fs::path(name) : fs::path(directory_) / name;
    std::error_code ec;
    if (fs::is_directory(path, ec)) {
        list(path.lexically_normal().string());
        name_[0] = 0;
        return;
    }
    const bool saving = p.file_panel.mode == FilePanelRequest::Mode::Save;
    if (saving && fs::exists(path, ec) && confirm_replace_ != path.string()) {
        confirm_replace_ = path.string();
        return;
    }
    confirm_replace_.clear();
    p.file_chosen(path.string());
}

void FilePanel::draw(Program& p) {
    const FilePanelRequest& request = p.file_panel;
    if (!request.open()) {
        if (was_open_) ImGui::CloseCurrentPopup();
        was_open_ = false;
        return;
    }
    constexpr const char* kId = "File##panel";
    if (!was_open_) {
        std::error_code ec;
        list(request.directory.empty() || !fs::is_directory(request.directory, ec)
                 ? fs::current_path(ec).string()
                 : request.directory);
        copy_text(name_, sizeof name_, request.suggested_name);
        confirm_replace_.clear();
        ImGui::OpenPopup(kId);
        was_open_ = true;
    }
    const ImGuiViewport* view = ImGui::GetMainViewport();
    ImGui::SetNextWindowPos(ImVec2(view->Size.x / 2, view->Size.y / 2), ImGuiCond_Appearing,
                            ImVec2(0.5f, 0.5f));
    ImGui::SetNextWindowSize(ImVec2(640, 480), ImGuiCond_Appearing);
    if (!ImGui::BeginPopupModal(kId, nullptr, ImGuiWindowFlags_NoSavedSettings)) return;
    ImGui::TextUnformatted(request.title.c_str());
    if (ImGui::Button("Up")) list(fs::path(directory_).parent_path().string());
    ImGui::SameLine();
    ImGui::SetNextItemWidth(-1);
    if (ImGui::InputText("##directory", directory_text_, sizeof directory_text_,
                         ImGuiInputTextFlags_EnterReturnsTrue))
        list(directory_text_);
    const float list_height = ImGui::GetContentRegionAvail().y - ImGui::GetFrameHeightWithSpacing() * 2 - 8;
    ImGui::BeginChild("##entries", ImVec2(0, list_height), true);
    if (!error_.empty()) ImGui::TextColored(ImVec4(1, 0.5f, 0.4f, 1), "%s", error_.c_str());
    std::string open_now;
    for (const Entry& e : entries_) {
        const ImVec4 colour = e.directory             ? ImVec4(0.6f, 0.8f, 1, 1)
                              : e.kind == kModuleFile ? ImVec4(1, 1, 1, 1)
                              : e.kind == kSoundFile  ? ImVec4(0.6f, 1, 0.6f, 1)
                                                      : ImVec4(0.55f, 0.55f, 0.6f, 1);
        ImGui::PushStyleColor(ImGuiCol_Text, colour);
        const std::string label = e.directory ? e.name + "/" : e.name;
        if (ImGui::Selectable(label.c_str(), name_ == e.name, ImGuiSelectableFlags_AllowDoubleClick)) {
            copy_text(name_, sizeof name_, e.name);
            if (ImGui::IsMouseDoubleClicked(ImGuiMouseButton_Left)) open_now = e.name;
        }
        ImGui::PopStyleColor();
    }
    ImGui::EndChild();
    ImGui::SetNextItemWidth(ImGui::GetContentRegionAvail().x - 220);
    const bool entered =
        ImGui::InputText("##name", name_, sizeof name_, ImGuiInputTextFlags_EnterReturnsTrue);
    ImGui::SameLine();
    const bool saving = request.mode == FilePanelRequest::Mode::Save;
    const bool ok = ImGui::Button(saving ? "Save" : "Open", ImVec2(100, 0));
    ImGui::SameLine();
    const bool cancel =
        ImGui::Button("Cancel", ImVec2(100, 0)) || ImGui::IsKeyPressed(ImGui::GetKeyIndex(ImGuiKey_Escape));
    if (!confirm_replace_.empty()) {
        ImGui::TextColored(ImVec4(1, 0.8f, 0.4f, 1), "%s exists: Save again to replace it.",
                           fs::path(confirm_replace_).filename().string().c_str());
    }
    if (!open_now.empty())
        choose(p, open_now);
    else if (ok || entered)
        choose(p, name_);
    if (cancel) p.file_panel_closed();
    if (!p.file_panel.open()) {
        ImGui::CloseCurrentPopup();
        was_open_ = false;
    }
    ImGui::EndPopup();
}

}  // namespace ondrel
