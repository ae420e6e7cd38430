// Reader of Amiga-style MOD files: 15 and 31 samples, 1 to 32 channels.
#include <algorithm>
#include <array>
#include <cstring>

#include "import/module_preset.h"
#include "import/module_reader.h"

namespace ondrel {

namespace {

constexpr std::array<uint16_t, 36> kPeriods = {856, 808, 762, 720, 678, 640, 604, 570, 538, 508, 480, 453,
                                               428, 404, 381, 360, 339, 320, 302, 285, 269, 254, 240, 226,
                                               214, 202, 190, 180, 170, 160, 151, 143, 135, 127, 120, 113};
constexpr int kFirstNote = 36;
constexpr size_t kHeader15 = 600;
constexpr size_t kHeader31 = 1084;

// Samples and channels announced by the signature at 1080; 0 samples when there is none
// (a 15-sample file, whose bytes there are pattern data).
struct Layout {
    int samples = 15;
    int channels = 4;
};

Layout layout_of(const uint8_t* sig) {
    auto is = [&](const char* s) { return std::memcmp(sig, s, 4) == 0; };
    auto digit = [](uint8_t c) { return c >= '0' && c <= '9'; };
    if (is("M.K.") || is("M!K!") || is("M&K&") || is("FLT4")) return {31, 4};
    if (digit(sig[0]) && sig[0] != '0' && sig[1] == 'C' && sig[2] == 'H' && sig[3] == 'N')
        return {31, sig[0] - '0'};
    if (is("OCTA")) return {31, 8};
    if (digit(sig[0]) && digit(sig[1]) && sig[2] == 'C' && sig[3] == 'H') {
        const int n = (sig[0] - '0') * 10 + (sig[1] - '0');
        if (n >= 10 && n <= 32) return {31, n};
    }
    return {};
}

// Marks of the other module formats. Under a name that selects no reader, a file carrying
// one would be read as a 15-sample MOD of garbage; it is refused, saying what it is.
struct ForeignMark {
    size_t at;
    const char* mark;
    const char* refusal;
};
constexpr ForeignMark kForeignMarks[] = {
    {0, "Extended Module: ", "a FastTracker Module under another name; those are not supported yet"},
    {44, "SCRM", "a Scream Tracker Module under another name: give it the .s3m ending to load it"},
    {0, "MTM\x10", "a MultiTracker Module under another name: give it the .mtm ending to load it"},
};

const char* foreign_refusal(const uint8_t* head) {
    for (const ForeignMark& f : kForeignMarks)
        if (std::memcmp(head + f.at, f.mark, std::strlen(f.mark)) == 0) return f.refusal;
    return nullptr;
}

TNOTE mod_cell(const uint8_t* c) {
    TNOTE cell{};
    const int period = (c[0] & 0x0f) << 8 | c[1];
    for (size_t i = 0; i < kPeriods.size(); ++i)
        if (kPeriods[i] == period) {
            cell.note = static_cast<uint8_t>(kFirstNote + i);
            break;
        }
    cell.instrument = static_cast<uint8_t>((c[0] & 0xf0) | c[2] >> 4);
    cell.command = c[2] & 0x0f;
    cell.parameter = c[3];
    return cell;
}

void read_sample(ByteReader& file, const uint8_t* h, ModuleRead& out, int index) {
    const uint32_t length = 2u * (h[22] << 8 | h[23]);
    const uint32_t start = 2u * (h[26] << 8 | h[27]);
    const uint32_t loop_words = h[28] << 8 | h[29];
    const uint32_t end = start + 2 * loop_words;
    SampleRef s = make_sample(length);
    if (length == 0) s->data = nullptr;
    char name[23] = {};
    std::memcpy(name, h, 22);
    set_sample_name(*s, name[0] ? name : "None", 22);
    s->rate = 8363;
    s->bits = 8;
    s->refnote = 48;
    s->volume = static_cast<int16_t>(h[25] * 2);
    s->finetune = static_cast<int16_t>(h[24] & 15);
    if (length) {
        if (file.read(s->data, length) < length) out.truncated = true;
    }
    s->loopon = !((start == 0 && loop_words == 1) || length == 0);
    s->loopstart = 0;
    s->loopend = length;
    if (end <= length) {
        s->loopstart = start;
        s->loopend = end;
    }
    if (end == 0) {
        s->loopon = 0;
        s->loopstart = s->loopend = length;
    }
    if (s->loopstart == s->loopend) s->loopon = 0;
    bound_sample(*s);
    copy_loop_start_past_end(*s);
    out.song.samples[index] = std::move(s);
}

}  // namespace

bool read_mod(ByteReader& file, ModuleRead& out) {
    // Shorter than the smallest header, a file would load as an empty song: refused instead.
    if (file.size() < kHeader15) {
        out.error = "too short to be a module (" + std::to_string(file.size()) + " bytes)";
        return false;
    }
    uint8_t head[kHeader31] = {};
    file.read(head, sizeof head);
    const Layout lay = layout_of(head + 1080);
    if (lay.samples == 15) {
        if (const char* refusal = foreign_refusal(head)) {
            out.error = refusal;
            return false;
        }
    }
    TMOD& m = *out.song.mod;
    preset_foreign_song(m, 1);
    char title[21] = {};
    std::memcpy(title, head, 20);
    set_text(m.name, title, 20);

    const size_t positions_at = 20 + 30 * static_cast<size_t>(lay.samples);
    const int positions = std::min<int>(head[positions_at], 128);
    m.nbpos = static_cast<uint8_t>(positions);
    m.repeat = head[positions_at + 1] > positions ? 0 : head[positions_at + 1];
    int patterns = 0;
    for (int i = 0; i < 128; ++i) {
        m.sequence[i] = head[positions_at + 2 + i];
        patterns = std::max(patterns, m.sequence[i] + 1);
    }
    m.nbtrack = static_cast<uint8_t>(lay.channels);

    file.seek(lay.samples == 31 ? kHeader31 : kHeader15);
    const size_t row_bytes = 4 * static_cast<size_t>(lay.channels);
    std::vector<uint8_t> rows(64 * row_bytes);
    for (int p = 0; p < patterns; ++p) {
        if (file.read(rows.data(), rows.size()) < rows.size()) out.truncated = true;
        if (p >= kPatternsPerSong) continue;  // no slot: read only to reach the samples
        PatternRef pat = make_pattern(lay.channels, 64);
        for (int r = 0; r < 64; ++r)
            for (int c = 0; c < lay.channels; ++c) pat->col[c][r] = mod_cell(&rows[r * row_bytes + 4 * c]);
        out.song.patterns[p] = std::move(pat);
    }
    for (int i = 0; i < lay.samples; ++i) read_sample(file, head + 20 + 30 * i, out, i);
    return true;
}

}  // namespace ondrel
