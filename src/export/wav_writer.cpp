#include "export/wav_writer.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <vector>

namespace ondrel {

int wav_sample_bytes(WavSampleFormat format) {
    switch (format) {
        case WavSampleFormat::Pcm8: return 1;
        case WavSampleFormat::Pcm16: return 2;
        case WavSampleFormat::Float32: return 4;
    }
    return 2;
}

namespace {
// Size fields of a header that cannot be rewritten: unknown, read to the end of the stream.
constexpr uint32_t kUnknownSize = 0xFFFFFFFF;
// Largest data chunk a RIFF size field can describe, with the header and a pad byte.
constexpr uint64_t kMaxDataBytes = 0xFFFFFFF0ull;
}  // namespace

bool WavWriter::open(const std::string& path, int channels, int rate, WavSampleFormat format,
                     std::string& why) {
    if (!file_.open(path, why)) return false;
    channels_ = channels;
    rate_ = rate;
    format_ = format;
    frames_ = 0;
    const auto h = file_.seekable() ? header(0, 0) : header(kUnknownSize, kUnknownSize);
    if (!file_.write(h.data(), h.size())) {
        why = file_.error();
        file_.abandon();
        return false;
    }
    return true;
}

namespace {
void le16(std::vector<uint8_t>& b, uint32_t v) {
    b.push_back(static_cast<uint8_t>(v));
    b.push_back(static_cast<uint8_t>(v >> 8));
}
void le32(std::vector<uint8_t>& b, uint32_t v) {
    le16(b, v & 0xffff);
    le16(b, v >> 16);
}
void tag(std::vector<uint8_t>& b, const char* t) {
    for (int i = 0; i < 4; ++i) b.push_back(static_cast<uint8_t>(t[i]));
}
}  // namespace

std::vector<uint8_t> WavWriter::header(uint32_t data_bytes, uint32_t frames) const {
    const bool is_float = format_ == WavSampleFormat::Float32;
    const uint32_t bytes = static_cast<uint32_t>(wav_sample_bytes(format_));
    const uint32_t fmt_size = is_float ? 18 : 16;
    std::vector<uint8_t> h;
    tag(h, "RIFF");
    const uint32_t head = 4 + (8 + fmt_size) + (is_float ? 12 : 0) + 8;
    le32(h, data_bytes == kUnknownSize ? kUnknownSize : head + data_bytes + (data_bytes & 1));
    tag(h, "WAVE");
    tag(h, "fmt ");
    le32(h, fmt_size);
    le16(h, is_float ? 3 : 1);
    le16(h, static_cast<uint32_t>(channels_));
    le32(h, static_cast<uint32_t>(rate_));
    le32(h, static_cast<uint32_t>(rate_) * static_cast<uint32_t>(channels_) * bytes);
    le16(h, static_cast<uint32_t>(channels_) * bytes);
    le16(h, bytes * 8);
    if (is_float) {
        le16(h, 0);
        tag(h, "fact");
        le32(h, 4);
        le32(h, frames);
    }
    tag(h, "data");
    le32(h, data_bytes);
    return h;
}

bool WavWriter::write(const float* samples, size_t frames) {
    const size_t n = frames * static_cast<size_t>(channels_);
    uint8_t buffer[4096];
    const size_t per = static_cast<size_t>(wav_sample_bytes(format_));
    size_t done = 0;
    while (done < n) {
        const size_t chunk = std::min(n - done, sizeof buffer / per);
        for (size_t i = 0; i < chunk; ++i) {
            const float x = std::clamp(samples[done + i], -1.0f, 1.0f);
            switch (format_) {
                case WavSampleFormat::Pcm8:
                    buffer[i] = static_cast<uint8_t>(std::lrintf(x * 127.0f) + 128);
                    break;
                case WavSampleFormat::Pcm16: {
                    // Truncated, as the mixer hands its output to the recorder: a song
                    // rendered here and the same song recorded as it plays are the same.
                    const auto v = static_cast<int16_t>(x * 32767);
                    buffer[2 * i] = static_cast<uint8_t>(v & 0xff);
                    buffer[2 * i + 1] = static_cast<uint8_t>((v >> 8) & 0xff);
                    break;
                }
                case WavSampleFormat::Float32: std::memcpy(buffer + 4 * i, &x, 4); break;
            }
        }
        if (!file_.write(buffer, chunk * per)) return false;
        done += chunk;
    }
    frames_ += frames;
    return true;
}

bool WavWriter::finish(std::string& why) {
    if (!file_.is_open()) {
        why = file_.error().empty() ? "nothing to finish" : file_.error();
        return false;
    }
    const uint64_t data_bytes = frames_ * static_cast<uint64_t>(channels_) * wav_sample_bytes(format_);
    if (file_.seekable() && data_bytes > kMaxDataBytes) {
        why = "the sound is too long for a WAV file";
        abandon();
        return false;
    }
    const uint8_t pad = 0;
    bool ok = !(data_bytes & 1) || file_.write(&pad, 1);
    if (ok && file_.seekable()) {
        const auto h = header(static_cast<uint32_t>(data_bytes), static_cast<uint32_t>(frames_));
        ok = file_.rewrite(0, h.data(), h.size());
    }
    if (!ok) {
        why = file_.error();
        abandon();
        return false;
    }
    return file_.commit(why);
}

void WavWriter::abandon() {
    file_.abandon();
}

}  // namespace ondrel
