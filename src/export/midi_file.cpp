#include "export/midi_file.h"

#include <algorithm>

#include "export/byte_writer.h"
#include "export/output_file.h"

namespace ondrel {

namespace {

constexpr uint8_t kMeta = 0xFF;
constexpr uint8_t kMetaTrackName = 0x03;
constexpr uint8_t kMetaEndOfTrack = 0x2F;
constexpr uint8_t kMetaTempo = 0x51;
// The largest number a variable-length quantity holds: four bytes of seven bits.
constexpr uint32_t kMaxQuantity = 0x0FFFFFFF;

// Seven bits a byte, most significant first, the high bit set on all but the last.
void quantity(ByteWriter& w, uint32_t value) {
    value = std::min(value, kMaxQuantity);
    uint8_t groups[4];
    int n = 0;
    do {
        groups[n++] = static_cast<uint8_t>(value & 0x7F);
        value >>= 7;
    } while (value);
    while (n > 1) w.u8(static_cast<uint8_t>(groups[--n] | 0x80));
    w.u8(groups[0]);
}

// Writes the events of one track chunk, each after its delta from the one before.
class TrackChunk {
public:
    explicit TrackChunk(ByteWriter& w) : w_(w), at_(w.begin_chunk("MTrk")) {}

    void meta(uint32_t tick, uint8_t type, const void* data, size_t size) {
        delta_to(tick);
        w_.u8(kMeta);
        w_.u8(type);
        quantity(w_, static_cast<uint32_t>(size));
        w_.raw(data, size);
    }
    void name(const std::string& text) { meta(0, kMetaTrackName, text.data(), text.size()); }
    void message(const MidiMessage& m) {
        delta_to(m.tick);
        w_.u8(static_cast<uint8_t>(m.kind | ((m.channel - 1) & 0x0F)));
        w_.u8(m.data1 & 0x7F);
        if (m.kind != kMidiProgramChange) w_.u8(m.data2 & 0x7F);
    }
    void end(uint32_t tick) {
        meta(std::max(tick, last_), kMetaEndOfTrack, nullptr, 0);
        w_.end_chunk_be(at_);
    }

private:
    void delta_to(uint32_t tick) {
        // Out-of-order ticks would need a negative delta: they go at the same time instead.
        quantity(w_, tick > last_ ? tick - last_ : 0);
        last_ = std::max(tick, last_);
    }
    ByteWriter& w_;
    size_t at_;
    uint32_t last_ = 0;
};

}  // namespace

std::vector<uint8_t> midi_file_bytes(const MidiSong& song) {
    ByteWriter w;
    const size_t header = w.begin_chunk("MThd");
    w.u16be(1);  // format 1: tracks played together
    w.u16be(static_cast<uint16_t>(song.tracks.size() + 1));
    w.u16be(song.division);
    w.end_chunk_be(header);

    TrackChunk tempo(w);
    tempo.name(song.name);
    for (const MidiTempo& t : song.tempo) {
        const uint8_t us[3] = {static_cast<uint8_t>(t.us_per_quarter >> 16),
                               static_cast<uint8_t>(t.us_per_quarter >> 8),
                               static_cast<uint8_t>(t.us_per_quarter)};
        tempo.meta(t.tick, kMetaTempo, us, sizeof us);
    }
    tempo.end(song.end_tick);

    for (const MidiTrack& track : song.tracks) {
        TrackChunk chunk(w);
        chunk.name(track.name);
        for (const MidiMessage& m : track.messages) chunk.message(m);
        chunk.end(song.end_tick);
    }
    return std::move(w.bytes);
}

bool save_midi_file(const std::string& path, const MidiSong& song, std::string& why) {
    return write_output_file(path, midi_file_bytes(song), why);
}

}  // namespace ondrel
