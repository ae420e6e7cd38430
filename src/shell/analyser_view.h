#pragma once
#include <array>
#include <atomic>
#include <cstdint>

#include "shell/fast_fourier_transform.h"

namespace ondrel {

// The "FFT Window" drawing area: 512 columns by 128 rows, row 0 at the top, each pixel
// 0x00RRGGBB. The window scales it and writes "0 Hz" and "22050 Hz" under it.
inline constexpr int kAnalyserWidth = 512;
inline constexpr int kAnalyserHeight = 128;
using AnalyserPixels = std::array<uint32_t, kAnalyserWidth * kAnalyserHeight>;

// The analyser's source (the mixer's f_fftmode): the song's output or the recording input.
inline constexpr int16_t kAnalyseSong = 1;
inline constexpr int16_t kAnalyseInput = 2;

inline constexpr int kViewClassic = 0;
inline constexpr int kViewRadar = 1;
// The analyser's refresh period; the radar moves one row a refresh.
inline constexpr int kAnalyserPeriodUs = 75000;

// Radar: one value of the packed transform as a colour. Its square scales red to 128 and
// green and blue to 255, each then taken as a signed byte and packed as
// red x 65536 + green x 257, so that the top of the scale wraps into other colours.
uint32_t radar_pixel(double x);
// Classic: the rows of the bar of a value, 0 to 128 (128 from 4.0 on, 8 for 1.0).
int classic_bar_height(double x);

// One radar line of 512 pixels: column i shows x[i] of the 512 packed values.
void radar_line(const double* x, uint32_t* line);
void draw_radar_row(const double* x, AnalyserPixels& pixels, int row);
// The bars: cleared, then column i filled from the bottom up to its height, the pixel of
// row u coloured (2u, 2u, u).
void draw_classic(const double* x, AnalyserPixels& pixels);

// What the window draws (FFTBBox::Draw): the transform of the analyser block in the view
// chosen, the radar moving down a row a time and wrapping after 128.
class AnalyserView {
public:
    AnalyserView();  // a 512-point transform with the Hamming window

    // Opening the window: the Classic view, the radar from its top row.
    void reset();
    void set_view(int mode) { view_mode_ = mode == kViewRadar ? kViewRadar : kViewClassic; }
    int view() const { return view_mode_; }
    int radar_row() const { return radar_row_; }

    // Copies the block (Bufferfft1, full scale 1.0), transforms it and draws.
    void Draw(const std::array<std::atomic<double>, 512>& block);
    void Draw(const double* block);
    // The transform of a block, as Draw shows it.
    const std::array<double, 512>& transform(const double* block);
    const AnalyserPixels& pixels() const { return pixels_; }

private:
    CFastFourierTransform fft_{512};
    std::array<double, 512> values_{};
    AnalyserPixels pixels_{};
    int view_mode_ = kViewClassic;
    int radar_row_ = 0;
};

}  // namespace ondrel
