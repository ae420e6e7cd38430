// Reader of MultiTracker modules: samples, order list, stored tracks and the pattern
// table that assembles them.
#include <algorithm>
#include <cstring>
#include <vector>

#include "import/module_preset.h"
#include "import/module_reader.h"

namespace ondrel {

namespace {

constexpr size_t kSampleHeader = 37;
constexpr size_t kTrackBytes = 192;  // 64 rows of 3-byte cells
constexpr int kMaxChannels = 32;     // the pattern table has 32 entries a pattern

TNOTE mtm_cell(const uint8_t* c) {
    TNOTE cell{};
    if (c[0] > 3) cell.note = static_cast<uint8_t>((c[0] >> 2) + 24);
    cell.instrument = static_cast<uint8_t>((c[0] & 3) * 16 + (c[1] >> 4));
    cell.command = c[1] & 15;
    cell.parameter = c[2];
    return cell;
}

void read_sample(ByteReader& file, const uint8_t* h, ModuleRead& out, int index) {
    ByteReader r(std::span<const uint8_t>(h, kSampleHeader));
    char name[23] = {};
    r.read(name, 22);
    const uint32_t wanted = r.u32le();
    const uint32_t loop_start = r.u32le();
    const uint32_t loop_end = r.u32le();
    const uint8_t finetune = r.u8();
    const int8_t volume = r.s8();
    const bool bits16 = r.u8() & 1;
    // Sized by what the file can hold, never by what a header claims.
    const uint32_t length = static_cast<uint32_t>(std::min<uint64_t>({wanted, kMaxSampleBytes, file.remaining()}));
    SampleRef s = make_sample(length);
    set_sample_name(*s, name[0] ? name : "None", 22);
    s->rate = 8363;
    s->refnote = 48;
    s->bits = bits16 ? 16 : 8;
    s->finetune = finetune & 15;
    s->volume = static_cast<int16_t>(volume * 2);
    if (length && file.read(s->data, length) < length) out.truncated = true;
    if (length < wanted) {
        out.truncated = true;
        file.skip(wanted - length);
    }
    // 8-bit data is stored unsigned; 16-bit data is little-endian, already native here.
    if (!bits16) make_signed8(s->data, length);
    const bool has_data = length != 0;
    s->loopon = loop_start == 0 ? (loop_end != 0 && has_data) : has_data;
    s->loopstart = loop_start;
    s->loopend = loop_end;
    if (uint64_t{loop_start} + loop_end == 0) {
        s->loopon = 0;
        s->loopstart = s->loopend = length;
    }
    bound_sample(*s);
    copy_loop_start_past_end(*s);
    out.song.samples[index] = std::move(s);
}

}  // namespace

bool read_mtm(ByteReader& file, ModuleRead& out) {
    uint8_t head[66] = {};
    // Without its mark the file could only be read as garbage: refused, the song kept.
    if (file.read(head, sizeof head) < sizeof head || std::memcmp(head, "MTM", 3) != 0) {
        out.error = "not a MultiTracker module (no MTM mark)";
        return false;
    }
    TMOD& m = *out.song.mod;
    preset_foreign_song(m, 1);
    char name[21] = {};
    std::memcpy(name, head + 4, 20);
    set_text(m.name, name, 20);
    const int stored_tracks = head[24] | head[25] << 8;
    const int patterns = head[26] + 1;
    m.nbpos = head[27] == 255 ? 255 : static_cast<uint8_t>(head[27] + 1);
    const int comment = head[28] | head[29] << 8;
    const int samples = head[30];
    m.nbtrack = static_cast<uint8_t>(std::clamp<int>(head[33], 1, kMaxChannels));

    std::vector<uint8_t> headers(kSampleHeader * static_cast<size_t>(samples));
    file.read(headers.data(), headers.size());
    file.read(m.sequence, 128);
    const size_t track_bytes = kTrackBytes * static_cast<size_t>(stored_tracks);
    const size_t kept = std::min(track_bytes, file.remaining());
    std::vector<uint8_t> tracks(kept);
    file.read(tracks.data(), kept);
    if (kept < track_bytes) {
        out.truncated = true;
        file.skip(track_bytes - kept);
    }
    std::vector<uint8_t> table(64 * static_cast<size_t>(patterns));
    if (file.read(table.data(), table.size()) < table.size()) out.truncated = true;
    // The comment is text for people; the song has no place for it.
    file.skip(static_cast<size_t>(comment));

    for (int p = 0; p < patterns && p < kPatternsPerSong; ++p) {
        PatternRef pat = make_pattern(m.nbtrack, 64);
        for (int c = 0; c < m.nbtrack; ++c) {
            const uint8_t* entry = &table[64 * static_cast<size_t>(p) + 2 * static_cast<size_t>(c)];
            const int track = entry[0] | entry[1] << 8;
            // Tracks the file does not hold leave the column clear.
            if (track == 0 || static_cast<size_t>(track) * kTrackBytes > tracks.size()) continue;
            const uint8_t* cells = &tracks[kTrackBytes * static_cast<size_t>(track - 1)];
            for (int r = 0; r < 64; ++r) pat->col[c][r] = mtm_cell(cells + 3 * r);
        }
        out.song.patterns[p] = std::move(pat);
    }
    for (int i = 0; i < samples && i < kSamplesPerSong; ++i)
        read_sample(file, &headers[kSampleHeader * static_cast<size_t>(i)], out, i);
    return true;
}

}  // namespace ondrel
