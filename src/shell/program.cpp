#include "shell/program.h"

#include <cstdio>
#include <utility>

#include "shell/command_handlers.h"
#include "shell/command_table.h"
#include "shell/editor_keys.h"
#include "shell/user_directories.h"

namespace ondrel {

Program::Program()
    : engine(&alerts), recording(engine.mixer, &alerts, home_directory()), midi(engine), paths(home_directory()) {
    histories_.resize(static_cast<size_t>(engine.bank.nbimod));
}

void Program::post(ShellMessage message) {
    queue_.push_back(std::move(message));
}

void Program::take_engine_messages() {
    Message m;
    while (engine.player.to_window.pop(m)) post(ShellMessage(m.code).with("note", m.a).with("vel", m.b));
    while (midi.poll(m)) post(ShellMessage(m.code).with("note", m.a).with("vel", m.b));
    auto posts = std::move(engine.player.window_posts);
    engine.player.window_posts.clear();
    for (const Message& p : posts) post(ShellMessage(p.code));
    // The recorder asks to stop ('stre'): the memory is full, the input ended, a write failed.
    bool stop = false;
    while (recording.recorder.poll(m)) stop = stop || m.code == kMsgStre;
    if (stop) post(ShellMessage(kMsgStre));
}

void Program::run_pending() {
    take_engine_messages();
    // Handlers may post more; those run in this same call, after what was queued first.
    while (!queue_.empty()) {
        ShellMessage m = std::move(queue_.front());
        queue_.pop_front();
        handle(m);
        take_engine_messages();
    }
}

void Program::handle(const ShellMessage& message) {
    const CommandInfo* command = find_command(message.code);
    if (!command) {
        std::printf("unknown command '%s'\n", code_text(message.code).c_str());
        return;
    }
    run_command(*this, *command, message);
}

void Program::key_down(const KeyChord& chord, bool repeat) {
    if (const CommandInfo* command = command_for_shortcut(chord)) {
        post(ShellMessage(command->code));
        return;
    }
    editor_key_down(*this, chord, repeat);
}

void Program::key_up(const KeyChord& chord) {
    editor_key_up(*this, chord);
}

EditHistory& Program::history() {
    return histories_.at(static_cast<size_t>(engine.bank.noimod));
}

const EditHistory& Program::history() const {
    return histories_.at(static_cast<size_t>(engine.bank.noimod));
}

bool Program::song_dirty(int song) const {
    return song >= 0 && static_cast<size_t>(song) < histories_.size() &&
           histories_[static_cast<size_t>(song)].dirty();
}

bool Program::edit(const std::string& label, const std::function<void(SongTransaction&)>& change) {
    SongTransaction transaction(engine.bank, engine.slots, label);
    change(transaction);
    EditStep step = transaction.commit();
    if (step.empty()) return false;
    history().push(std::move(step));
    return true;
}

void Program::song_replaced(int song) {
    if (song < 0 || static_cast<size_t>(song) >= histories_.size()) return;
    histories_[static_cast<size_t>(song)].clear();
}

void Program::song_added() {
    histories_.resize(static_cast<size_t>(engine.bank.nbimod));
    histories_.back().clear();
}

void Program::song_removed(int song) {
    if (song < 0 || static_cast<size_t>(song) >= histories_.size()) return;
    histories_.erase(histories_.begin() + song);
    histories_.resize(static_cast<size_t>(engine.bank.nbimod));
}

void Program::file_chosen(const std::string& path) {
    if (!file_panel.open()) return;
    ShellMessage reply(file_panel.reply_code);
    reply.refs.push_back(path);
    after_file_ = std::move(file_panel.after);
    file_panel.close();
    post(std::move(reply));
}

void Program::file_panel_closed() {
    auto cancelled = std::move(file_panel.on_cancel);
    file_panel.close();
    if (cancelled) cancelled();
}

void Program::run_after_file() {
    auto next = std::move(after_file_);
    after_file_ = nullptr;
    if (next) next();
}

void Program::say(std::string text) {
    said_ = std::move(text);
    said_at_ = system_time_us();
}

void Program::unless_changes_lost(const std::function<void()>& go) {
    if (!history().dirty()) {
        go();
        return;
    }
    alerts.ask(changes_question(), [this, go](int button) {
        if (button == kAnswerDontSave) go();
        if (button == kAnswerSave) save_song_then(*this, go);
    });
}

Alert Program::changes_question() const {
    const TMOD& song = engine.bank.current();
    const std::string name = song.name[0] ? song.name : "No name";
    return {"title",
            "The song \"" + name + "\" has changes that are not saved.",
            {"Save", "Don't Save", "Cancel"}};
}

void Program::request_quit() {
    if (quit_state_ != QuitState::Running) return;
    quit_state_ = QuitState::Asking;
    ask_next_dirty_song_then_quit(0);
}

void Program::ask_next_dirty_song_then_quit(int from) {
    for (int s = from; s < engine.bank.nbimod; ++s) {
        if (!song_dirty(s)) continue;
        engine.bank.select(s);
        alerts.ask(changes_question(), [this, s](int button) {
            if (button == kAnswerCancel) {
                quit_state_ = QuitState::Running;
                return;
            }
            if (button == kAnswerDontSave) {
                ask_next_dirty_song_then_quit(s + 1);
                return;
            }
            save_song_then(*this, [this, s] { ask_next_dirty_song_then_quit(s + 1); });
            // A save panel closed without saving cancels the quit.
            if (file_panel.open()) file_panel.on_cancel = [this] { quit_state_ = QuitState::Running; };
        });
        return;
    }
    if (on_quit) on_quit();
    quit_state_ = QuitState::Done;
}

void Program::quit_on_signal() {
    if (quit_state_ == QuitState::Done) return;
    keep_recovery_copies(*this);
    if (on_quit) on_quit();
    quit_state_ = QuitState::Done;
}

}  // namespace ondrel
