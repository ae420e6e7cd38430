#include "export/otm_writer.h"

#include "export/byte_writer.h"
#include "export/output_file.h"

namespace ondrel {

namespace {

void write_song_block(ByteWriter& w, const TMOD& m) {
    const size_t at = w.begin_chunk("o.t.");
    w.u16le(1);
    w.u16le(static_cast<uint16_t>(m.format));
    w.u16le(static_cast<uint16_t>(m.globalvol));
    w.u16le(static_cast<uint16_t>(m.speed));
    w.u32le(m.tempo);
    w.u16le(m.nbpos);
    w.u16le(m.repeat);
    w.raw(m.sequence, m.nbpos);
    w.raw(m.name, sizeof m.name);
    w.words(m.trackpan, kTracks);
    w.words(m.trackc, kTracks);
    w.words(m.trackvol, kTracks);
    w.words(m.tracke, kTracks);
    w.words(m.trackpan2, kTracks);
    w.words(m.nbvoice, kTracks);
    w.raw(m.trackblock, sizeof m.trackblock);
    w.words(m.trackword1, kTracks);
    w.words(m.trackd, kTracks);
    w.words(m.trackf, kTracks);
    for (const auto& pattern : m.patmark)
        for (const auto& mark : pattern) {
            w.u32le(static_cast<uint32_t>(mark.position));
            w.u32le(static_cast<uint32_t>(mark.value));
        }
    w.raw(m.efxflag, kEffectSlots);
    w.zeros(100);
    w.words(m.efxa, kEffectSlots);
    w.words(m.efxb, kEffectSlots);
    w.words(m.efxc, kEffectSlots);
    for (uint32_t v : m.efxval) w.u32le(v);
    w.end_chunk(at);
}

void write_sample(ByteWriter& w, int number, const p_s& s) {
    const size_t at = w.begin_chunk("inst");
    w.u16le(static_cast<uint16_t>(number));
    w.raw(s.name, sizeof s.name);
    const uint32_t length = s.data ? s.length : 0;
    w.u32le(length);
    w.u32le(s.loopstart);
    w.u32le(s.loopend);
    w.u32le(s.rate);
    w.u16le(static_cast<uint16_t>(s.bits));
    w.u16le(static_cast<uint16_t>(s.refnote));
    w.u8(s.stereo);
    w.u8(s.flag2);
    w.u16le(s.loopon);
    w.u16le(static_cast<uint16_t>(s.volume));
    w.u16le(static_cast<uint16_t>(s.level));
    w.u16le(static_cast<uint16_t>(s.finetune));
    w.u16le(s.flagword);
    for (int k = 0; k < kEnvelopeKinds; ++k)
        for (int j = 0; j < kEnvelopePoints; ++j) w.u16le(s.env(k, j));
    w.u32le(s.setting);
    if (length) w.raw(s.data, length);
    w.end_chunk(at);
}

// One track packed: a jump byte (bit 7 + row) where rows are skipped, a flag byte, then
// the fields the flag names; the track ends when the row count is reached.
void write_track(ByteWriter& w, const TNOTE* column, int rows) {
    ByteWriter t;
    int row = 0;
    auto move_to = [&](int target) {
        if (target == row) return;
        if (target <= 127) {
            t.u8(static_cast<uint8_t>(0x80 | target));
        } else {
            while (row < target) {
                t.u8(0);
                ++row;
            }
            return;
        }
        row = target;
        // A jump must be followed by a flag byte; the caller writes it.
    };
    for (int r = 0; r < rows; ++r) {
        const TNOTE& c = column[r];
        const uint8_t flag =
            static_cast<uint8_t>((c.note ? 1 : 0) | (c.instrument ? 2 : 0) | (c.volume ? 4 : 0) |
                                 (c.command ? 8 : 0) | (c.parameter ? 16 : 0));
        if (!flag) continue;
        move_to(r);
        t.u8(flag);
        if (flag & 1) t.u8(c.note);
        if (flag & 2) t.u8(c.instrument);
        if (flag & 4) t.u8(c.volume);
        if (flag & 8) t.u8(c.command);
        if (flag & 16) t.u8(c.parameter);
        ++row;
    }
    if (row < rows) {
        move_to(rows - 1);
        t.u8(0);
    }
    w.u16le(static_cast<uint16_t>(t.bytes.size() < 65535 ? t.bytes.size() : 65534));
    w.raw(t.bytes.data(), t.bytes.size());
}

bool column_empty(const TNOTE* column, int rows) {
    if (!column) return true;
    for (int r = 0; r < rows; ++r)
        if (!column[r].empty()) return false;
    return true;
}

void write_pattern(ByteWriter& w, int number, const Pattern& p, const TMOD& m) {
    const size_t at = w.begin_chunk("patt");
    const int rows = m.rows[number];
    w.u16le(m.nbtrack);
    w.u16le(static_cast<uint16_t>(rows));
    w.u16le(static_cast<uint16_t>(number));
    for (int t = 0; t < m.nbtrack; ++t) {
        const TNOTE* column = p.column(t);
        if (column_empty(column, rows))
            w.u16le(65535);
        else
            write_track(w, column, rows);
    }
    w.end_chunk(at);
}

void write_effects(ByteWriter& w, const TMOD& m, const EffectSlots& slots) {
    const size_t at = w.begin_chunk("efx.");
    w.u16le(0);
    w.u32le(m.echolen[0]);
    w.u32le(m.echolevel[0]);
    w.u32le(m.echoon[0]);
    w.u16le(0);
    w.words(slots.efxtype.data(), kEffectSlots);
    w.u16le(kEchoUnits);
    for (int u = 1; u < kEchoUnits; ++u) {
        w.u32le(m.echolen[u]);
        w.u32le(m.echolevel[u]);
        w.u32le(m.echoon[u]);
    }
    w.end_chunk(at);
}

}  // namespace

std::vector<uint8_t> write_otm(const SongBank& bank, int song, const EffectSlots& slots) {
    const TMOD& m = *bank.timod[song];
    ByteWriter w;
    write_song_block(w, m);
    for (int i = 0; i < kSamplesPerSong; ++i)
        if (const p_s* s = bank.sample(m.sndbase + i)) write_sample(w, i, *s);
    for (int i = 0; i < kPatternsPerSong; ++i)
        if (const Pattern* p = bank.pattern(m.patbase + i)) write_pattern(w, i, *p, m);
    write_effects(w, m, slots);
    return std::move(w.bytes);
}

bool save_otm(const std::string& path, SongBank& bank, int song, const EffectSlots& slots, std::string& why) {
    if (song < 0 || song >= bank.nbimod) {
        why = "no such song";
        return false;
    }
    if (!write_output_file(path, write_otm(bank, song, slots), why)) return false;
    if (path != "-") set_text(bank.timod[song]->path, path.c_str());
    return true;
}

}  // namespace ondrel
