#pragma once
#include "playback/player.h"

namespace ondrel {

// The effect commands of the cells: the row-start pass and the per-tick pass.
class EffectCommands {
public:
    static void row_start(Player& p, int track, Voice& v, const TNOTE& cell, int tick);
    static void per_tick(Player& p, int track, Voice& v, const TNOTE& cell, int tick);

private:
    static void extended(Player& p, int track, Voice& v, const TNOTE& cell, int tick, bool row_start);
    static void delayed_trigger(Player& p, int track, Voice& v, const TNOTE& cell);
    static void tone_portamento(Voice& v, int parameter);
    static void vibrato(Voice& v, int parameter);
    static void volume_slide_whole(Voice& v, int parameter);
};

}  // namespace ondrel
