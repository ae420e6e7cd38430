#include "shell/recording.h"

#include <cstdio>
#include <cstring>
#include <filesystem>

#include "platform/sdl_capture.h"
#include "record/temp_name.h"

namespace ondrel {

namespace fs = std::filesystem;

namespace {
// NewTempName gives up after 26 names in a row that are taken; its counter has moved on by
// then, so asking again tries the next 26. A directory of a thousand earlier recordings
// still gets a name.
constexpr int kNameRounds = 40;
}  // namespace

Recording::Recording(Mixer& mixer, AlertSink* alerts, std::string start_directory)
    : directory(std::move(start_directory)),
      connection_(node_, nullptr),
      recorder(mixer, alerts, &connection_) {}

Recording::~Recording() {
    forget_default_file();
}

void Recording::set_inputs(std::vector<std::string> devices, CaptureFactory factory) {
    if (busy()) return;
    devices_ = std::move(devices);
    factory_ = std::move(factory);
    chosen_ = 0;
    input_.reset();
    if (has_input() && factory_) input_ = factory_("");
    connection_.set_input(input_.get());
}

std::vector<std::string> Recording::input_names() const {
    if (devices_.empty()) return {};
    std::vector<std::string> names{kDefaultInputName};
    names.insert(names.end(), devices_.begin(), devices_.end());
    return names;
}

const std::string& Recording::chosen_input_name() const {
    static const std::string kDefault = kDefaultInputName;
    return chosen_ > 0 ? devices_[size_t(chosen_ - 1)] : kDefault;
}

bool Recording::choose_input(int index) {
    if (connection_.connected() || busy() || index < 0 || size_t(index) > devices_.size() || !factory_)
        return false;
    if (index == chosen_ && input_) return true;
    connection_.set_input(nullptr);
    input_ = factory_(index == 0 ? std::string() : devices_[size_t(index - 1)]);
    chosen_ = index;
    connection_.set_input(input_.get());
    return true;
}

bool Recording::choose_input(const std::string& name) {
    const auto names = input_names();
    for (size_t i = 0; i < names.size(); ++i)
        if (names[i] == name) return choose_input(int(i));
    return false;
}

bool Recording::make_default_file(std::string& why) {
    std::string path;
    int e = -1;
    for (int round = 0; round < kNameRounds && e == -1; ++round)
        e = NewTempName(directory, recorder.temp_name_counter(), path);
    if (e != 0) {
        why = "cannot make a file for the recording in " + directory + ": " +
              (e == -1 ? std::string("every name tried is taken") : std::string(std::strerror(e)));
        return false;
    }
    forget_default_file();
    default_file_ = path;
    recorder.set_d2dref(path);
    return true;
}

void Recording::choose_file(const std::string& path) {
    if (path != default_file_) forget_default_file();
    recorder.set_d2dref(path);
    const fs::path parent = fs::path(path).parent_path();
    if (!parent.empty()) directory = parent.string();
}

void Recording::file_used() {
    if (recorder.d2dref() == default_file_) default_file_.clear();
    recorder.set_d2dref("");
}

void Recording::forget_default_file() {
    if (default_file_.empty()) return;
    std::error_code ec;
    if (fs::is_regular_file(default_file_, ec) && fs::file_size(default_file_, ec) == 0)
        fs::remove(default_file_, ec);
    if (recorder.d2dref() == default_file_) recorder.set_d2dref("");
    default_file_.clear();
}

}  // namespace ondrel
