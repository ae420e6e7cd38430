#pragma once
#include <cstdint>
#include <string>

#include "render/mixer.h"
#include "song/structure_lock.h"

namespace ondrel {

// The sound card: an SDL2 audio device at 44100 Hz, stereo float, whose callback calls
// BufferProc. Its device lock is the structure lock of the song bank while it is open.
class SdlAudioOutput final : public StructureLock {
public:
    SdlAudioOutput(Mixer& mixer, Player& player, SongBank& bank);
    ~SdlAudioOutput() override;
    SdlAudioOutput(const SdlAudioOutput&) = delete;
    SdlAudioOutput& operator=(const SdlAudioOutput&) = delete;

    // Opens and starts the device; false with why set (one line) when there is none.
    bool open(int buffer_frames, std::string& why);
    void close();
    bool is_open() const { return device_ != 0; }
    const char* driver() const;

    void lock() override;
    void unlock() override;

private:
    static void callback(void* self, uint8_t* stream, int len);

    Mixer& mixer_;
    Player& player_;
    SongBank& bank_;
    uint32_t device_ = 0;
    AudioFormat format_;
    std::string driver_ = "none";
};

}  // namespace ondrel
