#pragma once

namespace ondrel {

class Program;
struct TMOD;

// The effect panel: the slots (the basic units and the clones, with their labels), adding
// a unit of any type, "Clone efx" and "Remove efx", the chosen unit's controls ("Echo Delay
// (ms)", "Set To BPM", "Feedback", "Invert Phase", "Auto Pan D", "Speed", "Freq (Hz)", "Q")
// and the two reverbs' panels; and the cursor track's routing buttons. Every change is
// heard at once and can be undone.
void draw_effect_editor(Program& p, const TMOD& song);

}  // namespace ondrel
