#pragma once
// Builds files byte by byte for the tests: values of either byte order, text and fill.
#include <cstdint>
#include <initializer_list>
#include <string>
#include <vector>

namespace ondrel::test {

class Bytes {
public:
    std::vector<uint8_t> v;

    Bytes& u8(int x) {
        v.push_back(static_cast<uint8_t>(x));
        return *this;
    }
    Bytes& be16(int x) { return u8(x >> 8).u8(x); }
    Bytes& le16(int x) { return u8(x).u8(x >> 8); }
    Bytes& be32(uint32_t x) { return be16(static_cast<int>(x >> 16)).be16(static_cast<int>(x & 0xffff)); }
    Bytes& le32(uint32_t x) { return le16(static_cast<int>(x & 0xffff)).le16(static_cast<int>(x >> 16)); }
    Bytes& text(const std::string& s, size_t width) {
        for (size_t i = 0; i < width; ++i) u8(i < s.size() ? s[i] : 0);
        return *this;
    }
    Bytes& zeros(size_t n) {
        v.insert(v.end(), n, 0);
        return *this;
    }
    Bytes& bytes(std::initializer_list<int> list) {
        for (int x : list) u8(x);
        return *this;
    }
};

}  // namespace ondrel::test
