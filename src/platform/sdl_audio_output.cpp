#include "platform/sdl_audio_output.h"

#include <SDL.h>
#include <fcntl.h>
#include <unistd.h>

namespace ondrel {

SdlAudioOutput::SdlAudioOutput(Mixer& mixer, Player& player, SongBank& bank)
    : mixer_(mixer), player_(player), bank_(bank) {}

SdlAudioOutput::~SdlAudioOutput() {
    close();
}

namespace {
// The sound libraries under SDL print their own complaints while they probe for a card;
// the one line we print says it better.
class QuietStderr {
public:
    QuietStderr() : saved_(::dup(2)) {
        const int null = ::open("/dev/null", O_WRONLY);
        if (null >= 0) {
            ::dup2(null, 2);
            ::close(null);
        }
    }
    ~QuietStderr() {
        if (saved_ >= 0) {
            ::dup2(saved_, 2);
            ::close(saved_);
        }
    }
    QuietStderr(const QuietStderr&) = delete;
    QuietStderr& operator=(const QuietStderr&) = delete;

private:
    int saved_;
};
}  // namespace

bool SdlAudioOutput::open(int buffer_frames, std::string& why) {
    if (device_) return true;
    QuietStderr quiet;
    const auto refuse = [&why] {
        why = std::string("no sound device could be opened (") + SDL_GetError() +
              "); 'ondrel render' writes the song to a WAV file instead";
        return false;
    };
    if (SDL_InitSubSystem(SDL_INIT_AUDIO) != 0) return refuse();
    SDL_AudioSpec want{};
    want.freq = 44100;
    want.format = AUDIO_F32SYS;
    want.channels = 2;
    want.samples = static_cast<Uint16>(buffer_frames);
    want.callback = &SdlAudioOutput::callback;
    want.userdata = this;
    SDL_AudioSpec have{};
    device_ = SDL_OpenAudioDevice(nullptr, 0, &want, &have, 0);
    if (device_ == 0) {
        refuse();
        SDL_QuitSubSystem(SDL_INIT_AUDIO);
        return false;
    }
    format_ = AudioFormat{static_cast<float>(have.freq), have.channels, kFormatFloat};
    const char* driver = SDL_GetCurrentAudioDriver();
    driver_ = driver ? driver : "unknown";
    bank_.set_structure_lock(this);
    player_.audio_running = true;
    SDL_PauseAudioDevice(device_, 0);
    return true;
}

void SdlAudioOutput::close() {
    if (!device_) return;
    player_.audio_running = false;
    SDL_CloseAudioDevice(device_);
    device_ = 0;
    bank_.set_structure_lock(nullptr);
    SDL_QuitSubSystem(SDL_INIT_AUDIO);
}

const char* SdlAudioOutput::driver() const {
    return driver_.c_str();
}

void SdlAudioOutput::lock() {
    if (device_) SDL_LockAudioDevice(device_);
}

void SdlAudioOutput::unlock() {
    if (device_) SDL_UnlockAudioDevice(device_);
}

void SdlAudioOutput::callback(void* self, uint8_t* stream, int len) {
    auto* out = static_cast<SdlAudioOutput*>(self);
    out->mixer_.BufferProc(nullptr, stream, static_cast<unsigned long>(len), out->format_);
}

}  // namespace ondrel
