#pragma once
#include <cstdint>
#include <cstring>
#include <vector>

namespace ondrel {

// Appends values to a byte vector, little-endian unless named otherwise; chunks get their
// length patched in.
class ByteWriter {
public:
    std::vector<uint8_t> bytes;

    void u8(uint8_t v) { bytes.push_back(v); }
    void u16le(uint16_t v) {
        u8(static_cast<uint8_t>(v));
        u8(static_cast<uint8_t>(v >> 8));
    }
    void u32le(uint32_t v) {
        u16le(static_cast<uint16_t>(v));
        u16le(static_cast<uint16_t>(v >> 16));
    }
    void u16be(uint16_t v) {
        u8(static_cast<uint8_t>(v >> 8));
        u8(static_cast<uint8_t>(v));
    }
    void raw(const void* p, size_t n) {
        const auto* b = static_cast<const uint8_t*>(p);
        bytes.insert(bytes.end(), b, b + n);
    }
    void zeros(size_t n) { bytes.insert(bytes.end(), n, 0); }
    template <typename T>
    void words(const T* v, int n) {
        for (int i = 0; i < n; ++i) u16le(static_cast<uint16_t>(v[i]));
    }

    // Starts a chunk: id, then a length filled in by end_chunk.
    size_t begin_chunk(const char (&id)[5]) {
        raw(id, 4);
        const size_t at = bytes.size();
        u32le(0);
        return at;
    }
    void end_chunk(size_t at) {
        const uint32_t len = static_cast<uint32_t>(bytes.size() - at - 4);
        for (int i = 0; i < 4; ++i) bytes[at + i] = static_cast<uint8_t>(len >> (8 * i));
    }
    void end_chunk_be(size_t at) {
        const uint32_t len = static_cast<uint32_t>(bytes.size() - at - 4);
        for (int i = 0; i < 4; ++i) bytes[at + i] = static_cast<uint8_t>(len >> (24 - 8 * i));
    }
};

}  // namespace ondrel
