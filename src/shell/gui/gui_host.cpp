#include "shell/gui/gui_host.h"

#include <SDL.h>
#include <imgui.h>
#include <imgui_impl_sdl.h>
#include <imgui_impl_sdlrenderer.h>

#include <cstdlib>
#include <cstring>

#include "shell/gui/key_translation.h"
#include "shell/gui/main_window.h"
#include "shell/program.h"

namespace ondrel {

namespace {
constexpr int kWidth = 1280;
constexpr int kHeight = 800;
constexpr uint32_t kBusyFrameMs = 16;   // while something moves: play, meters, auditions
constexpr uint32_t kIdleFrameMs = 100;  // otherwise a frame when an event comes, or now and then

bool wants_software_renderer() {
    const char* choice = std::getenv("ONDREL_RENDERER");
    return choice && std::strcmp(choice, "software") == 0;
}
}  // namespace

GuiHost::~GuiHost() {
    if (imgui_ready_) {
        ImGui_ImplSDLRenderer_Shutdown();
        ImGui_ImplSDL2_Shutdown();
        ImGui::DestroyContext();
    }
    if (renderer_) SDL_DestroyRenderer(renderer_);
    if (window_) SDL_DestroyWindow(window_);
    SDL_QuitSubSystem(SDL_INIT_VIDEO);
}

bool GuiHost::open(std::string& why) {
    // Signals are the program's to handle: SIGTERM must not look like a click on "close".
    SDL_SetHint(SDL_HINT_NO_SIGNAL_HANDLERS, "1");
    if (!std::getenv("DISPLAY") && !std::getenv("WAYLAND_DISPLAY")) {
        why = "no display to open the desktop window on (DISPLAY is not set)";
        return false;
    }
    if (SDL_InitSubSystem(SDL_INIT_VIDEO) != 0) {
        why = std::string("cannot open the desktop window: ") + SDL_GetError();
        return false;
    }
    window_ = SDL_CreateWindow("Ondrel Tracker", SDL_WINDOWPOS_CENTERED, SDL_WINDOWPOS_CENTERED, kWidth,
                               kHeight, SDL_WINDOW_RESIZABLE | SDL_WINDOW_ALLOW_HIGHDPI);
    if (!window_) {
        why = std::string("cannot open the desktop window: ") + SDL_GetError();
        return false;
    }
    if (!wants_software_renderer())
        renderer_ = SDL_CreateRenderer(window_, -1, SDL_RENDERER_ACCELERATED | SDL_RENDERER_PRESENTVSYNC);
    if (!renderer_) {
        // Drawn in software, the frame goes to the screen as a plain image: passing it
        // through a GL texture (SDL's default where GL exists, even a software GL) costs
        // more than drawing it.
        SDL_SetHint(SDL_HINT_FRAMEBUFFER_ACCELERATION, "0");
        renderer_ = SDL_CreateRenderer(window_, -1, SDL_RENDERER_SOFTWARE);
    }
    if (!renderer_) {
        why = std::string("cannot draw in the desktop window: ") + SDL_GetError();
        return false;
    }
    IMGUI_CHECKVERSION();
    ImGui::CreateContext();
    ImGuiIO& io = ImGui::GetIO();
    io.IniFilename = nullptr;  // window places are the program's, not a file's in the cwd
    ImGui::StyleColorsDark();
    // Square-edged shapes: without the feathered fringes every filled shape is a plain
    // rectangle, which a software renderer fills far faster.
    ImGuiStyle& style = ImGui::GetStyle();
    style.AntiAliasedFill = false;
    style.AntiAliasedLines = false;
    // Opaque panes: nothing shows through them, so nothing needs blending.
    for (ImGuiCol c : {ImGuiCol_WindowBg, ImGuiCol_PopupBg, ImGuiCol_MenuBarBg}) style.Colors[c].w = 1.0f;
    ImGui_ImplSDL2_InitForSDLRenderer(window_);
    ImGui_ImplSDLRenderer_Init(renderer_);
    imgui_ready_ = true;
    SDL_StartTextInput();
    return true;
}

const char* GuiHost::renderer_name() const {
    SDL_RendererInfo info{};
    if (!renderer_ || SDL_GetRendererInfo(renderer_, &info) != 0) return "none";
    return info.name;
}

void GuiHost::handle_event(Program& program, const SDL_Event& event) {
    ImGui_ImplSDL2_ProcessEvent(&event);
    const ImGuiIO& io = ImGui::GetIO();
    switch (event.type) {
        case SDL_QUIT: program.request_quit(); break;
        case SDL_WINDOWEVENT:
            if (event.window.event == SDL_WINDOWEVENT_CLOSE) program.request_quit();
            break;
        case SDL_DROPFILE: {
            ShellMessage open(fourcc("refs"));
            open.refs.emplace_back(event.drop.file);
            SDL_free(event.drop.file);
            program.post(std::move(open));
            break;
        }
        case SDL_KEYDOWN:
            // Only a text field being typed in keeps keys from the program: a button still
            // held from a click a moment ago must not swallow the next key.
            if (!io.WantTextInput && program.alerts.empty() && !program.file_panel.open())
                program.key_down(chord_of(event.key.keysym), event.key.repeat != 0);
            break;
        case SDL_KEYUP:
            if (!io.WantTextInput) program.key_up(chord_of(event.key.keysym));
            break;
        default: break;
    }
}

void GuiHost::apply_full_screen(bool on) {
    if (on == full_screen_) return;
    full_screen_ = on;
    SDL_SetWindowFullscreen(window_, on ? SDL_WINDOW_FULLSCREEN_DESKTOP : 0);
}

void GuiHost::frame(Program& program, MainWindow& window) {
    program.run_pending();
    apply_full_screen(program.windows.full_screen);
    if (std::string title = window.title(); title != title_) {
        title_ = std::move(title);
        SDL_SetWindowTitle(window_, title_.c_str());
    }
    ImGui_ImplSDLRenderer_NewFrame();
    ImGui_ImplSDL2_NewFrame();
    ImGui::NewFrame();
    window.draw();
    ImGui::Render();
    const ImVec4 pane = ImGui::GetStyle().Colors[ImGuiCol_WindowBg];
    SDL_SetRenderDrawColor(renderer_, Uint8(pane.x * 255), Uint8(pane.y * 255), Uint8(pane.z * 255), 255);
    SDL_RenderClear(renderer_);
    ImGui_ImplSDLRenderer_RenderDrawData(ImGui::GetDrawData());
    SDL_RenderPresent(renderer_);
}

void GuiHost::run(Program& program, MainWindow& window, const std::atomic<bool>& interrupted) {
    while (program.quit_state() != Program::QuitState::Done) {
        if (interrupted.load()) {
            program.quit_on_signal();
            break;
        }
        const bool busy = window.animating();
        SDL_Event event;
        if (SDL_WaitEventTimeout(&event, static_cast<int>(busy ? kBusyFrameMs : kIdleFrameMs))) {
            handle_event(program, event);
            while (SDL_PollEvent(&event)) handle_event(program, event);
        }
        frame(program, window);
    }
}

bool GuiHost::screenshot(const std::string& path) const {
    int w = 0, h = 0;
    if (!renderer_ || SDL_GetRendererOutputSize(renderer_, &w, &h) != 0) return false;
    SDL_Surface* shot = SDL_CreateRGBSurfaceWithFormat(0, w, h, 32, SDL_PIXELFORMAT_ARGB8888);
    if (!shot) return false;
    const bool read =
        SDL_RenderReadPixels(renderer_, nullptr, SDL_PIXELFORMAT_ARGB8888, shot->pixels, shot->pitch) == 0;
    const bool saved = read && SDL_SaveBMP(shot, path.c_str()) == 0;
    SDL_FreeSurface(shot);
    return saved;
}

}  // namespace ondrel
