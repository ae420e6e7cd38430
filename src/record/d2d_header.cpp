#include "record/d2d_header.h"

#include <cstring>

#include "record/record_format.h"

namespace ondrel {

namespace {
void put16(D2dHeader& h, size_t at, uint32_t v) {
    h[at] = static_cast<uint8_t>(v);
    h[at + 1] = static_cast<uint8_t>(v >> 8);
}
void put32(D2dHeader& h, size_t at, uint32_t v) {
    put16(h, at, v & 0xffff);
    put16(h, at + 2, v >> 16);
}
void tag(D2dHeader& h, size_t at, const char* t) {
    std::memcpy(h.data() + at, t, 4);
}
}  // namespace

void begin_d2d_header(D2dHeader& h, int samplermode) {
    const RecordFormat& f = record_format(samplermode);
    tag(h, 0, "RIFF");
    h[kRiffSizeAt] = 0;
    tag(h, 8, "WAVE");
    tag(h, 12, "fmt ");
    put32(h, 16, 18);
    put16(h, 20, 1);
    put16(h, 22, f.channels);
    put32(h, 24, kRecordRate);
    put32(h, 28, f.byte_rate);
    put16(h, 32, f.block_align);
    put16(h, 34, f.bits);
    put16(h, 36, 0);
    tag(h, 38, "data");
    h[kDataSizeAt] = 0;
}

void end_d2d_header(D2dHeader& h, uint32_t file_position) {
    put32(h, kRiffSizeAt, file_position - 38);
    put32(h, kDataSizeAt, file_position);
}

void unknown_d2d_sizes(D2dHeader& h) {
    put32(h, kRiffSizeAt, 0xffffffffu);
    put32(h, kDataSizeAt, 0xffffffffu);
}

}  // namespace ondrel
