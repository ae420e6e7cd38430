#pragma once
// Builds native module files byte by byte for the tests: chunks of either layout with
// their lengths in the byte order the reader expects at that point.
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
    Bytes& raw(const std::vector<uint8_t>& b) {
        v.insert(v.end(), b.begin(), b.end());
        return *this;
    }
    Bytes& bytes(std::initializer_list<int> list) {
        for (int x : list) u8(x);
        return *this;
    }
    size_t size() const { return v.size(); }
};

// A file of chunks; lengths switch to little-endian after an "o.t." chunk, as the
// reader expects.
class ChunkFile {
public:
    std::vector<uint8_t> bytes;

    ChunkFile& chunk(const std::string& id, const Bytes& body) {
        return chunk_with_length(id, body, static_cast<uint32_t>(body.size()));
    }
    ChunkFile& chunk_with_length(const std::string& id, const Bytes& body, uint32_t length) {
        Bytes h;
        h.text(id, 4);
        if (id == "o.t." || id == ".t.o") little_ = true;
        if (little_)
            h.le32(length);
        else
            h.be32(length);
        bytes.insert(bytes.end(), h.v.begin(), h.v.end());
        bytes.insert(bytes.end(), body.v.begin(), body.v.end());
        return *this;
    }

private:
    bool little_ = false;
};

// Old-layout song header: speed, BPM and name.
inline Bytes old_header(int speed, int bpm, const std::string& name) {
    Bytes b;
    b.zeros(6).be16(speed).be16(bpm).zeros(4).text(name, 64);
    return b;
}

inline Bytes old_sequence(std::initializer_list<int> patterns, int repeat = 0) {
    Bytes b;
    b.be16(static_cast<int>(patterns.size())).be16(repeat).zeros(4);
    for (int p : patterns) b.u8(p);
    return b;
}

inline Bytes old_pattern_format(int tracks, const std::string& tag) {
    Bytes b;
    b.be16(tracks).zeros(2).text(tag, 4);
    return b;
}

// One old-layout sample header (50 bytes short form, 52 long form).
struct OldSampleHeader {
    uint32_t length = 0;
    int finetune = 0;
    int volume = 32;
    uint32_t loopstart = 0;
    uint32_t looplen = 0;
    std::string name;
    int format = 8;  // low byte bits, bit 11 stereo
    int refnote = 72;
    uint32_t rate = 8363;

    void write(Bytes& b, bool long_form) const {
        b.zeros(4).be32(length).u8(finetune).u8(volume).be32(loopstart).be32(looplen);
        b.text(name, 22).be16(format).be16(refnote).zeros(2).be32(rate);
        if (long_form) b.zeros(2);
    }
};

inline Bytes old_instruments(const std::vector<OldSampleHeader>& headers, bool long_form) {
    Bytes b;
    b.be16(static_cast<int>(headers.size()) | (long_form ? 0x8000 : 0));
    if (long_form) b.zeros(2);
    for (const auto& h : headers) h.write(b, long_form);
    return b;
}

// Offsets where the chunks of a native file end, lengths read in the order the reader
// uses (big-endian until "o.t.").
inline std::vector<size_t> chunk_ends(const std::vector<uint8_t>& f) {
    std::vector<size_t> ends;
    bool little = false;
    for (size_t at = 0; at + 8 <= f.size();) {
        const std::string id(f.begin() + static_cast<long>(at), f.begin() + static_cast<long>(at) + 4);
        if (id == "o.t." || id == ".t.o") little = true;
        const size_t len = little ? (f[at + 4] | f[at + 5] << 8 | f[at + 6] << 16 | size_t{f[at + 7]} << 24)
                                  : (size_t{f[at + 4]} << 24 | f[at + 5] << 16 | f[at + 6] << 8 | f[at + 7]);
        at += 8 + len;
        ends.push_back(at);
    }
    return ends;
}

}  // namespace ondrel::test
