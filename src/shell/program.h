#pragma once
#include <atomic>
#include <cstdint>
#include <deque>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "edit/edit_history.h"
#include "edit/song_transaction.h"
#include "engine/engine.h"
#include "shell/alert_queue.h"
#include "shell/analyser_view.h"
#include "shell/editor_state.h"
#include "shell/file_browser.h"
#include "shell/file_panel_request.h"
#include "shell/keys.h"
#include "shell/midi_setup.h"
#include "shell/path_settings.h"
#include "shell/recording.h"
#include "shell/shell_message.h"
#include "shell/window_flags.h"

namespace ondrel {

// The program's state beside the engine, and the one place where commands arrive. The
// window posts codes and draws from this state; it never changes the song itself.
// Everything here runs on the window's thread.
class Program {
public:
    Program();
    Program(const Program&) = delete;
    Program& operator=(const Program&) = delete;

    Engine engine;
    AlertQueue alerts;
    EditorState editor;
    WindowFlags windows;
    FilePanelRequest file_panel;  // the file panel to show, if any
    Recording recording;          // the recorder, its input and the recording panel's choices
    AnalyserView analyser;        // what the "FFT Window" shows
    MidiSetup midi;               // the synthesiser, the ports, notes from a MIDI keyboard

    // Commands. post() queues; run_pending() handles what the queues hold, in order,
    // after taking in what the audio thread and the other threads sent.
    void post(ShellMessage message);
    void post(uint32_t code) { post(ShellMessage(code)); }
    void run_pending();
    // A key the window did not use itself: a shortcut posts its command, the rest goes to
    // the editor (note entry, cursor, digits).
    void key_down(const KeyChord& chord, bool repeat = false);
    void key_up(const KeyChord& chord);

    // The current song's undo history (one per song in memory).
    EditHistory& history();
    const EditHistory& history() const;
    bool song_dirty(int song) const;
    // Runs an edit of the current song on copies and swaps it in as one undoable step;
    // false when it changed nothing.
    bool edit(const std::string& label, const std::function<void(SongTransaction&)>& change);
    // The song in slot song was replaced, added, or removed from the bank.
    void song_replaced(int song);
    void song_added();
    void song_removed(int song);

    // The status line: what the transport does, and the last thing worth saying.
    void say(std::string text);
    const std::string& last_said() const { return said_; }
    uint64_t said_at_us() const { return said_at_; }
    std::string audio_status;  // "no sound device" when there is none

    // The path file's settings (the browser's directory, the favourite directories) and
    // the file browser, which the desktop program starts (headless runs have none).
    PathSettings paths;
    std::unique_ptr<FileBrowser> browser;
    // The file browser's directory, where the file panels open.
    std::string browser_directory() const { return browser ? browser->directory() : paths.browser_directory; }

    // Asks before the current song's changes are lost, then runs go (at once when there
    // is nothing to lose, or after "Save" or "Don't Save"; never after "Cancel").
    void unless_changes_lost(const std::function<void()>& go);

    // The file panel's answers: a file was chosen (its reply code is posted with the path),
    // or the panel was closed. A reply handler that has done its work calls
    // run_after_file(), which runs what the command that opened the panel wanted next.
    void file_chosen(const std::string& path);
    void file_panel_closed();
    void run_after_file();

    // Quitting: one path for the menu, Ctrl+Q, the window's close button and signals.
    enum class QuitState { Running, Asking, Done };
    void request_quit();
    // A signal asked the program to end: nobody can answer questions, so songs with changes
    // are kept as recovery copies.
    void quit_on_signal();
    QuitState quit_state() const { return quit_state_; }
    // Called once before the program ends: stops play and writes the settings.
    std::function<void()> on_quit;

private:
    void take_engine_messages();
    void handle(const ShellMessage& message);
    void ask_next_dirty_song_then_quit(int from);
    Alert changes_question() const;

    std::deque<ShellMessage> queue_;
    std::function<void()> after_file_;
    std::deque<EditHistory> histories_;  // by song slot; a deque never moves its elements to grow
    std::string said_;
    uint64_t said_at_ = 0;
    QuitState quit_state_ = QuitState::Running;
};

// Answers of the question about unsaved changes.
inline constexpr int kAnswerSave = 0;
inline constexpr int kAnswerDontSave = 1;
inline constexpr int kAnswerCancel = 2;

}  // namespace ondrel
