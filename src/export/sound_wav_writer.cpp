#include "export/sound_wav_writer.h"

#include "export/output_file.h"
#include "export/byte_writer.h"

namespace ondrel {

std::vector<uint8_t> sound_to_wav(const p_s& sound) {
    const int channels = sound.stereo ? 2 : 1;
    const int bytes_per_sample = sound.bits == 16 ? 2 : 1;
    const uint32_t length = sound.data ? sound.length : 0;
    ByteWriter w;
    const size_t riff = w.begin_chunk("RIFF");
    w.raw("WAVE", 4);
    const size_t fmt = w.begin_chunk("fmt ");
    w.u16le(1);  // PCM
    w.u16le(static_cast<uint16_t>(channels));
    w.u32le(sound.rate);
    w.u32le(sound.rate * static_cast<uint32_t>(channels * bytes_per_sample));
    w.u16le(static_cast<uint16_t>(channels * bytes_per_sample));
    w.u16le(static_cast<uint16_t>(bytes_per_sample * 8));
    w.end_chunk(fmt);
    const size_t data = w.begin_chunk("data");
    if (bytes_per_sample == 1) {
        for (uint32_t i = 0; i < length; ++i) w.u8(static_cast<uint8_t>(sound.data[i] ^ 0x80));
    } else {
        w.raw(sound.data, length);
    }
    w.end_chunk(data);
    if (length & 1) w.u8(0);  // chunks are padded to an even size
    w.end_chunk(riff);
    return std::move(w.bytes);
}

bool save_sound_wav(const std::string& path, const p_s& sound, std::string& why) {
    return write_output_file(path, sound_to_wav(sound), why);
}

}  // namespace ondrel
