#pragma once
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "record/capture_connection.h"
#include "record/capture_source.h"
#include "record/recorder.h"
#include "record/sound_consumer.h"
#include "song/alerts.h"

namespace ondrel {

// The recording gain's top: 128 is unity, and loud input above it wraps.
inline constexpr int kMaxRecordGain = 512;

// Makes the capture source of a device by name (empty: the default input).
using CaptureFactory = std::function<std::unique_ptr<CaptureSource>(const std::string& device)>;

// The program's recording: the capture node, its connection to the chosen input and the
// recorder, with what the recording panel chooses beyond the recorder's own options: the
// input, the file a disk recording goes to, and the directory new recordings are named in.
// Made before the sound device opens (the recorder installs itself in the mixer); the
// machine's inputs are given later, by the desktop program. Window thread only.
class Recording {
public:
    // directory: where new recordings are named until the user chooses another.
    Recording(Mixer& mixer, AlertSink* alerts, std::string directory);
    ~Recording();
    Recording(const Recording&) = delete;
    Recording& operator=(const Recording&) = delete;

    // The capture devices by name and how to open one. None: recording from the input is
    // not offered (recording the song's own output still is).
    void set_inputs(std::vector<std::string> devices, CaptureFactory factory);
    bool has_input() const { return !devices_.empty(); }
    // The chooser's entries: "Default Input", then the devices; empty without a device.
    std::vector<std::string> input_names() const;
    int chosen_input() const { return chosen_; }
    const std::string& chosen_input_name() const;
    // Chooses entry index of input_names(); false while the input is connected (monitoring
    // or recording from it) or for an entry that does not exist.
    bool choose_input(int index);
    bool choose_input(const std::string& name);
    bool input_connected() const { return connection_.connected(); }
    // Monitoring or recording: the source, the input and the format stay as they are.
    bool busy() const { return recorder.isRecording() || recorder.isMonitoring(); }

    // Where new recordings get their default names.
    std::string directory;
    // Gives disk recording a fresh "NewSound:N" file in the directory (NewTempName, trying
    // on past numbers already taken); false with why set when none can be made there.
    bool make_default_file(std::string& why);
    bool has_file() const { return !recorder.d2dref().empty(); }
    // The user chose the file: its directory becomes the recordings' directory, and an
    // unused default file is removed.
    void choose_file(const std::string& path);
    // A disk recording ended in the file: the next one gets a new default name.
    void file_used();
    // Removes the default file if nothing was recorded into it.
    void forget_default_file();

private:
    SoundConsumer node_;
    std::vector<std::string> devices_;
    CaptureFactory factory_;
    int chosen_ = 0;
    std::unique_ptr<CaptureSource> input_;
    CaptureConnection connection_;
    std::string default_file_;  // made by make_default_file, nothing recorded into it yet

public:
    // Last: made after, and gone before, the connection it records through.
    Recorder recorder;
};

}  // namespace ondrel
