#include "shell/analyser_view.h"

#include <algorithm>
#include <cmath>

#include "shell/fft_windows.h"

namespace ondrel {

uint32_t radar_pixel(double x) {
    const double v = std::clamp(x, -1.0, 1.0);
    const auto red = static_cast<int8_t>(std::lround(v * v * 128));
    const auto green = static_cast<int8_t>(std::lround(v * v * 255));
    return static_cast<uint32_t>(red * 65536 + green * 257) & 0x00ffffffu;
}

int classic_bar_height(double x) {
    const double v = std::clamp(x * 0.25, -1.0, 1.0);
    return static_cast<int>(std::lround(v * v * 128));
}

void radar_line(const double* x, uint32_t* line) {
    for (int i = 0; i < kAnalyserWidth; ++i) line[i] = radar_pixel(x[i]);
}

void draw_radar_row(const double* x, AnalyserPixels& pixels, int row) {
    radar_line(x, pixels.data() + static_cast<size_t>(row) * kAnalyserWidth);
}

void draw_classic(const double* x, AnalyserPixels& pixels) {
    pixels.fill(0);
    for (int i = 0; i < kAnalyserWidth; ++i) {
        for (int u = kAnalyserHeight - classic_bar_height(x[i]); u < kAnalyserHeight; ++u) {
            const auto level = static_cast<uint32_t>(u);
            pixels[static_cast<size_t>(u) * kAnalyserWidth + static_cast<size_t>(i)] =
                (2 * level) << 16 | (2 * level) << 8 | level;
        }
    }
}

AnalyserView::AnalyserView() {
    fft_.SetWindow(512, Hamming);
}

void AnalyserView::reset() {
    view_mode_ = kViewClassic;
    radar_row_ = 0;
    pixels_.fill(0);
}

void AnalyserView::Draw(const std::array<std::atomic<double>, 512>& block) {
    // Written by the audio or capture thread as it goes: a frame may mix two blocks.
    double copy[512];
    for (size_t i = 0; i < block.size(); ++i) copy[i] = block[i].load(std::memory_order_relaxed);
    Draw(copy);
}

const std::array<double, 512>& AnalyserView::transform(const double* block) {
    std::copy(block, block + values_.size(), values_.begin());
    fft_.DirectFFT(values_.data());
    return values_;
}

void AnalyserView::Draw(const double* block) {
    transform(block);
    if (view_mode_ == kViewRadar) {
        draw_radar_row(values_.data(), pixels_, radar_row_);
        radar_row_ = radar_row_ >= kAnalyserHeight - 1 ? 0 : radar_row_ + 1;
    } else {
        draw_classic(values_.data(), pixels_);
    }
}

}  // namespace ondrel
