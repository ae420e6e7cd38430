#include "platform/sdl_capture.h"

#include <SDL.h>

namespace ondrel {

SdlCapture::SdlCapture(std::string device, int buffer_frames)
    : device_(std::move(device)),
      name_(device_.empty() ? kDefaultInputName : device_),
      buffer_frames_(buffer_frames) {}

SdlCapture::~SdlCapture() {
    close();
}

bool SdlCapture::open(CaptureSink& sink, std::string& why) {
    if (device_id_) return true;
    if (SDL_InitSubSystem(SDL_INIT_AUDIO) != 0) {
        why = std::string("no sound input: ") + SDL_GetError();
        return false;
    }
    SDL_AudioSpec want{};
    want.freq = 44100;
    want.format = AUDIO_S16SYS;
    want.channels = 2;
    want.samples = static_cast<Uint16>(buffer_frames_);
    want.callback = &SdlCapture::callback;
    want.userdata = this;
    SDL_AudioSpec have{};
    sink_ = &sink;
    frames_.store(0, std::memory_order_relaxed);
    // No changes allowed: SDL converts whatever the device gives to this format.
    device_id_ = SDL_OpenAudioDevice(device_.empty() ? nullptr : device_.c_str(), 1, &want, &have, 0);
    if (device_id_ == 0) {
        why = "cannot open the sound input " + name_ + ": " + SDL_GetError();
        SDL_QuitSubSystem(SDL_INIT_AUDIO);
        return false;
    }
    SDL_PauseAudioDevice(device_id_, 0);
    return true;
}

void SdlCapture::close() {
    if (!device_id_) return;
    SDL_CloseAudioDevice(device_id_);
    device_id_ = 0;
    SDL_QuitSubSystem(SDL_INIT_AUDIO);
}

int64_t SdlCapture::now_us() const {
    return frames_.load(std::memory_order_acquire) * 1000000 / 44100;
}

void SdlCapture::callback(void* self, uint8_t* stream, int len) {
    auto* capture = static_cast<SdlCapture*>(self);
    const int64_t start = capture->frames_.load(std::memory_order_relaxed);
    capture->sink_->deliver(reinterpret_cast<const int16_t*>(stream), static_cast<size_t>(len),
                            start * 1000000 / 44100);
    capture->frames_.store(start + len / 4, std::memory_order_release);
}

std::vector<std::string> capture_device_names(std::string* why) {
    std::vector<std::string> names;
    if (SDL_InitSubSystem(SDL_INIT_AUDIO) != 0) {
        if (why) *why = SDL_GetError();
        return names;
    }
    const int count = SDL_GetNumAudioDevices(1);
    for (int i = 0; i < count; ++i)
        if (const char* name = SDL_GetAudioDeviceName(i, 1)) names.emplace_back(name);
    if (count <= 0 && why) *why = count < 0 ? SDL_GetError() : "no capture device";
    SDL_QuitSubSystem(SDL_INIT_AUDIO);
    return names;
}

}  // namespace ondrel
