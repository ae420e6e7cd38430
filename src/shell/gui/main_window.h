#pragma once
#include <memory>
#include <string>

#include "shell/gui/analyser_window.h"
#include "shell/gui/browser_pane.h"
#include "shell/gui/envelope_editor.h"
#include "shell/gui/file_panel.h"
#include "shell/gui/pattern_view.h"
#include "shell/gui/sample_editor.h"
#include "song/tmod.h"

namespace ondrel {

class Program;

// The whole window, one frame at a time: the menu bar, the transport, the pattern view and
// the panes, the status line, and the alerts, panels and secondary windows above them.
// It draws from the program's state and posts commands; it never changes the song itself.
class MainWindow {
public:
    // renderer: where windows with pixels of their own make their textures.
    MainWindow(Program& program, SDL_Renderer* renderer);
    void draw();
    // "Ondrel Tracker - song name", with " *" while the song has unsaved changes.
    std::string title() const;
    // Something on screen moves by itself (play, meters, a search): draw often.
    bool animating() const;

private:
    void take_song_snapshot();
    void draw_panes(float top, float height);
    void draw_editors(float left, float top, float width, float height);

    Program& p_;
    // The current song's record as of this frame: the sequencer writes a few fields while
    // it plays, so the window reads a copy taken between two buffers.
    std::unique_ptr<TMOD> song_;
    PatternView pattern_view_;
    FilePanel file_panel_;
    BrowserPane browser_pane_;
    SampleEditor sample_editor_;
    EnvelopeEditor envelope_editor_;
    AnalyserWindow analyser_window_;
};

}  // namespace ondrel
