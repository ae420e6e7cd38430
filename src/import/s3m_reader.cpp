// Reader of S3M modules: header, orders, packed patterns with their commands converted to
// the MOD numbering, and the samples.
#include <algorithm>
#include <array>
#include <cstring>
#include <vector>

#include "import/module_preset.h"
#include "import/module_reader.h"

namespace ondrel {

namespace {

constexpr size_t kPackedPatternMax = 16384;

// The commands D, E, F and G remember per track what they stored; an info byte of 0
// takes it back.
struct Remembered {
    uint8_t command = 0;
    uint8_t parameter = 0;
    bool set = false;
};

// Converts one S3M command into the cell. Returns false when the info byte was not
// taken (S6x and SAx): it is then read again as the next channel byte of the row.
bool convert_command(int number, uint8_t info, TNOTE& cell, Remembered& memory) {
    const int hi = info >> 4;
    const int lo = info & 15;
    auto keep = [&](int command, int parameter) {
        cell.command = static_cast<uint8_t>(command);
        cell.parameter = static_cast<uint8_t>(parameter);
    };
    auto remembering = [&](int command, int parameter) {
        if (info == 0 && memory.set) {
            keep(memory.command, memory.parameter);
            return;
        }
        keep(command, parameter);
        memory = {cell.command, cell.parameter, true};
    };
    switch (number) {
        case 1:   // A set speed
        case 20:  // T set tempo
            keep(15, info);
            break;
        case 2: keep(11, info); break;  // B jump
        case 3: keep(13, info); break;  // C break
        case 4:                         // D volume slides
            if (hi == 15 && info != 0)
                remembering(14, 176 + lo);
            else if (lo == 15)
                remembering(14, 160 + hi);
            else
                remembering(10, info);
            break;
        case 5:  // E slide down
            if (hi == 14) break;
            if (hi == 15)
                remembering(14, 32 + lo);
            else
                remembering(2, info);
            break;
        case 6:  // F slide up
            if (hi == 14) break;
            if (hi == 15)
                remembering(14, 16 + lo);
            else
                remembering(1, info);
            break;
        case 7: remembering(3, info); break;  // G tone portamento
        case 8: keep(4, info); break;         // H vibrato
        case 10: keep(0, info); break;        // J arpeggio
        case 11: keep(6, info); break;        // K vibrato + volume slide
        case 12: keep(5, info); break;        // L portamento + volume slide
        case 15: keep(9, info); break;        // O sample offset
        case 19:                              // S
            switch (hi) {
                case 2: keep(14, 80 + lo); break;
                case 11: keep(14, 96 + lo); break;
                case 8: keep(8, 16 * lo); break;
                case 6:
                case 10:
                    // The command becomes 0 and the info byte is read again as the next
                    // channel byte: songs are read this way, so it stays.
                    keep(0, 0);
                    return false;
                default: keep(14, info); break;
            }
            break;
        case 22: keep(16, info); break;  // V global volume
        default: break;                  // not carried over
    }
    return true;
}

void unpack_pattern(ByteReader& b, Pattern& pat, int tracks, std::array<Remembered, kTracks>& memory) {
    for (int row = 0; row < 64 && !b.at_end(); ++row) {
        for (;;) {
            const uint8_t what = b.u8();
            if (what == 0 || b.truncated()) break;
            const int channel = what & 31;
            const bool ours = channel < tracks;
            TNOTE scratch{};
            TNOTE& cell = ours ? pat.col[channel][row] : scratch;
            if (what & 32) {
                const uint8_t note = b.u8();
                const uint8_t instrument = b.u8();
                if (!(note & 0x80))
                    cell.note = static_cast<uint8_t>(12 * ((note + 1) >> 4) + ((note + 1) & 15) - 1);
                cell.instrument = instrument;
            }
            if (what & 64) cell.volume = static_cast<uint8_t>(2 * b.u8() + 1);
            if (what & 128) {
                const uint8_t number = b.u8();
                const size_t info_at = b.tell();
                const uint8_t info = b.u8();
                if (ours && !convert_command(number, info, cell, memory[channel])) b.seek(info_at);
            }
        }
    }
}

// Reads the sample of an instrument header: lengths and loop points count frames; 8-bit
// data is unsigned unless the header says signed; stereo data keeps its left half before
// its right half and is interleaved here.
void read_sample(ByteReader& file, const uint8_t* h, bool unsigned_data, ModuleRead& out, int index) {
    ByteReader r(std::span<const uint8_t>(h, 80));
    const uint8_t type = r.u8();
    r.seek(13);
    const uint32_t memseg = uint32_t{r.u8()} << 16 | r.u16le();
    r.seek(16);
    const uint32_t frames = r.u32le();
    const uint32_t loop_start = r.u32le();
    const uint32_t loop_end = r.u32le();
    const int8_t volume = r.s8();
    r.seek(31);
    const uint8_t flags = r.u8();
    const uint32_t rate = r.u32le() & 0xffff;
    char name[29] = {};
    r.seek(48);
    r.read(name, 28);

    const bool stereo = flags & 2;
    const bool bits16 = flags & 4;
    const uint32_t frame_bytes = (bits16 ? 2u : 1u) * (stereo ? 2u : 1u);
    // Adlib and empty instruments have no sample data.
    const uint64_t wanted = type == 1 ? uint64_t{frames} * frame_bytes : 0;
    // Sized by what the file can hold after the data's start, never by what a header claims.
    const size_t data_at = size_t{memseg} * 16;
    const uint64_t there = data_at < file.size() ? file.size() - data_at : 0;
    const uint32_t length = static_cast<uint32_t>(std::min<uint64_t>({wanted, kMaxSampleBytes, there}));
    SampleRef s = make_sample(length);
    set_sample_name(*s, name[0] ? name : "None", 28);
    s->rate = rate;
    s->bits = bits16 ? 16 : 8;
    s->stereo = stereo;
    s->volume = static_cast<int16_t>(volume * 2);
    s->refnote = 48;  // C-4 (byte 64) plays the data at its own rate, as for MOD samples
    if (length) {
        std::vector<uint8_t> raw(length);
        file.seek(data_at);
        if (file.read(raw.data(), length) < length || length < wanted) out.truncated = true;
        const uint32_t sample_bytes = bits16 ? 2 : 1;
        const uint32_t channel_bytes = length / (stereo ? 2 : 1);
        for (uint32_t i = 0; i * sample_bytes < channel_bytes; ++i)
            for (uint32_t c = 0; c < (stereo ? 2u : 1u); ++c)
                for (uint32_t k = 0; k < sample_bytes; ++k) {
                    const uint32_t from = c * channel_bytes + i * sample_bytes + k;
                    const uint32_t to = (i * (stereo ? 2 : 1) + c) * sample_bytes + k;
                    if (from < length && to < length) s->data[to] = raw[from];
                }
        // Little-endian 16-bit data is already in native order here.
        if (unsigned_data) {
            if (bits16)
                for (uint32_t i = 1; i < length; i += 2) s->data[i] ^= 0x80;
            else
                make_signed8(s->data, length);
        }
    }
    if (length < wanted) out.truncated = true;
    s->loopon = (flags & 1) ? 1 : 0;
    s->loopstart = loop_start * frame_bytes;
    s->loopend = loop_end * frame_bytes;
    if (loop_end < loop_start || loop_end - loop_start < 4) s->loopon = 0;
    if (uint64_t{loop_start} + loop_end == 0) {
        s->loopon = 0;
        s->loopstart = s->loopend = length;
    }
    bound_sample(*s);
    out.song.samples[index] = std::move(s);
}

}  // namespace

bool read_s3m(ByteReader& file, ModuleRead& out) {
    uint8_t head[96] = {};
    if (file.read(head, sizeof head) < sizeof head) {
        out.error = "too short to be a Scream Tracker module";
        return false;
    }
    // Without its mark the file could only be read as garbage: refused, the song kept.
    if (std::memcmp(head + 44, "SCRM", 4) != 0) {
        out.error = "not a Scream Tracker module (no SCRM mark)";
        return false;
    }
    TMOD& m = *out.song.mod;
    preset_foreign_song(m, 2);
    char name[29] = {};
    std::memcpy(name, head, 28);
    set_text(m.name, name, 28);
    const int orders = head[32] | head[33] << 8;
    const int instruments = head[34] | head[35] << 8;
    const int patterns = head[36] | head[37] << 8;
    const bool unsigned_data = (head[42] | head[43] << 8) != 1;
    // Speed 0 means "not set" in these files: the preset stays.
    if (head[49]) m.speed = head[49];
    if (head[50]) m.tempo = 60000000u / head[50];
    int tracks = 0;
    for (int c = 0; c < 32; ++c) tracks += head[64 + c] < 255;
    m.nbtrack = static_cast<uint8_t>(std::clamp(tracks, 1, 32));

    std::vector<uint8_t> order(static_cast<size_t>(orders));
    file.read(order.data(), order.size());
    int nbpos = 0;
    for (uint8_t o : order) {
        if (o == 255) break;
        if (o == 254 || nbpos >= 255) continue;
        m.sequence[nbpos++] = o;
    }
    m.nbpos = static_cast<uint8_t>(nbpos);
    std::vector<uint16_t> instrument_at(static_cast<size_t>(instruments));
    for (auto& p : instrument_at) p = file.u16le();
    std::vector<uint16_t> pattern_at(static_cast<size_t>(patterns));
    for (auto& p : pattern_at) p = file.u16le();

    std::array<Remembered, kTracks> memory{};
    uint16_t pointer = 0;
    std::vector<uint8_t> packed(kPackedPatternMax);
    for (int pos = 0; pos < nbpos; ++pos) {
        const int p = m.sequence[pos];
        if (p < patterns) pointer = pattern_at[static_cast<size_t>(p)];
        if (pointer == 0 || p >= patterns || p >= kPatternsPerSong) continue;
        file.seek(size_t{pointer} * 16);
        const size_t length = std::min<size_t>(file.u16le(), kPackedPatternMax);
        const size_t got = file.read(packed.data(), length);
        if (got < length) out.truncated = true;
        PatternRef pat = make_pattern(m.nbtrack, 64);
        ByteReader cells(std::span<const uint8_t>(packed.data(), got));
        unpack_pattern(cells, *pat, m.nbtrack, memory);
        out.song.patterns[p] = std::move(pat);
    }

    for (int i = 0; i < instruments && i < kSamplesPerSong; ++i) {
        if (instrument_at[static_cast<size_t>(i)] == 0) continue;
        uint8_t header[80] = {};
        file.seek(size_t{instrument_at[static_cast<size_t>(i)]} * 16);
        if (file.read(header, sizeof header) < sizeof header) out.truncated = true;
        read_sample(file, header, unsigned_data, out, i);
    }
    return true;
}

}  // namespace ondrel
