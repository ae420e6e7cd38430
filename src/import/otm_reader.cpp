// Reader of the native chunked module format, older big-endian and newer little-endian
// layouts.
#include <algorithm>
#include <cstring>
#include <vector>

#include "import/module_reader.h"

namespace ondrel {

namespace {

constexpr uint32_t id(const char (&s)[5]) {
    return uint32_t(uint8_t(s[0])) << 24 | uint32_t(uint8_t(s[1])) << 16 | uint32_t(uint8_t(s[2])) << 8 |
           uint32_t(uint8_t(s[3]));
}

constexpr size_t kInstShortHeader = 50;
constexpr size_t kInstLongHeader = 52;

struct OtmState {
    ModuleRead& out;
    TMOD& m;
    bool little = false;  // chunk lengths are little-endian once "o.t." is met
    int layout = 0;       // pattern layout set by "PATT"
    int nbpos, repeat, nbtrack;
    std::vector<uint8_t> inst;  // the "INST" chunk, kept whole
    size_t inst_header = 0;     // next unread header
    size_t inst_count = 0;
    size_t inst_size = kInstShortHeader;
    size_t inst_first = 2;

    explicit OtmState(ModuleRead& o)
        : out(o), m(*o.song.mod), nbpos(m.nbpos), repeat(m.repeat), nbtrack(m.nbtrack) {}

    int speed_divisor() const { return m.speed > 0 ? m.speed : 1; }
};

// Reads n 16-bit values; false (and nothing stored) when the chunk ends first.
template <typename T>
bool read_words(ByteReader& r, T* out, int n, bool little) {
    std::vector<uint8_t> raw(static_cast<size_t>(n) * 2);
    if (r.read(raw.data(), raw.size()) != raw.size()) return false;
    for (int i = 0; i < n; ++i) {
        const uint8_t a = raw[2 * i], b = raw[2 * i + 1];
        out[i] = static_cast<T>(little ? (b << 8 | a) : (a << 8 | b));
    }
    return true;
}

template <typename T>
bool read_dwords_le(ByteReader& r, T* out, int n) {
    std::vector<uint8_t> raw(static_cast<size_t>(n) * 4);
    if (r.read(raw.data(), raw.size()) != raw.size()) return false;
    for (int i = 0; i < n; ++i) {
        const uint8_t* p = &raw[4 * i];
        out[i] = static_cast<T>(uint32_t{p[3]} << 24 | uint32_t{p[2]} << 16 | uint32_t{p[1]} << 8 | p[0]);
    }
    return true;
}

void chunk_OT(OtmState& st, ByteReader& b) {
    b.skip(6);
    const uint16_t speed = b.u16be();
    const uint16_t bpm = b.u16be();
    if (b.truncated()) return;
    if (speed) st.m.speed = static_cast<int16_t>(speed);
    if (bpm) st.m.tempo = 60000000u / bpm;
    b.skip(4);
    char name[65] = {};
    b.read(name, 64);
    set_text(st.m.name, name, 63);
}

void chunk_SQ(OtmState& st, ByteReader& b) {
    const uint16_t positions = b.u16be();
    const uint16_t repeat = b.u16be();
    if (b.truncated()) return;
    b.skip(4);
    st.nbpos = std::min<int>(positions, 255);
    st.repeat = std::min<int>(repeat, 255);
    const size_t n = std::min<size_t>(positions, kPositions);
    b.read(st.m.sequence, n);
}

void chunk_PATT(OtmState& st, ByteReader& b) {
    const uint16_t tracks = b.u16be();
    b.skip(2);
    char tag[4];
    b.read(tag, 4);
    st.nbtrack = std::clamp<int>(tracks, 1, kTracks);
    if (std::memcmp(tag, "2.04", 4) == 0)
        st.layout = 1;
    else if (std::memcmp(tag, "2.05", 4) == 0)
        st.layout = 2;
    else if (std::memcmp(tag, "2.06", 4) == 0)
        st.layout = 3;
    else
        st.layout = 0;
}

void chunk_INST(OtmState& st, ByteReader& b) {
    st.inst.assign(b.size() + 256, 0);
    b.read(st.inst.data(), b.size());
    const uint16_t word = static_cast<uint16_t>(st.inst[0] << 8 | st.inst[1]);
    const bool long_form = word & 0x8000;
    st.inst_size = long_form ? kInstLongHeader : kInstShortHeader;
    st.inst_first = long_form ? 4 : 2;
    const size_t fit = b.size() > st.inst_first ? (b.size() - st.inst_first) / st.inst_size : 0;
    st.inst_count = std::min<size_t>(word & 0x7fff, fit);
    st.inst_header = 0;
}

void chunk_OAIT(OtmState& st, ByteReader& b) {
    const uint16_t number = b.u16be();
    if (number >= 256 || st.inst_header >= st.inst_count) return;
    ByteReader h(std::span<const uint8_t>(st.inst.data() + st.inst_first + st.inst_header * st.inst_size,
                                          st.inst_size));
    ++st.inst_header;
    // The headers are per song (128 slots); higher numbers have no slot to go to.
    if (number >= kSamplesPerSong) return;
    h.skip(4);
    const uint32_t length = h.u32be();
    const int8_t finetune = h.s8();
    const int8_t volume = h.s8();
    const uint32_t loopstart = h.u32be();
    const uint32_t looplen = h.u32be();
    char name[23] = {};
    h.read(name, 22);
    const uint16_t format = h.u16be();
    const uint16_t refnote = h.u16be();
    h.skip(2);
    const uint32_t rate = h.u32be();

    const uint32_t avail = static_cast<uint32_t>(std::min<size_t>(b.remaining(), kMaxSampleBytes));
    const uint32_t bytes = std::min(length, avail);
    if (bytes < length) st.out.truncated = true;
    SampleRef s = make_sample(bytes);
    b.read(s->data, bytes);
    s->rate = rate;
    s->finetune = finetune;
    s->volume = static_cast<int16_t>(volume * 2);
    s->loopstart = loopstart;
    s->loopend = loopstart + looplen;
    set_sample_name(*s, name, 22);
    s->bits = static_cast<int16_t>(format & 0xff);
    s->stereo = (format & 0x0800) ? 1 : 0;
    s->refnote = static_cast<int16_t>(refnote);
    // The loop test uses the loop start, not the loop length: kept as the format has it.
    s->loopon = (length != 0 && int64_t{length} - loopstart > 3) ? 1 : 0;
    if (s->bits == 16)
        for (uint32_t i = 0; i + 1 < bytes; i += 2) std::swap(s->data[i], s->data[i + 1]);
    // The file's rule (1 for 16 bits, doubled for stereo) gives 0 for 8-bit stereo;
    // bound_sample sets the true frame shift, 1, so such data is never read past its end.
    bound_sample(*s);
    st.out.song.samples[number] = std::move(s);
}

// Layout 1: four bytes a cell, row after row.
void oapt_cells(OtmState& st, ByteReader& b, Pattern& p, int rows) {
    for (int r = 0; r < rows; ++r) {
        for (int t = 0; t < st.nbtrack; ++t) {
            if (b.remaining() < 4) return;
            uint8_t c[4];
            b.read(c, 4);
            TNOTE& cell = p.col[t][r];
            cell.note = c[0] ? static_cast<uint8_t>((c[0] & 15) + 12 * (c[0] >> 4) - 1) : 0;
            cell.volume = static_cast<uint8_t>((c[1] >> 2) * 2);
            cell.instrument = static_cast<uint8_t>((c[1] & 3) * 16 + (c[2] >> 4));
            cell.command = c[2] & 15;
            cell.parameter = c[3];
        }
    }
}

// Layouts 2 and 3: per track a byte count, then 6-byte events placed by tick.
void oapt_events(OtmState& st, ByteReader& b, Pattern& p, int rows) {
    const int speed = st.speed_divisor();
    for (int t = 0; t < st.nbtrack && !b.at_end(); ++t) {
        size_t len = b.u16be();
        ByteReader track = b.sub(len);
        if (len & 1) b.skip(1);
        if (len == 0) continue;  // the column is already clear
        int tick = 0;
        if (st.layout == 3) {
            track.skip(5);
            tick = track.s8();
        }
        int prev_row = -1;
        uint8_t e[6];
        while (track.remaining() >= 6) {
            track.read(e, 6);
            const int delta = static_cast<int8_t>(e[5]);
            if (e[0] & 0x80) {
                tick += delta;
                continue;
            }
            const int row = tick / speed;
            if (row >= rows) break;
            if (row >= 0 && tick % speed == 0 && row != prev_row) {
                TNOTE& cell = p.col[t][row];
                cell = {e[0], static_cast<uint8_t>(e[1] * 2), 0, e[2], e[3], e[4]};
            }
            prev_row = row;
            tick += delta;
        }
    }
}

void chunk_OAPT(OtmState& st, ByteReader& b) {
    b.skip(4);
    const uint16_t number = b.u16be();
    const uint16_t count = b.u16be();
    if (b.truncated() || number >= kPatternsPerSong) return;
    const int rows = std::clamp<int>(st.layout >= 2 ? count / st.speed_divisor() : count, 1, kMaxRows);
    st.m.rows[number] = static_cast<int16_t>(rows);
    PatternRef p = make_pattern(st.nbtrack, rows);
    if (st.layout == 1) {
        oapt_cells(st, b, *p, rows);
    } else if (st.layout >= 2) {
        b.skip(4);
        oapt_events(st, b, *p, rows);
    }
    st.out.song.patterns[number] = std::move(p);
}

void chunk_SV19(OtmState& st, ByteReader& b) {
    if (b.size() <= 309) return;
    b.seek(86);
    st.m.globalvol = static_cast<int16_t>(b.u16be());
    b.seek(216);
    for (int t = 0; t < 32; ++t) {
        const uint16_t pan = static_cast<uint16_t>(b.u16be() * 2);
        st.m.trackpan[t] = st.m.trackpan2[t] = pan;
    }
}

// The newer song block; each group is stored only when it was read whole.
void chunk_ot(OtmState& st, ByteReader& b) {
    TMOD& m = st.m;
    const uint16_t version = b.u16le();
    const uint16_t format = b.u16le();
    const uint16_t globalvol = b.u16le();
    const uint16_t speed = b.u16le();
    const uint32_t tempo = b.u32le();
    const uint16_t positions = b.u16le();
    const uint16_t repeat = b.u16le();
    if (b.truncated()) return;
    m.format = static_cast<int16_t>(format);
    m.globalvol = static_cast<int16_t>(globalvol);
    m.speed = static_cast<int16_t>(speed);
    m.tempo = tempo;
    st.nbpos = std::min<int>(positions, 255);
    st.repeat = std::min<int>(repeat, 255);
    uint8_t seq[kPositions];
    const size_t n = std::min<size_t>(positions, kPositions);
    if (b.read(seq, n) < n) return;
    std::memcpy(m.sequence, seq, n);
    b.skip(positions - n);
    char name[65] = {};
    if (b.read(name, 64) < 64) return;
    set_text(m.name, name, 63);
    uint16_t pan[kTracks];
    if (!read_words(b, pan, kTracks, true)) return;
    std::copy(pan, pan + kTracks, m.trackpan);
    std::copy(pan, pan + kTracks, m.trackpan2);
    if (!read_words(b, m.trackc, kTracks, true)) return;
    if (!read_words(b, m.trackvol, kTracks, true)) return;
    if (!read_words(b, m.tracke, kTracks, true)) return;
    if (version < 1) return;
    if (!read_words(b, m.trackpan2, kTracks, true)) return;
    if (!read_words(b, m.nbvoice, kTracks, true)) return;
    uint8_t block[sizeof m.trackblock];
    if (b.read(block, sizeof block) < sizeof block) return;
    std::memcpy(m.trackblock, block, sizeof block);
    if (!read_words(b, m.trackword1, kTracks, true)) return;
    if (!read_words(b, m.trackd, kTracks, true)) return;
    if (!read_words(b, m.trackf, kTracks, true)) return;
    int32_t marks[kPatternsPerSong * kMarksPerPattern * 2];
    if (!read_dwords_le(b, marks, static_cast<int>(std::size(marks)))) return;
    for (int p = 0; p < kPatternsPerSong; ++p)
        for (int k = 0; k < kMarksPerPattern; ++k)
            m.patmark[p][k] = {marks[(p * kMarksPerPattern + k) * 2],
                               marks[(p * kMarksPerPattern + k) * 2 + 1]};
    // Block A: the per-slot auto-pan bytes, then 100 bytes that block B overwrites.
    uint8_t block_a[200];
    if (b.read(block_a, sizeof block_a) < sizeof block_a) return;
    std::memcpy(m.efxflag, block_a, kEffectSlots);
    if (!read_words(b, m.efxa, kEffectSlots, true)) return;
    if (!read_words(b, m.efxb, kEffectSlots, true)) return;
    if (!read_words(b, m.efxc, kEffectSlots, true)) return;
    read_dwords_le(b, m.efxval, kEffectSlots);
}

void chunk_inst(OtmState& st, ByteReader& b) {
    const uint16_t number = b.u16le();
    char name[33] = {};
    b.read(name, 32);
    const uint32_t length = b.u32le();
    const uint32_t loopstart = b.u32le();
    const uint32_t loopend = b.u32le();
    const uint32_t rate = b.u32le();
    const uint16_t bits = b.u16le();
    const uint16_t refnote = b.u16le();
    const uint8_t stereo = b.u8();
    const uint8_t flag2 = b.u8();
    const uint16_t loopon = b.u16le();
    const uint16_t volume = b.u16le();
    const uint16_t level = b.u16le();
    const uint16_t finetune = b.u16le();
    const uint16_t flagword = b.u16le();
    uint16_t env[kEnvelopeKinds * kEnvelopePoints];
    read_words(b, env, kEnvelopeKinds * kEnvelopePoints, true);
    const uint32_t setting = b.u32le();
    if (b.truncated() || number >= kSamplesPerSong) return;

    const uint32_t avail = static_cast<uint32_t>(std::min<size_t>(b.remaining(), kMaxSampleBytes));
    const uint32_t bytes = std::min(length, avail);
    if (bytes < length) st.out.truncated = true;
    SampleRef s = make_sample(bytes);
    b.read(s->data, bytes);
    set_sample_name(*s, name, 32);
    s->loopstart = loopstart;
    s->loopend = loopend;
    s->rate = rate;
    s->bits = static_cast<int16_t>(bits);
    s->refnote = static_cast<int16_t>(refnote);
    s->stereo = stereo;
    s->flag2 = flag2;
    s->loopon = loopon;
    s->volume = static_cast<int16_t>(volume);
    s->level = static_cast<int16_t>(level);
    s->finetune = static_cast<int16_t>(finetune);
    s->flagword = flagword;
    // The file keeps envelope after envelope; the record keeps point after point.
    for (int k = 0; k < kEnvelopeKinds; ++k)
        for (int j = 0; j < kEnvelopePoints; ++j) s->env(k, j) = env[k * kEnvelopePoints + j];
    s->setting = setting;
    bound_sample(*s);  // the frame shift from bits and channels: 1 for 8-bit stereo here too
    st.out.song.samples[number] = std::move(s);
}

// One packed track of a "patt" chunk: cells until the row count is reached.
void patt_track(ByteReader& b, TNOTE* column, int file_rows, int rows) {
    int row = 0;
    while (row < file_rows && !b.at_end()) {
        uint8_t flag = b.u8();
        if (flag & 0x80) {
            row = flag & 0x7f;
            if (row >= file_rows) break;
            flag = b.u8();
        }
        TNOTE cell{};
        if (flag & 1) cell.note = b.u8();
        if (flag & 2) cell.instrument = b.u8();
        if (flag & 4) cell.volume = b.u8();
        if (flag & 8) cell.command = b.u8();
        if (flag & 16) cell.parameter = b.u8();
        if (column && row < rows) column[row] = cell;
        ++row;
    }
}

void chunk_patt(OtmState& st, ByteReader& b) {
    const uint16_t tracks = b.u16le();
    const uint16_t file_rows = b.u16le();
    const uint16_t number = b.u16le();
    if (b.truncated() || number >= kPatternsPerSong) return;
    const int rows = std::clamp<int>(file_rows, 1, kMaxRows);
    st.m.rows[number] = static_cast<int16_t>(rows);
    st.nbtrack = std::clamp<int>(tracks, 1, kTracks);
    PatternRef p = make_pattern(std::min<int>(tracks, kTracks), rows);
    for (int t = 0; t < tracks && !b.at_end(); ++t) {
        if (b.u16le() == 65535) continue;
        patt_track(b, t < kTracks ? p->column(t) : nullptr, file_rows, rows);
    }
    st.out.song.patterns[number] = std::move(p);
}

void chunk_efx(OtmState& st, ByteReader& b) {
    TMOD& m = st.m;
    b.skip(2);
    const uint32_t len = b.u32le();
    const uint32_t level = b.u32le();
    const uint32_t on = b.u32le();
    if (b.truncated()) return;
    m.echolen[0] = std::min(len, kMaxEchoFrames);
    m.echolevel[0] = level;
    m.echoon[0] = on != 0;
    st.out.effects.echo_units_set |= 1;
    if (b.size() == 14) return;
    b.seek(16);
    uint16_t types[kEffectSlots];
    if (!read_words(b, types, kEffectSlots, true)) return;
    EffectsRead& fx = st.out.effects;
    fx.has_added_types = true;
    // A type no unit knows is kept as it is: it is listed under its number, routed, saved
    // back, and run by nothing.
    for (int s = kFirstClonedSlot; s < kEffectSlots; ++s) fx.added_types[s] = static_cast<int16_t>(types[s]);
    const int units = std::min<int>(b.u16le(), kEchoUnits);
    for (int u = 1; u < units; ++u) {
        const uint32_t ulen = b.u32le();
        const uint32_t ulevel = b.u32le();
        const uint32_t uon = b.u32le();
        if (b.truncated()) return;
        m.echolen[u] = std::min(ulen, kMaxEchoFrames);
        m.echolevel[u] = ulevel;
        m.echoon[u] = uon != 0;
        fx.echo_units_set |= 1u << u;
    }
}

// Returns false for an id that ends the reading.
bool dispatch(OtmState& st, uint32_t chunk, ByteReader& body) {
    switch (chunk) {
        case id("O.T."): chunk_OT(st, body); return true;
        case id("S.Q."): chunk_SQ(st, body); return true;
        case id("PATT"): chunk_PATT(st, body); return true;
        case id("INST"): chunk_INST(st, body); return true;
        case id("OAIT"): chunk_OAIT(st, body); return true;
        case id("OAPT"): chunk_OAPT(st, body); return true;
        case id("SV19"): chunk_SV19(st, body); return true;
        case id("o.t."):
        case id(".t.o"): chunk_ot(st, body); return true;
        case id("inst"): chunk_inst(st, body); return true;
        case id("patt"): chunk_patt(st, body); return true;
        case id("efx."): chunk_efx(st, body); return true;
        case id("TEXT"):
        case id("VERS"):
        case id("TRKN"):
        case id("PATN"):
        case id("IENV"):
        case id("OENV"):
        case id("PEFX"): return true;
        default: return false;
    }
}

void preset(TMOD& m) {
    reset_track_tables(m);
    for (auto& r : m.rows) r = 64;
    std::memset(m.sequence, 0, sizeof m.sequence);
    m.tempo = 480000;
    m.speed = 6;
}

}  // namespace

bool read_otm(ByteReader& file, ModuleRead& out) {
    TMOD& m = *out.song.mod;
    preset(m);
    OtmState st(out);
    int chunks = 0;
    uint8_t header[8];
    size_t got = 0;
    while ((got = file.read(header, 8)) == 8) {
        const uint32_t chunk =
            uint32_t{header[0]} << 24 | uint32_t{header[1]} << 16 | uint32_t{header[2]} << 8 | header[3];
        const bool new_block = chunk == id("o.t.") || chunk == id(".t.o");
        if (new_block) st.little = true;
        const uint32_t length = st.little ? uint32_t{header[7]} << 24 | uint32_t{header[6]} << 16 |
                                                uint32_t{header[5]} << 8 | header[4]
                                          : uint32_t{header[4]} << 24 | uint32_t{header[5]} << 16 |
                                                uint32_t{header[6]} << 8 | header[7];
        ByteReader body = file.sub(length);
        if (!dispatch(st, chunk, body)) break;
        ++chunks;
        if (body.short_of_declared()) {
            out.truncated = true;
            break;
        }
    }
    if (got > 0 && got < 8) out.truncated = true;
    // Nothing known to read means the file is not a module: refused, not loaded as empty.
    if (chunks == 0) {
        out.error = "not an Ondrel Tracker module (no known chunk at its start)";
        return false;
    }
    m.nbpos = static_cast<uint8_t>(st.nbpos);
    m.repeat = static_cast<uint8_t>(st.repeat);
    m.nbtrack = static_cast<uint8_t>(st.nbtrack);
    bound_record(m);
    return true;
}

}  // namespace ondrel
