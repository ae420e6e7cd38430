#pragma once

namespace ondrel {

class Program;

// The envelope selector ("Velocity", "Efx Env", "Panoramic", "Coarse tune", "Velocity off")
// and the chosen envelope of the current instrument: its five points dragged with the
// mouse, its curve drawn as the mixer computes it over the sound, and whether it is on.
class EnvelopeEditor {
public:
    void draw(Program& p);

private:
    int dragged_ = -1;  // the point being dragged
    int drag_x_ = 0, drag_level_ = 0;
};

}  // namespace ondrel
