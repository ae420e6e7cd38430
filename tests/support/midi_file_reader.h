#pragma once
// A standard MIDI file read back on its own terms, and its tempo map applied as a
// sequencer reading it would.
#include <cstdint>
#include <stdexcept>
#include <string>
#include <vector>

namespace ondrel::test {

struct ReadMessage {
    uint32_t tick;
    uint8_t status, data1, data2;
};
struct ReadTrack {
    std::string name;
    std::vector<ReadMessage> messages;
    uint32_t end_tick = 0;
};
struct ReadMidi {
    int division = 0;
    std::vector<ReadTrack> tracks;
    std::vector<std::pair<uint32_t, uint32_t>> tempo;  // tick, microseconds a quarter note
};

// Throws on a file that is not well formed: lengths, delta times, End of Track last.
inline ReadMidi read_midi(const std::vector<uint8_t>& b) {
    ReadMidi f;
    size_t at = 0;
    const auto be = [&](int bytes, uint32_t v = 0) {
        while (bytes--) v = v << 8 | b.at(at++);
        return v;
    };
    const auto quantity = [&](uint32_t v = 0) {
        for (int i = 0; i < 4; ++i)
            if (v = v << 7 | (b.at(at) & 0x7F); !(b.at(at++) & 0x80)) return v;
        throw std::runtime_error("delta time over four bytes");
    };
    if (be(4) != 0x4D546864 || be(4) != 6 || be(2) != 1) throw std::runtime_error("no format 1 header");
    f.tracks.resize(be(2));
    f.division = static_cast<int>(be(2));
    for (ReadTrack& t : f.tracks) {
        if (be(4) != 0x4D54726B) throw std::runtime_error("no MTrk");
        const size_t end = be(4) + at;
        for (uint32_t tick = 0; at < end;) {
            tick += quantity();
            if (const uint8_t status = b.at(at++); status != 0xFF) {
                const bool one_byte = (status & 0xF0) == 0xC0;
                t.messages.push_back({tick, status, b.at(at), one_byte ? uint8_t{0} : b.at(at + 1)});
                at += one_byte ? 1 : 2;
                continue;
            }
            const uint8_t type = b.at(at++);
            const size_t from = at + 1;
            at = from + b.at(at);
            if (type == 0x03) t.name.assign(b.begin() + long(from), b.begin() + long(at));
            if (type == 0x51)
                f.tempo.push_back({tick, uint32_t(b.at(at - 3) << 16 | b.at(at - 2) << 8 | b.at(at - 1))});
            if (type == 0x2F && at != end) throw std::runtime_error("End of Track before the chunk's end");
            if (type == 0x2F) t.end_tick = tick;
        }
        if (at != end || b.at(at - 3) != 0xFF || b.at(at - 2) != 0x2F) throw std::runtime_error("track end");
    }
    if (at != b.size()) throw std::runtime_error("bytes after the last track");
    return f;
}

// The tick, not rounded, at which the file's tempi put a time.
inline double tick_at_seconds(const ReadMidi& f, double seconds) {
    double us = seconds * 1e6, tick = 0, tempo = 500000;
    for (const auto& [at, next] : f.tempo) {
        if ((at - tick) * tempo / f.division > us) break;
        us -= (at - tick) * tempo / f.division;
        tick = at;
        tempo = next;
    }
    return tick + us * f.division / tempo;
}

}  // namespace ondrel::test
