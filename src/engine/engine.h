#pragma once
#include "playback/player.h"
#include "render/effect_rack.h"
#include "render/effect_units.h"
#include "render/mixer.h"
#include "song/alerts.h"
#include "song/effect_slots.h"
#include "song/song_bank.h"

namespace ondrel {

// The program's shared state: every subsystem's tables live here, not in globals, so
// tests can hold as many engines as they like.
class Engine {
public:
    explicit Engine(AlertSink* alerts = nullptr)
        : bank(alerts ? alerts : &alert_log),
          slots(),
          player(bank, slots),
          mixer(bank, slots, player),
          units(bank, slots),
          rack(bank, slots, units, player) {
        mixer.set_effects(&units);
        mixer.set_preview(&preview);
        player.units = &units;
        // Echo lines for every unit at the song's lengths, so routing never waits on memory.
        for (int u = 0; u < kEchoUnits; ++u)
            slots.reserve_echo_line(u, bank.current().echolen[u], bank.structure_lock());
    }
    Engine(const Engine&) = delete;
    Engine& operator=(const Engine&) = delete;

    AlertLog alert_log;  // where alerts go when nobody draws them
    SongBank bank;
    EffectSlots slots;
    Player player;
    Mixer mixer;
    EffectUnits units;
    EffectRack rack;
    SoundPreview preview;  // a sound heard outside the song (browser, sample editor)
};

}  // namespace ondrel
