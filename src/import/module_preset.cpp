#include "import/module_preset.h"

#include <cstring>

namespace ondrel {

void preset_foreign_song(TMOD& m, int format) {
    reset_track_tables(m);
    for (auto& r : m.rows) r = 64;
    std::memset(m.sequence, 0, sizeof m.sequence);
    m.tempo = 480000;
    m.speed = 6;
    m.globalvol = 64;
    m.format = static_cast<int16_t>(format);
    m.repeat = 0;
}

void make_signed8(uint8_t* data, uint32_t bytes) {
    for (uint32_t i = 0; i < bytes; ++i) data[i] ^= 0x80;
}

void copy_loop_start_past_end(p_s& s) {
    if (!s.loopon || !s.data) return;
    // The slack after the data holds the copies when the loop ends at the data's end.
    for (uint32_t i = 0; i < 3; ++i)
        if (s.loopend + i < s.length + kSampleSlack && s.loopstart + i < s.length + kSampleSlack)
            s.data[s.loopend + i] = s.data[s.loopstart + i];
}

}  // namespace ondrel
