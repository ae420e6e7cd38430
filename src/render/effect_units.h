#pragma once
#include "playback/player.h"
#include "render/active_filter.h"
#include "render/echo_unit.h"
#include "render/effect_processor.h"
#include "render/fir_filter.h"
#include "render/iir1_filter.h"
#include "render/iir2_filter.h"
#include "render/reverb.h"
#include "render/reverb_dhs.h"
#include "song/song_bank.h"

namespace ondrel {

// Every effect unit with its state; the mixer's effect stage runs them slot by slot.
class EffectUnits final : public EffectProcessor, public UnitReset {
public:
    EffectUnits(SongBank& bank, EffectSlots& slots);

    void begin_buffer() override { iir2.begin_buffer(); }
    void run(int slot, int type, const float* send, float* out, int frames, int control, float gain_left,
             float gain_right) override;
    // Clears every filter history and echo line (stopping play).
    void delefx() override;

    // The instance of a slot's unit: 0 for the basic slot, then 1, 2... for the clones of
    // the same type in slot order.
    int instance_of(int slot) const;

    FirFilter fir;
    Iir1Filter iir1;
    ActiveFilter active;
    Iir2Filter iir2;
    DelayUnits delays;
    Reverb firstreverb;
    ReverbDHS secreverb;

private:
    SongBank& bank_;
    EffectSlots& slots_;
};

}  // namespace ondrel
