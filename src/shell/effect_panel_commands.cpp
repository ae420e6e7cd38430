// The effect panel's commands: choosing, adding, cloning and removing units, their
// settings, the two reverbs, and the tracks' routing buttons. All undoable.
#include <algorithm>

#include "edit/effect_edits.h"
#include "edit/reverb_edits.h"
#include "shell/command_handlers.h"
#include "shell/program.h"

namespace ondrel {

namespace {

int slot_of(const Program& p, const ShellMessage& m) {
    return static_cast<int>(std::clamp<int64_t>(m.get("slot", p.editor.shown_effect), 0, kEffectSlots - 1));
}

int value_of(const ShellMessage& m) {
    return static_cast<int>(m.get("value"));
}

}  // namespace

void cmd_effect_slot(Program& p, const ShellMessage& m) {
    const int slot = slot_of(p, m);
    switch (m.code) {
        case fourcc("FXsh"): p.editor.shown_effect = slot; return;
        case fourcc("FXcl"): {
            int made = -1;
            p.edit("Clone efx", [&](SongTransaction& t) { made = clone_effect(t, slot); });
            if (made > 0) p.editor.shown_effect = made;
            return;
        }
        case fourcc("FXrm"):
            if (p.edit("Remove efx", [&](SongTransaction& t) { remove_effect(t, slot); }))
                p.editor.shown_effect = 0;
            return;
        default: return;
    }
}

void cmd_effect_setting(Program& p, const ShellMessage& m) {
    const int slot = slot_of(p, m);
    const int value = value_of(m);
    bool done = false;
    switch (m.code) {
        case fourcc("FXdl"):
            done = p.edit("Echo Delay (ms)", [&](SongTransaction& t) {
                set_echo_delay_ms(t, slot, uint32_t(std::max(1, value)));
            });
            break;
        case fourcc("FXbp"):
            done = p.edit("Set To BPM", [&](SongTransaction& t) { set_echo_delay_to_beat(t, slot); });
            break;
        case fourcc("FXfb"):
            done = p.edit("Feedback", [&](SongTransaction& t) { set_echo_feedback(t, slot, value); });
            break;
        case fourcc("FXiv"):
            done = p.edit("Invert Phase", [&](SongTransaction& t) { set_echo_invert(t, slot, value != 0); });
            break;
        case fourcc("FXap"):
            done = p.edit("Auto Pan D", [&](SongTransaction& t) { set_auto_pan(t, slot, value != 0); });
            break;
        case fourcc("FXsp"):
            done = p.edit("Speed", [&](SongTransaction& t) { set_auto_pan_speed(t, slot, value); });
            break;
        case fourcc("FXfq"):
            done =
                p.edit("Freq (Hz)", [&](SongTransaction& t) { set_active_filter_frequency(t, slot, value); });
            break;
        case fourcc("FXq "):
            done = p.edit("Q", [&](SongTransaction& t) { set_filter_q(t, slot, value); });
            break;
        default: return;
    }
    if (!done) p.say("The effect did not change");
}

void cmd_reverb_setting(Program& p, const ShellMessage& m) {
    const int unit = static_cast<int>(m.get("unit", 10));
    const int field = static_cast<int>(m.get("field"));
    const int value = value_of(m);
    EffectUnits& units = p.engine.units;
    switch (m.code) {
        case fourcc("RVdl"):
            p.edit("Reverb delay", [&](SongTransaction& t) {
                set_reverb_delay(t, units, unit, field, uint32_t(std::max(0, value)));
            });
            return;
        case fourcc("RVgn"):
            p.edit("Reverb gain", [&](SongTransaction& t) { set_reverb_gain(t, units, unit, field, value); });
            return;
        case fourcc("RVlp"):
            p.edit("Reverb Lpf", [&](SongTransaction& t) { set_reverb_cutoff(t, units, field, value); });
            return;
        default: return;
    }
}

void cmd_track_routing(Program& p, const ShellMessage& m) {
    const int track =
        static_cast<int>(std::clamp<int64_t>(m.get("track", p.engine.player.cursor.track), 0, kTracks - 1));
    int slot = -1;
    const bool up = m.code == fourcc("TKf+");
    p.edit("Track effect",
           [&](SongTransaction& t) { slot = up ? mnplusefx(t, track) : mnmoinsefx(t, track); });
    if (slot < 0) p.say("No effect unit to route the track to");
}

}  // namespace ondrel
