// The recording panel's commands: monitor, record and stop; the source, the input, the
// format, the destination and its file, the gain.
#include <algorithm>
#include <cstdio>
#include <filesystem>

#include "record/d2d_header.h"
#include "record/record_format.h"
#include "shell/command_handlers.h"
#include "shell/program.h"

namespace ondrel {

namespace {

bool song_is_source(const Program& p) {
    return p.engine.mixer.frecmusic.load(std::memory_order_relaxed) != 0;
}

bool to_disk(const Program& p) {
    return p.recording.recorder.soundrecoutput.load(std::memory_order_relaxed) == 1;
}

std::string seconds_of(uint64_t bytes, int mode) {
    char text[32];
    std::snprintf(text, sizeof text, "%.1f s", double(bytes) / record_format(mode).byte_rate);
    return text;
}

// The save panel for the disk recording's file; then runs next, if any.
void ask_for_file(Program& p, std::function<void()> next) {
    const Recording& r = p.recording;
    p.file_panel.mode = FilePanelRequest::Mode::Save;
    p.file_panel.reply_code = fourcc("RCfl");
    p.file_panel.title = "Record to the file";
    p.file_panel.directory = r.directory;
    p.file_panel.suggested_name =
        r.has_file() ? std::filesystem::path(r.recorder.d2dref()).filename().string() : "recording.wav";
    p.file_panel.after = std::move(next);
}

// A disk recording needs its file: a default one, else the user is asked.
bool file_ready(Program& p, const std::function<void()>& then) {
    Recording& r = p.recording;
    if (!to_disk(p) || r.has_file()) return true;
    std::string why;
    if (r.make_default_file(why)) return true;
    p.say(why);
    ask_for_file(p, then);
    return false;
}

void tell_stopped(Program& p, RecordingResult result, bool disk, const std::string& file, int mode) {
    Recording& r = p.recording;
    if (result.sound) {
        const int slot = std::clamp<int>(p.engine.player.cursor.cursnd, 0, kSamplesPerSong - 1);
        const uint32_t bytes = result.sound->length;
        p.edit("Record", [&](SongTransaction& t) { t.set_sample(slot, std::move(result.sound)); });
        p.say("Recorded " + seconds_of(bytes, mode) + " into instrument " + std::to_string(slot + 1));
        return;
    }
    if (!disk) {
        p.say("Nothing was recorded");
        return;
    }
    r.file_used();
    const uint64_t data_bytes = result.file_bytes - std::min<uint64_t>(kD2dHeaderBytes, result.file_bytes);
    std::string text = result.error ? "The recording stopped: " + file + " keeps what was written"
                                    : "Recorded " + seconds_of(data_bytes, mode) + " to " + file;
    if (result.bytes_lost)
        text += " (the disk could not keep up: " + std::to_string(result.bytes_lost) + " bytes were lost)";
    p.say(text);
    std::string why;
    if (to_disk(p)) r.make_default_file(why);
}

}  // namespace

bool can_monitor(const Program& p) {
    const Recording& r = p.recording;
    return r.has_input() && !song_is_source(p) && !r.recorder.isMonitoring();
}

bool can_record(const Program& p) {
    const Recording& r = p.recording;
    return !r.recorder.isRecording() && (song_is_source(p) || r.has_input());
}

bool can_stop_recording(const Program& p) {
    return p.recording.busy();
}

bool recording_idle(const Program& p) {
    return !p.recording.busy();
}

void cmd_monitor(Program& p, const ShellMessage&) {
    p.recording.recorder.Record(kMsgMoni);
    if (p.recording.input_connected()) p.say("Monitoring " + p.recording.chosen_input_name());
}

void cmd_record(Program& p, const ShellMessage&) {
    if (!file_ready(p, [&p] { p.post(fourcc("reco")); })) return;
    Recording& r = p.recording;
    r.recorder.Record(kMsgReco);
    if (!r.recorder.isRecording()) return;  // the recorder's alert says why
    const std::string from = song_is_source(p) ? "the song's output" : r.chosen_input_name();
    const std::string to =
        to_disk(p) ? r.recorder.d2dref() : "instrument " + std::to_string(p.engine.player.cursor.cursnd + 1);
    p.say("Recording " + from + " to " + to +
          (song_is_source(p) && !p.engine.player.tr.playing ? ": play the song (F5)" : ""));
}

void cmd_stop_recording(Program& p, const ShellMessage&) {
    Recording& r = p.recording;
    const bool disk = r.recorder.isRecording() && to_disk(p);
    const std::string file = r.recorder.d2dref();
    const int mode = r.recorder.samplermode.load(std::memory_order_relaxed);
    RecordingResult result = r.recorder.StopRecording();
    // Requests the hook made before it saw the stop would stop what is left (the monitor).
    Message stale;
    while (r.recorder.poll(stale)) {
    }
    if (!result.stopped) {
        p.say("Monitoring stopped");
        return;
    }
    tell_stopped(p, std::move(result), disk, file, mode);
}

void cmd_recording_setting(Program& p, const ShellMessage& m) {
    Recording& r = p.recording;
    const int64_t value = m.get("value");
    switch (m.code) {
        case fourcc("RCsr"): p.engine.mixer.frecmusic.store(value ? 1 : 0); break;
        case fourcc("RCin"):
            if (!r.choose_input(static_cast<int>(value)))
                p.say("The input can be changed once it is stopped");
            break;
        case fourcc("RCfm"):
            r.recorder.samplermode = static_cast<uint16_t>(std::clamp<int64_t>(value, 0, 3));
            break;
        case fourcc("RCds"):
            r.recorder.soundrecoutput = value ? 1 : 0;
            file_ready(p, nullptr);
            break;
        case fourcc("RCgn"):
            r.recorder.vrvol = static_cast<int16_t>(std::clamp<int64_t>(value, 0, kMaxRecordGain));
            break;
        default: break;
    }
}

void cmd_choose_recording_file(Program& p, const ShellMessage&) {
    ask_for_file(p, nullptr);
}

void cmd_recording_file_chosen(Program& p, const ShellMessage& m) {
    if (m.refs.empty()) return;
    p.recording.choose_file(m.refs.front());
    p.recording.recorder.soundrecoutput = 1;
    p.run_after_file();
}

}  // namespace ondrel
