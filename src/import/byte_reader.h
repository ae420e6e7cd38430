#pragma once
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <span>
#include <vector>

namespace ondrel {

// Reads a byte range without ever going past it. A read beyond the end yields zeros for
// the missing bytes and marks the reader truncated, so readers can keep what was read.
class ByteReader {
public:
    ByteReader() = default;
    explicit ByteReader(std::span<const uint8_t> bytes) : data_(bytes) {}
    // The reader only looks at the bytes: they must outlive it.
    explicit ByteReader(std::vector<uint8_t>&&) = delete;

    size_t size() const { return data_.size(); }
    size_t tell() const { return pos_; }
    size_t remaining() const { return pos_ < data_.size() ? data_.size() - pos_ : 0; }
    bool truncated() const { return truncated_; }
    bool at_end() const { return pos_ >= data_.size(); }
    const uint8_t* here() const { return data_.data() + (pos_ < data_.size() ? pos_ : data_.size()); }

    void seek(size_t pos) {
        if (pos > data_.size()) {
            truncated_ = true;
            pos = data_.size();
        }
        pos_ = pos;
    }
    void skip(size_t n) {
        if (n > remaining()) {
            truncated_ = true;
            pos_ = data_.size();
        } else {
            pos_ += n;
        }
    }

    // Copies n bytes; returns how many were really there (the rest are zero).
    size_t read(void* out, size_t n) {
        const size_t got = n < remaining() ? n : remaining();
        if (got) std::memcpy(out, data_.data() + pos_, got);
        if (got < n) {
            std::memset(static_cast<uint8_t*>(out) + got, 0, n - got);
            truncated_ = true;
        }
        pos_ = got < n ? data_.size() : pos_ + n;
        return got;
    }

    uint8_t u8() {
        uint8_t b = 0;
        read(&b, 1);
        return b;
    }
    int8_t s8() { return static_cast<int8_t>(u8()); }
    uint16_t u16be() {
        uint8_t b[2];
        read(b, 2);
        return static_cast<uint16_t>(b[0] << 8 | b[1]);
    }
    uint16_t u16le() {
        uint8_t b[2];
        read(b, 2);
        return static_cast<uint16_t>(b[1] << 8 | b[0]);
    }
    uint32_t u32be() {
        uint8_t b[4];
        read(b, 4);
        return uint32_t{b[0]} << 24 | uint32_t{b[1]} << 16 | uint32_t{b[2]} << 8 | b[3];
    }
    uint32_t u32le() {
        uint8_t b[4];
        read(b, 4);
        return uint32_t{b[3]} << 24 | uint32_t{b[2]} << 16 | uint32_t{b[1]} << 8 | b[0];
    }

    // A reader over the next n bytes (as many as exist); this one moves past all n.
    ByteReader sub(size_t n) {
        const size_t got = n < remaining() ? n : remaining();
        ByteReader r(data_.subspan(pos_ < data_.size() ? pos_ : data_.size(), got));
        if (got < n) r.short_by_ = true;
        skip(n);
        return r;
    }
    // True when this reader was cut short by the end of its parent.
    bool short_of_declared() const { return short_by_; }

private:
    std::span<const uint8_t> data_;
    size_t pos_ = 0;
    bool truncated_ = false;
    bool short_by_ = false;
};

}  // namespace ondrel
