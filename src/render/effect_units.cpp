#include "render/effect_units.h"

#include "render/effect_slot_rules.h"

namespace ondrel {

EffectUnits::EffectUnits(SongBank& bank, EffectSlots& slots) : bank_(bank), slots_(slots) {}

int EffectUnits::instance_of(int slot) const {
    return effect_instance(slots_.efxtype, slot);
}

void EffectUnits::run(int slot, int type, const float* send, float* out, int frames, int control,
                      float gain_left, float gain_right) {
    const TMOD& m = bank_.current();
    switch (type) {
        case 1:
        case 3: fir.run(type, send, out, frames, control); break;
        case 2: iir1.run(send, out, frames, control); break;
        case 5: active.run(send, out, frames, control, m.efxval[slot], gain_left, gain_right); break;
        case 9: secreverb.compute(send, out, frames, gain_left, gain_right); break;
        case 10: firstreverb.compute(send, out, frames, gain_left, gain_right); break;
        case 11: {
            const int k = instance_of(slot);
            if (k < kEchoUnits)
                delays.echo(slots_, k, m.echolen[k], m.echolevel[k], m.echoon[k] != 0, send, out, frames,
                            gain_left, gain_right);
            break;
        }
        case 12: delays.stereo_space(instance_of(slot), send, out, frames); break;
        case 16:
        case 17: iir2.run(type, slot, send, out, frames, control, m.efxd[slot], gain_left, gain_right); break;
        default: break;
    }
}

void EffectUnits::delefx() {
    iir2.clear();
    delays.clear(slots_);
}

}  // namespace ondrel
