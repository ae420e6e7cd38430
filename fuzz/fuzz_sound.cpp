// Sound files of every kind the importer reads; the first byte picks the kind.
#include <cstddef>
#include <cstdint>
#include <span>
#include <string>

#include "import/sound_reader.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    if (size < 1) return 0;
    static const ondrel::SoundKind kinds[] = {ondrel::SoundKind::Avr, ondrel::SoundKind::Aiff, ondrel::SoundKind::Wav,
                                              ondrel::SoundKind::FixedHeader};
    const ondrel::SoundKind kind = kinds[data[0] % 4];
    ondrel::ByteReader file(std::span<const uint8_t>(data + 1, size - 1));
    ondrel::SampleRef sample;
    std::string why;
    if (ondrel::read_sound(file, kind, "/fuzz/sound.x", "sound.x", sample, why)) {
        // What was read must be inside the record.
        const ondrel::p_s& s = *sample;
        if (s.loopon && (s.loopend > s.length || s.loopstart > s.loopend)) __builtin_trap();
    }
    return 0;
}
