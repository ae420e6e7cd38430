#include "song/sample.h"

#include <algorithm>
#include <cstring>
#include <new>

namespace ondrel {

void SampleFree::operator()(p_s* s) const {
    if (!s) return;
    s->~p_s();
    ::operator delete (static_cast<void*>(s), std::align_val_t{alignof(std::max_align_t)});
}

void SampleBlockFree::operator()(uint8_t* block) const {
    ::operator delete (static_cast<void*>(block), std::align_val_t{alignof(std::max_align_t)});
}

SampleBlock make_sample_block(size_t bytes) {
    void* raw = ::operator new (std::max(bytes, sizeof(p_s)), std::align_val_t{alignof(std::max_align_t)});
    std::memset(raw, 0, std::max(bytes, sizeof(p_s)));
    return SampleBlock(static_cast<uint8_t*>(raw));
}

SampleRef sample_in_place(SampleBlock block, uint32_t length) {
    auto* s = new (block.release()) p_s{};
    s->data = reinterpret_cast<uint8_t*>(s) + sizeof(p_s);
    s->length = length;
    Raz_data(*s);
    return SampleRef(s);
}

SampleRef make_sample(uint32_t length) {
    return sample_in_place(make_sample_block(sizeof(p_s) + size_t{length} + kSampleSlack), length);
}

SampleRef copy_sample(const p_s& sample) {
    SampleRef copy = make_sample(sample.length);
    uint8_t* const data = copy->data;
    std::memcpy(static_cast<void*>(copy.get()), &sample, sizeof(p_s));
    copy->data = sample.data ? data : nullptr;
    if (sample.data && sample.length) std::memcpy(data, sample.data, sample.length);
    return copy;
}

void Raz_data(p_s& s) {
    uint8_t* const data = s.data;
    const uint32_t length = s.length;
    const int16_t volume = s.volume;
    std::memset(&s, 0, sizeof s);
    s.data = data;
    s.length = length;
    s.volume = volume;
    s.refnote = 72;
    s.range1[1] = 127;
    s.range2[1] = 127;
    s.range3[1] = 127;
    static constexpr uint8_t kX[kEnvelopePoints] = {0, 64, 128, 192, 255};
    static constexpr uint8_t kFade[kEnvelopePoints] = {128, 96, 64, 32, 0};
    for (int p = 0; p < kEnvelopePoints; ++p) {
        for (int k = 0; k < kEnvelopeKinds; ++k) {
            const uint8_t level = k == 0 ? 128 : k == 4 ? kFade[p] : 64;
            s.env(k, p) = static_cast<uint16_t>(kX[p] << 8 | level);
        }
    }
    s.level = 64;
    s.setting = 102400;
}

int16_t frame_code(int bits, bool stereo) {
    return static_cast<int16_t>((bits == 16 ? 1 : 0) + (stereo ? 1 : 0));
}

void bound_loop(p_s& s) {
    s.loopend = std::min(s.loopend, s.length);
    s.loopstart = std::min(s.loopstart, s.length);
    if (s.loopon && s.loopstart > s.loopend) s.loopstart = s.loopend;
}

void set_sample_name(p_s& s, const char* text, size_t max_len) {
    const size_t cap = std::min(max_len, sizeof s.name - 1);
    size_t i = 0;
    for (; i < cap && text[i]; ++i) s.name[i] = text[i];
    std::memset(s.name + i, 0, sizeof s.name - i);
}

}  // namespace ondrel

namespace ondrel {

void bound_sample(p_s& s) {
    if (s.bits != 16) s.bits = 8;
    s.stereo = s.stereo ? 1 : 0;
    s.framecode = frame_code(s.bits, s.stereo);
    if (s.refnote < 0) s.refnote = 0;
    if (s.refnote > 127) s.refnote = 127;
    s.name[sizeof s.name - 1] = 0;
    s.source_path[sizeof s.source_path - 1] = 0;
    bound_loop(s);
}

}  // namespace ondrel
