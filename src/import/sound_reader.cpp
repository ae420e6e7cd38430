// Sound files into sample records: AVR, AIFF, WAV and the fixed 54-byte-header type.
#include "import/sound_reader.h"

#include <algorithm>
#include <cctype>
#include <cstring>
#include <filesystem>
#include <mutex>

#include "import/module_preset.h"

namespace ondrel {

namespace {

bool starts_nocase(const std::string& ext, const char* key) {
    const size_t n = std::strlen(key);
    if (ext.size() < n) return false;
    for (size_t i = 0; i < n; ++i)
        if (std::tolower(static_cast<unsigned char>(ext[i])) !=
            std::tolower(static_cast<unsigned char>(key[i])))
            return false;
    return true;
}

bool same_nocase(const std::string& a, const char* b) {
    return a.size() == std::strlen(b) && starts_nocase(a, b);
}

// 24-bit value of the low three bytes of a big-endian or little-endian size.
uint32_t low24_be(const uint8_t* p) {
    return uint32_t{p[1]} << 16 | uint32_t{p[2]} << 8 | p[3];
}
uint32_t low24_le(const uint8_t* p) {
    return uint32_t{p[2]} << 16 | uint32_t{p[1]} << 8 | p[0];
}

void swap16(uint8_t* data, uint32_t bytes) {
    for (uint32_t i = 0; i + 1 < bytes; i += 2) std::swap(data[i], data[i + 1]);
}

// A record for up to wanted bytes of data at the reader's position; only the bytes the
// file really holds are taken.
SampleRef take_data(ByteReader& file, uint64_t wanted) {
    const uint32_t length =
        static_cast<uint32_t>(std::min<uint64_t>({wanted, file.remaining(), kMaxSampleBytes}));
    SampleRef s = make_sample(length);
    file.read(s->data, length);
    return s;
}

bool read_avr(ByteReader& file, SampleRef& out) {
    uint8_t h[128] = {};
    if (file.read(h, sizeof h) < sizeof h) return false;
    SampleRef s = take_data(file, file.remaining());
    if (h[4]) {
        char name[9] = {};
        std::memcpy(name, h + 4, 8);
        set_sample_name(*s, name, 8);
    }
    s->stereo = h[13] > 1;
    s->bits = h[15];
    s->loopon = static_cast<uint16_t>(h[18] << 8 | h[19]);
    s->refnote = h[21];
    s->rate = static_cast<uint32_t>(h[24] << 8 | h[25]);
    const uint32_t loop_start = (uint32_t{h[31]} << 16 | uint32_t{h[32]} << 8 | h[33]) & ~1u;
    const uint32_t loop_end = (uint32_t{h[35]} << 16 | uint32_t{h[36]} << 8 | h[37]) & 0x3fffffe;
    if (s->bits == 16) swap16(s->data, s->length);
    if (int64_t{s->length} - 4 <= loop_start) s->loopon = 0;
    s->loopstart = loop_start;
    // The end is the file's end plus its start: the sum, as the format is read here.
    s->loopend = s->loopon ? loop_end + loop_start : s->length;
    s->source_offset = 128;
    out = std::move(s);
    return true;
}

bool read_aiff(ByteReader& file, SampleRef& out, std::string& why) {
    uint8_t form[12] = {};
    file.read(form, sizeof form);
    if (std::memcmp(form, "FORM", 4) != 0) {
        why = "not an AIFF file (no FORM)";
        return false;
    }
    int channels = 1, bits = 8;
    uint32_t frames = 0, rate = 0;
    size_t at = 12;
    for (;;) {
        file.seek(at);
        uint8_t chunk[8] = {};
        if (file.read(chunk, 8) < 8) {
            why = "no sound data in the file (no SSND chunk)";
            return false;
        }
        if (std::memcmp(chunk, "SSND", 4) == 0) break;
        if (std::memcmp(chunk, "COMM", 4) == 0) {
            uint8_t c[20] = {};
            file.read(c, sizeof c);
            channels = c[1];
            frames = uint32_t{c[2]} << 24 | uint32_t{c[3]} << 16 | uint32_t{c[4]} << 8 | c[5];
            bits = c[7];
            // The top 16 bits of the mantissa, the exponent not applied: exact from 32768
            // to 65535 Hz, as songs made with it sound.
            rate = static_cast<uint32_t>(c[10] << 8 | c[11]);
        }
        at += size_t{low24_be(chunk + 4)} + 8;
    }
    const size_t ssnd_at = at;
    file.skip(8);
    const uint64_t wanted = uint64_t{frames} * static_cast<uint64_t>(channels) * (bits == 16 ? 2 : 1);
    SampleRef s = take_data(file, wanted);
    if (bits == 16) swap16(s->data, s->length);
    s->rate = rate;
    s->bits = static_cast<int16_t>(bits);
    s->stereo = channels == 2;
    s->loopon = 0;
    s->loopstart = s->loopend = s->length;
    s->source_offset = static_cast<uint32_t>(ssnd_at);
    out = std::move(s);
    return true;
}

constexpr size_t kWorkBuffer = 4096;

bool read_wav(ByteReader& file, SampleRef& out, std::string& why) {
    file.skip(12);
    uint8_t header[8] = {};
    file.read(header, 8);
    // The first chunk is taken as the format chunk, whatever its id.
    const uint32_t fmt_size = low24_le(header + 4);
    uint8_t fmt[kWorkBuffer] = {};
    file.read(fmt, std::min<size_t>(fmt_size, kWorkBuffer));  // a larger one is cut to the work buffer
    const int channels = fmt[2];
    const uint32_t rate = static_cast<uint32_t>(fmt[4] | fmt[5] << 8);  // only 16 bits are taken
    const int bits = fmt[14];
    // Other sizes would play as noise: refused, the slot keeps its sound.
    if (bits != 8 && bits != 16) {
        why = std::to_string(bits) + "-bit sound files are not read; save it with 8 or 16 bits";
        return false;
    }
    size_t at = size_t{fmt_size} + 20;
    for (;;) {
        file.seek(at);
        uint8_t id[4] = {};
        if (file.read(id, 4) < 4) {
            why = "no sound data in the file (no data chunk)";
            return false;
        }
        if (std::memcmp(id, "data", 4) == 0) break;
        uint8_t size[4] = {};
        file.read(size, 4);
        at += size_t{low24_le(size)} + 8;
    }
    const uint32_t data_size = file.u32le();
    SampleRef s = take_data(file, data_size);
    if (bits == 8) make_signed8(s->data, s->length);
    s->rate = rate;
    s->bits = static_cast<int16_t>(bits);
    s->stereo = channels == 2;
    s->loopon = 0;
    s->loopstart = s->length;
    s->loopend = 0;
    s->source_offset = 4;
    out = std::move(s);
    return true;
}

bool read_fixed_header(ByteReader& file, SampleRef& out, std::string& why) {
    uint8_t h[54] = {};
    if (file.read(h, sizeof h) < sizeof h) {
        why = "too short for a sound file";
        return false;
    }
    const int channels = h[20] | h[21] << 8;
    const int bits = h[28] | h[29] << 8;
    const uint32_t rate = static_cast<uint32_t>(h[32] | h[33] << 8);
    const uint32_t extra =
        uint32_t{h[48]} | uint32_t{h[49]} << 8 | uint32_t{h[50]} << 16 | uint32_t{h[51]} << 24;
    // The extra block is passed over, however large: only the data after it are kept.
    if (uint64_t{extra} + 54 > file.size()) {
        why = "the header's extra block runs past the end of the file";
        return false;
    }
    file.seek(54 + size_t{extra});
    SampleRef s = take_data(file, file.remaining());
    s->rate = rate;
    s->bits = static_cast<int16_t>(bits);
    s->stereo = channels == 2;
    s->loopon = 0;
    s->loopstart = s->length >= 2 ? s->length - 2 : 0;
    s->loopend = 2;
    s->source_offset = 54 + extra;
    out = std::move(s);
    return true;
}

}  // namespace

std::string extension_of(const std::string& path) {
    const size_t dot = path.rfind('.');
    return dot == std::string::npos ? std::string() : path.substr(dot);
}

int returntype(const std::string& path, const std::string& mime) {
    const std::string ext = extension_of(path);
    int result = kOtherFile;
    if (starts_nocase(ext, ".AVR")) result = kSoundFile;
    if (starts_nocase(ext, ".AIF")) result = kSoundFile;
    if (same_nocase(mime, "audio/x-wav")) result = kSoundFile;
    if (starts_nocase(ext, ".WAV")) result = kSoundFile;
    if (same_nocase(mime, "audio/x-aiff")) result = kSoundFile;
    if (starts_nocase(ext, ".aiff")) result = kSoundFile;
    for (const char* e : {".otm", ".mtm", ".mod", ".s3m", ".xm"})
        if (starts_nocase(ext, e)) result = kModuleFile;
    for (const char* m : {"audio/x-xm", "audio/x-otm", "audio/x-mtm", "audio/x-mod", "audio/x-s3m"})
        if (same_nocase(mime, m)) result = kModuleFile;
    return result;
}

SoundKind sound_kind(const std::string& path, const std::string& mime) {
    const std::string ext = extension_of(path);
    SoundKind kind = SoundKind::None;
    if (starts_nocase(ext, ".AVR")) kind = SoundKind::Avr;
    if (starts_nocase(ext, ".AIF")) kind = SoundKind::FixedHeader;
    if (starts_nocase(ext, ".WAV")) kind = SoundKind::Wav;
    if (same_nocase(mime, "audio/x-aiff")) kind = SoundKind::Aiff;
    if (starts_nocase(ext, ".aiff")) kind = SoundKind::Aiff;
    return kind;
}

bool read_sound(ByteReader& file, SoundKind kind, const std::string& path, const std::string& leaf,
                SampleRef& out, std::string& why) {
    bool ok = false;
    switch (kind) {
        case SoundKind::Avr:
            ok = read_avr(file, out);
            if (!ok) why = "too short for an AVR file";
            break;
        case SoundKind::Aiff: ok = read_aiff(file, out, why); break;
        case SoundKind::Wav: ok = read_wav(file, out, why); break;
        case SoundKind::FixedHeader: ok = read_fixed_header(file, out, why); break;
        case SoundKind::None: why = "not a sound file the program reads"; break;
    }
    if (!ok) return false;
    p_s& s = *out;
    s.halfrate = s.rate >> 1;
    set_text(s.source_path, path.c_str());
    s.volume = 128;
    s.refnote = 72;
    s.default_words[0] = 0;
    s.default_words[1] = 127;
    s.default_words[2] = 128;
    s.default_words[3] = 0;
    s.trailing = 0;
    if (!s.name[0]) {
        // The leaf without its extension; a leaf that is only an extension keeps its dot.
        std::string name = leaf;
        const size_t dot = name.rfind('.');
        if (dot != std::string::npos && dot > 0) name.resize(dot);
        set_sample_name(s, name.c_str(), 31);
    }
    bound_sample(s);
    return true;
}

bool read_sound_file(const std::string& path, const std::string& mime, SampleRef& out, std::string& why) {
    std::vector<uint8_t> bytes;
    if (!read_file(path, bytes, why)) return false;
    const SoundKind kind = sound_kind(path, mime);
    if (kind == SoundKind::None) {
        why = path + ": not a sound file the program reads";
        return false;
    }
    ByteReader file(bytes);
    if (!read_sound(file, kind, path, std::filesystem::path(path).filename().string(), out, why)) {
        why = path + ": " + why;
        return false;
    }
    return true;
}

LoadResult loadsnd(const std::string& path, const std::string& mime, SongBank& bank, int slot) {
    LoadResult result;
    if (slot < 0 || slot >= kSamplesPerSong) {
        result.error = "sound slots are numbered 1 to 128";
        return result;
    }
    SampleRef sample;
    if (!read_sound_file(path, mime, sample, result.error)) return result;
    bank.replace_sound(slot, sample);
    result.ok = true;
    result.song = bank.noimod;
    return result;
}

uint32_t read32(const char* p) {
    const auto* b = reinterpret_cast<const uint8_t*>(p);
    return uint32_t{b[0]} << 24 | uint32_t{b[1]} << 16 | uint32_t{b[2]} << 8 | b[3];
}

uint16_t read16(const char* p) {
    const auto* b = reinterpret_cast<const uint8_t*>(p);
    return static_cast<uint16_t>(b[0] << 8 | b[1]);
}

char* findstr(char* text, const char* key, long length) {
    const long n = static_cast<long>(std::strlen(key));
    for (long i = 0; i + n <= length; ++i) {
        if (text[i] == 0) return nullptr;
        if (std::strncmp(text + i, key, static_cast<size_t>(n)) == 0) {
            for (long j = i + n; j < length; ++j)
                if (text[j] == '\n') text[j] = 0;
            return text + i + n;
        }
    }
    return nullptr;
}

}  // namespace ondrel
