#include "render/reverb.h"

#include <algorithm>
#include <new>

#include "render/low_pass_bank.h"

namespace ondrel {

uint16_t reverb_frames(uint32_t microseconds, uint32_t limit) {
    uint64_t frames = uint64_t{microseconds} * 441 / 10000;
    if (frames <= 3) frames = 4;
    return static_cast<uint16_t>(std::min<uint64_t>(frames, limit));
}

Reverb::Reverb() {
    for (int k = 0; k < kLines; ++k) {
        const uint32_t floats = k == 6 ? kLongLineFloats : kShortLineFloats;
        line_[k].reset(new (std::nothrow) float[floats]());
        if (!line_[k]) return;
    }
    ok_ = true;
}

uint32_t reverb_microseconds(uint32_t frames) {
    return static_cast<uint32_t>((uint64_t{frames} * 10000 + 440) / 441);
}

int gain_thousandths(float gain) {
    return static_cast<int>(gain * 1000.0f);
}

void ReverbSettings::set_delay_us(int line, uint32_t microseconds) {
    if (line < 0 || line >= kLines) return;
    length[line] = reverb_frames(microseconds, line == 6 ? 44099 : 11049);
}

void ReverbSettings::set_gain(int field, int thousandths) {
    const float g = thousandths / 1000.0f;
    if (field >= 0 && field < 4) feedback[field] = g;
    if (field == 4 || field == 5) allpass[field - 4] = g;
    if (field == 6) output_gain = g;
}

float ReverbSettings::gain(int field) const {
    if (field >= 0 && field < 4) return feedback[field];
    if (field == 4 || field == 5) return allpass[field - 4];
    return output_gain;
}

void ReverbSettings::set_cutoff(int comb, float hz) {
    if (comb >= 0 && comb < kCombs) cutoff[comb] = std::clamp(hz, 10.0f, 11050.0f);
}

void Reverb::compute(const float* in, float* out, long frames, float gain_left, float gain_right) {
    if (!ok_) return;
    std::array<OnePoleCoefficients, 4> k{};
    for (int c = 0; c < 4; ++c) k[c] = OnePoleCoefficients::for_cutoff(s_.cutoff[c]);
    std::array<float*, kLines> base{};
    for (int l = 0; l < kLines; ++l) {
        base[l] = line_[l].get();
        if (cursor_[l] >= s_.length[l]) cursor_[l] = 0;
    }
    const float g1 = s_.allpass[0], g2 = s_.allpass[1];
    long done = 0;
    while (done < frames) {
        // Blocks end where the first line wraps, so the loops below never test for it, and
        // hold no more frames than the shortest line: no cell a block reads was written in
        // the same block, so each step can run over the whole block before the next.
        long block = std::min<long>(frames - done, kChunk);
        for (int l = 0; l < kLines; ++l) block = std::min<long>(block, s_.length[l] - cursor_[l]);
        block = std::min<long>(block, *std::min_element(s_.length.begin(), s_.length.end()));
        std::array<float*, kLines> p{};
        for (int l = 0; l < kLines; ++l) p[l] = base[l] + cursor_[l];
        const float* x_in = in + done;
        float x[kChunk], sum[kChunk], d[4][kChunk], y[4][kChunk];
        for (long i = 0; i < block; ++i) x[i] = flush(x_in[i]);
        for (int c = 0; c < 4; ++c)
            for (long i = 0; i < block; ++i) d[c][i] = flush(p[c][i]);
        for (long i = 0; i < block; ++i) sum[i] = (((0.0f + d[0][i]) + d[1][i]) + d[2][i]) + d[3][i];
        // The low passes: their inputs' part over the block, then the recursions, the
        // only serial work, four chains side by side.
        float* const ys[4] = {y[0], y[1], y[2], y[3]};
        low_passes(lowpass_.data(), k.data(), d, ys, block);
        for (int c = 0; c < 4; ++c)
            for (long i = 0; i < block; ++i) p[c][i] = y[c][i] * s_.feedback[c] + x[i];
        float* o = out + 2 * done;
        for (long i = 0; i < block; ++i) {
            float& a1 = p[4][i];
            const float z1 = flush(a1);
            const float w1 = flush(sum[i] + g1 * z1);
            const float out1 = z1 - g1 * w1;
            a1 = w1;
            float& a2 = p[5][i];
            const float z2 = flush(a2);
            const float w2 = flush(g2 * z2 + out1);
            const float out2 = z2 - g2 * w2;
            a2 = w2;
            float& delay = p[6][i];
            const float yd = flush(delay);
            delay = out2 * s_.output_gain;
            o[2 * i] += yd * gain_left;
            o[2 * i + 1] -= yd * gain_right;
        }
        done += block;
        for (int l = 0; l < kLines; ++l) {
            uint32_t& c = cursor_[l];
            c += static_cast<uint32_t>(block);
            if (c >= s_.length[l]) c = 0;
        }
    }
}

}  // namespace ondrel
