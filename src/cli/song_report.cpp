#include "cli/song_report.h"

#include <zlib.h>

#include <cstdio>
#include <sstream>

#include "cli/json_writer.h"

namespace ondrel {

int used_cells(const TNOTE* column, int rows) {
    int n = 0;
    if (column)
        for (int r = 0; r < rows; ++r) n += !column[r].empty();
    return n;
}

namespace {

uint32_t data_crc(const p_s& s) {
    if (!s.data || !s.length) return 0;
    return static_cast<uint32_t>(crc32(0L, s.data, s.length));
}

void pattern_json(JsonWriter& j, int index, const Pattern& p, int rows) {
    j.begin_object();
    j.field("index", index);
    j.field("rows", rows);
    j.field("tracks", p.allocated_tracks());
    j.key("cells");
    j.begin_array();
    for (int t = 0; t < kTracks; ++t) {
        const TNOTE* column = p.column(t);
        if (!column) continue;
        for (int r = 0; r < rows; ++r) {
            const TNOTE& c = column[r];
            if (c.empty()) continue;
            const int cell[] = {r, t, c.note, c.volume, c.instrument, c.command, c.parameter};
            j.array(cell, 7);
        }
    }
    j.end_array();
    j.end_object();
}

void sample_fields(JsonWriter& j, int index, const p_s& s) {
    j.begin_object();
    j.field("index", index);
    j.field("name", std::string(s.name));
    j.field("rate", s.rate);
    j.field("length", s.length);
    j.field("loopstart", s.loopstart);
    j.field("loopend", s.loopend);
    j.field("loopon", s.loopon);
    j.field("refnote", s.refnote);
    j.field("volume", s.volume);
    j.field("bits", s.bits);
    j.field("stereo", s.stereo);
    j.field("framecode", s.framecode);
    j.field("finetune", s.finetune);
    j.field("level", s.level);
    j.field("setting", s.setting);
    j.field("flagword", s.flagword);
    j.field_array("envelope", s.envelope, kEnvelopeKinds * kEnvelopePoints);
    j.field("crc32", data_crc(s));
    j.end_object();
}

}  // namespace

std::string sample_json(const p_s& s, int index) {
    JsonWriter j;
    sample_fields(j, index, s);
    return j.out + "\n";
}

std::string sample_text(const p_s& s) {
    std::ostringstream o;
    o << "Name:         " << s.name << "\n";
    o << "Rate:         " << s.rate << " Hz\n";
    o << "Format:       " << s.bits << "-bit " << (s.stereo ? "stereo" : "mono") << "\n";
    o << "Length:       " << s.length << " bytes, " << s.frames() << " frames\n";
    if (s.loopon)
        o << "Loop:         bytes " << s.loopstart << " to " << s.loopend << "\n";
    else
        o << "Loop:         none\n";
    o << "Volume:       " << s.volume << "\n";
    o << "Base note:    " << s.refnote << "\n";
    o << "From:         " << s.source_path << "\n";
    return o.str();
}

std::string song_json(const SongBank& bank, int song) {
    const TMOD& m = *bank.timod[song];
    JsonWriter j;
    j.begin_object();
    j.field("name", std::string(m.name));
    j.field("tempo", m.tempo);
    j.field("speed", m.speed);
    j.field("nbpos", m.nbpos);
    j.field("repeat", m.repeat);
    j.field("nbtrack", m.nbtrack);
    j.field("format", m.format);
    j.field("globalvol", m.globalvol);
    j.field_array("sequence", m.sequence, m.nbpos);
    j.field_array("trackpan", m.trackpan, kTracks);
    j.field_array("trackpan2", m.trackpan2, kTracks);
    j.field_array("trackvol", m.trackvol, kTracks);
    j.field_array("trackc", m.trackc, kTracks);
    j.field_array("tracke", m.tracke, kTracks);
    j.field_array("nbvoice", m.nbvoice, kTracks);
    j.field_array("trackword1", m.trackword1, kTracks);
    j.field_array("rows", m.rows, kPatternsPerSong);
    j.key("patterns");
    j.begin_array();
    for (int i = 0; i < kPatternsPerSong; ++i)
        if (const Pattern* p = bank.pattern(m.patbase + i)) pattern_json(j, i, *p, m.rows[i]);
    j.end_array();
    j.key("samples");
    j.begin_array();
    for (int i = 0; i < kSamplesPerSong; ++i)
        if (const p_s* s = bank.sample(m.sndbase + i)) sample_fields(j, i + 1, *s);
    j.end_array();
    j.key("efx");
    j.begin_object();
    j.field_array("echolen", m.echolen, kEchoUnits);
    j.field_array("echolevel", m.echolevel, kEchoUnits);
    j.field_array("echoon", m.echoon, kEchoUnits);
    j.field_array("efxflag", m.efxflag, kEffectSlots);
    j.field_array("efxa", m.efxa, kEffectSlots);
    j.field_array("efxb", m.efxb, kEffectSlots);
    j.field_array("efxc", m.efxc, kEffectSlots);
    j.end_object();
    j.end_object();
    return j.out + "\n";
}

namespace {

const char* pan_mode_name(int mode) {
    switch (mode) {
        case 1: return "Amiga Mode";
        case 2: return "Panoramic Mode";
        case 3: return "L&R Mode";
        default: return "unset";
    }
}

std::string printable(const char* text) {
    std::string s;
    for (const char* p = text; *p; ++p) {
        const unsigned char c = static_cast<unsigned char>(*p);
        s += (c >= 0x20 && c < 0x7f) ? static_cast<char>(c) : '.';
    }
    return s;
}

}  // namespace

std::string song_text(const SongBank& bank, int song, const EffectSlots& slots) {
    const TMOD& m = *bank.timod[song];
    std::ostringstream o;
    char line[256];
    o << "Title:        " << (m.name[0] ? printable(m.name) : "(no name)") << "\n";
    std::snprintf(line, sizeof line, "Tempo:        %.2f BPM (%u us per beat), speed %d\n",
                  m.tempo ? 60000000.0 / m.tempo : 0.0, m.tempo, m.speed);
    o << line;
    o << "File mode:    " << m.format << " (" << pan_mode_name(m.format) << ")\n";
    o << "Global volume: " << m.globalvol << " (64 = unity)\n";
    o << "Tracks:       " << int(m.nbtrack) << "\n";
    o << "Positions:    " << int(m.nbpos) << ", repeat from " << int(m.repeat) << "\n";
    o << "Sequence:    ";
    for (int i = 0; i < m.nbpos; ++i) {
        std::snprintf(line, sizeof line, " %02d", m.sequence[i]);
        o << line << ((i % 24 == 23 && i + 1 < m.nbpos) ? "\n             " : "");
    }
    o << "\n\nPatterns:\n";
    for (int i = 0; i < kPatternsPerSong; ++i) {
        const Pattern* p = bank.pattern(m.patbase + i);
        if (!p) continue;
        const int rows = m.rows[i];
        int cells = 0;
        std::string used;
        for (int t = 0; t < kTracks; ++t) {
            const int n = used_cells(p->column(t), rows);
            cells += n;
            if (n) {
                used += ' ';
                used += std::to_string(t + 1);
            }
        }
        std::snprintf(line, sizeof line, "  %3d  %4d rows  %2d tracks  %5d cells  used tracks:%s\n", i, rows,
                      p->allocated_tracks(), cells, used.empty() ? " none" : used.c_str());
        o << line;
    }
    o << "\nSamples:\n";
    o << "   #  name                              rate  bits  ch     length   loop start..end"
         "     vol  ref  fine\n";
    int count = 0;
    for (int i = 0; i < kSamplesPerSong; ++i) {
        const p_s* s = bank.sample(m.sndbase + i);
        if (!s) continue;
        ++count;
        char loop[40];
        if (s->loopon)
            std::snprintf(loop, sizeof loop, "%9u..%-9u", s->loopstart, s->loopend);
        else
            std::snprintf(loop, sizeof loop, "%-20s", "   no loop");
        std::snprintf(line, sizeof line, " %3d  %-32s %6u  %4d  %2s %10u %s  %4d  %3d  %4d\n", i + 1,
                      printable(s->name).c_str(), s->rate, s->bits, s->stereo ? "st" : "mo", s->length, loop,
                      s->volume, s->refnote, s->finetune);
        o << line;
    }
    if (!count) o << "  (none)\n";
    o << "\nEffects:\n";
    for (int u = 0; u < kEchoUnits; ++u) {
        if (u > 0 && m.echolen[u] == 44100 && m.echolevel[u] == 75 && !m.echoon[u]) continue;
        std::snprintf(line, sizeof line, "  echo unit %2d: length %u frames, feedback %u, invert phase %s\n",
                      u, m.echolen[u], m.echolevel[u], m.echoon[u] ? "on" : "off");
        o << line;
    }
    bool routed = false;
    for (int t = 0; t < m.nbtrack; ++t) {
        if (!m.tracke[t]) continue;
        routed = true;
        std::snprintf(line, sizeof line, "  track %2d -> effect slot %2d (type %d), send %d\n", t + 1,
                      m.tracke[t], slots.efxtype[m.tracke[t]], m.trackc[t]);
        o << line;
    }
    if (!routed) o << "  no track is routed to an effect slot\n";
    for (int s = kFirstClonedSlot; s < kEffectSlots; ++s)
        if (slots.efxtype[s]) o << "  added effect " << added_effect_label(s, slots.efxtype[s]) << "\n";
    return o.str();
}

}  // namespace ondrel
