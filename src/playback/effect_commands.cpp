#include "playback/effect_commands.h"

#include <algorithm>

#include "playback/tables.h"

namespace ondrel {

namespace {

int clamp_volume(int v) {
    return std::clamp(v, 0, 128);
}

void slide_up(Voice& v, int amount) {
    v.baseperiod = std::max(v.baseperiod - static_cast<float>(amount), kPeriodMin);
    v.period = v.baseperiod;
}

void slide_down(Voice& v, int amount) {
    v.baseperiod = std::min(v.baseperiod + static_cast<float>(amount), kPeriodMax);
    v.period = v.baseperiod;
}

}  // namespace

void EffectCommands::row_start(Player& p, int t, Voice& v, const TNOTE& cell, int tick) {
    TMOD& m = p.bank_.current();
    const int param = cell.parameter;
    const int x = param >> 4;
    const int y = param & 15;
    switch (cell.command) {
        case 8: m.trackvol[t] = static_cast<uint16_t>(param / 2); break;
        case 9: v.position = static_cast<uint32_t>(param) * 256; break;
        case 11:
            p.tr.breakpat = static_cast<int16_t>(param);
            p.tr.breaklig = 0;
            p.tr.fbreak = 1;
            break;
        case 12: v.volume = static_cast<int16_t>(param * 2); break;  // no upper clamp, as songs expect
        case 13:
            p.tr.breakpat = static_cast<int16_t>(p.local_pos_ + 1);
            p.tr.breaklig = static_cast<int16_t>(x * 10 + y);
            p.tr.fbreak = 1;
            break;
        case 14: extended(p, t, v, cell, tick, true); break;
        case 15:
            if (param >= 1 && param <= 31)
                m.speed = static_cast<int16_t>(param);
            else if (param >= 32)
                m.tempo = 60000000u / static_cast<uint32_t>(param);
            break;
        case 16: m.globalvol = static_cast<int16_t>(param); break;
        case 21: m.trackpan[t] = static_cast<uint16_t>(param); break;
        case 22: m.trackpan[t] = m.trackpan2[t] = static_cast<uint16_t>(param); break;
        case 27: m.trackpan2[t] = static_cast<uint16_t>(param); break;
        case 30: {
            if (param > 8 || v.instrument == 0) break;
            if (!p.sample_of(v.instrument)) break;
            v.block = static_cast<uint16_t>(param);
            if (param != 0) {
                // The voice's instrument number is the mark entry, one above the entry the
                // block player uses for the same sound; kept for the songs made so.
                const PatMark& mark = m.patmark[std::min<int>(v.instrument, 127)][param - 1];
                v.position = static_cast<uint32_t>(mark.position);
                v.endpos = static_cast<uint32_t>(mark.value);
            }
            break;
        }
        case 33: p.route_to_slot(t, param); break;
        case 34: {
            const uint16_t slot = m.tracke[t];
            for (int k = 0; k < kTracks; ++k)
                if (k == t || m.tracke[k] == slot) m.trackc[k] = static_cast<uint16_t>(param);
            break;
        }
        default: break;
    }
}

void EffectCommands::extended(Player& p, int t, Voice& v, const TNOTE& cell, int tick, bool row_start) {
    const int x = cell.parameter >> 4;
    const int y = cell.parameter & 15;
    if (!row_start) {
        // The per-tick pass knows only note cut and note delay.
        if (x == 12 && y == tick) v.volume = 0;
        if (x == 13 && y == tick) delayed_trigger(p, t, v, cell);
        return;
    }
    switch (x) {
        case 1: slide_up(v, y); break;
        case 2: slide_down(v, y); break;
        case 5:
            v.finetune = static_cast<uint16_t>(y);
            v.period = v.baseperiod = finetune_factor(y) * v.noteperiod;
            break;
        case 10: v.volume = static_cast<int16_t>(std::min(v.volume + y * 2, 128)); break;
        case 11: v.volume = static_cast<int16_t>(std::max(v.volume - y * 2, 0)); break;
        case 12:
            if (y == tick) v.volume = 0;
            break;
        case 13:
            if (y == tick) delayed_trigger(p, t, v, cell);
            break;
        case 14: p.tr.patdelay = static_cast<int16_t>(y * 2); break;
        default: break;
    }
}

void EffectCommands::per_tick(Player& p, int t, Voice& v, const TNOTE& cell, int tick) {
    const int param = cell.parameter;
    const int x = param >> 4;
    const int y = param & 15;
    const TMOD& m = p.bank_.current();
    switch (cell.command) {
        case 0: {
            if (param == 0) break;
            const int k = ((m.speed - tick) % 3 + 3) % 3;
            if (k == 0) {
                v.period = v.baseperiod;
            } else {
                const int note = std::min<int>(v.note + (k == 1 ? x : y), 127);
                v.period = finetune_factor(v.finetune) * floatnote()[note];
            }
            break;
        }
        case 1: slide_up(v, param); break;
        case 2: slide_down(v, param); break;
        case 3: tone_portamento(v, param); break;
        case 4: vibrato(v, param); break;
        case 5:
            volume_slide_whole(v, param);
            tone_portamento(v, 0);
            break;
        case 6:
            volume_slide_whole(v, param);
            vibrato(v, 0);
            break;
        case 10:
            v.volume = static_cast<int16_t>(clamp_volume(x ? v.volume + x * 2 : v.volume - y * 2));
            break;
        case 14: extended(p, t, v, cell, tick, false); break;
        case 26:
            // Delay in half-ticks: compared with notick itself.
            if (param != 0 && param == p.tr.notick) delayed_trigger(p, t, v, cell);
            break;
        default: break;
    }
}

// Codes 5 and 6 slide by the whole parameter byte upward, unlike code 10.
void EffectCommands::volume_slide_whole(Voice& v, int param) {
    v.volume = static_cast<int16_t>(clamp_volume(param > 15 ? v.volume + param * 2 : v.volume - param * 2));
}

void EffectCommands::tone_portamento(Voice& v, int param) {
    if (param) v.portaspeed = static_cast<uint8_t>(param);
    if (v.portatarget == 0.0f) return;
    if (v.baseperiod <= v.portatarget) {
        v.baseperiod += v.portaspeed;
        if (v.baseperiod > v.portatarget) {
            v.baseperiod = v.portatarget;
            v.portatarget = 0;
        }
    } else {
        v.baseperiod -= v.portaspeed;
        if (v.baseperiod < v.portatarget) {
            v.baseperiod = v.portatarget;
            v.portatarget = 0;
        }
    }
    v.period = v.baseperiod;
}

void EffectCommands::vibrato(Voice& v, int param) {
    const int x = param >> 4;
    const int y = param & 15;
    if (y) v.vibparam = static_cast<uint8_t>((v.vibparam & 0xf0) | y);
    if (param > 15) v.vibparam = static_cast<uint8_t>((v.vibparam & 0x0f) | x << 4);
    const int depth = v.vibparam & 15;
    const int speed = v.vibparam >> 4;
    const int delta = a_sin[(v.vibpos >> 2) & 31] * depth / 128;
    if (v.vibpos >= 0)
        v.period = std::min(v.baseperiod + static_cast<float>(delta), kPeriodMax);
    else
        v.period = std::max(v.baseperiod - static_cast<float>(delta), kVibratoPeriodMin);
    v.vibpos = static_cast<int8_t>(static_cast<uint8_t>(v.vibpos) + speed * 4);
}

void EffectCommands::delayed_trigger(Player& p, int t, Voice& v, const TNOTE& cell) {
    // A delay on a cell without a note has nothing to start (note 0 would be a period of
    // 6848, far below any instrument).
    if (cell.note == 0 || (cell.note & 0x80)) return;
    if (cell.instrument) {
        v.instrument = cell.instrument;
        if (const p_s* s = p.sample_of(cell.instrument)) {
            v.volume = s->volume;
            v.finetune = static_cast<uint16_t>(s->finetune);
        }
    }
    p.trigger(t, v, cell.note);
    if (cell.volume) v.volume = cell.volume;
}

}  // namespace ondrel
