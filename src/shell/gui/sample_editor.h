#pragma once
#include <imgui.h>

#include <cstdint>
#include <vector>

#include "shell/sound_pitch.h"

namespace ondrel {

class Program;
struct p_s;

// The current instrument's sound: its waveform (each channel of a stereo sound), zoom and
// scroll, a selection made with the mouse, the loop points and block marks drawn and
// dragged, hearing the whole sound or the selection, the sound tools, and the sound's
// dominant frequency.
class SampleEditor {
public:
    void draw(Program& p);

private:
    enum class Drag : uint8_t { None, Select, LoopStart, LoopEnd, Block, BlockEnd };
    void toolbar(Program& p, const p_s* s);
    void waveform(Program& p, const p_s& s, ImVec2 size);
    void compute_peaks(const p_s& s, int width);
    void show_pitch(const p_s& s);
    double frame_at(float x, float left) const;
    float x_of(double frame, float left) const;

    double first_ = 0;      // frame at the left edge
    double per_pixel_ = 0;  // frames per pixel; 0: the whole sound fits
    int block_ = 1;         // the block the block buttons act on
    Drag drag_ = Drag::None;
    double anchor_ = 0;   // where a selection began
    double dragged_ = 0;  // where a dragged line is now
    int dragged_block_ = 0;
    double block_first_ = 0;  // where the block whose end is dragged starts
    // The waveform as drawn, kept until the sound or the view changes: the lowest and
    // highest value of each channel under each column.
    const void* peaks_of_ = nullptr;
    double peaks_first_ = -1, peaks_per_pixel_ = -1;
    std::vector<float> low_[2], high_[2];
    // The sound's dominant frequency, found again only when the sound changes.
    const void* pitch_of_ = nullptr;
    uint32_t pitch_length_ = 0, pitch_rate_ = 0;
    SoundPitch pitch_;
};

}  // namespace ondrel
