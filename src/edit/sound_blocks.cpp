#include "edit/sound_blocks.h"

#include <algorithm>
#include <bit>

#include "edit/sound_frames.h"

namespace ondrel {

namespace {

constexpr PatMark kNoBlock{kEmptyMark, 0};

PatMark* block_mark(SongTransaction& t, int slot, int n) {
    const int entry = block_entry(slot);
    if (entry < 0 || n < 1 || n > kSoundBlocks) return nullptr;
    return &t.record().patmark[entry][n - 1];
}

bool write_mark(PatMark& mark, PatMark value) {
    if (mark.position == value.position && mark.value == value.value) return false;
    mark = value;
    return true;
}

}  // namespace

std::string block_name(int n) {
    return "Block " + std::to_string(n);
}

int block_entry(int slot) {
    return slot >= 0 && slot < kSamplesPerSong - 1 ? slot + 1 : -1;
}

std::optional<FrameRange> sound_block(const TMOD& song, int slot, int n, uint32_t frames) {
    const int entry = block_entry(slot);
    if (entry < 0 || n < 1 || n > kSoundBlocks) return std::nullopt;
    const PatMark& mark = song.patmark[entry][n - 1];
    if (mark.position == kEmptyMark || mark.position < 0 || mark.value < 0) return std::nullopt;
    return FrameRange{static_cast<uint32_t>(mark.position),
                      mark.value ? static_cast<uint32_t>(mark.value) : frames};
}

bool set_sound_block(SongTransaction& t, int slot, int n, FrameRange range) {
    const auto span = resolve_range(range, sound_frames(t.view_sample(slot)));
    PatMark* mark = span ? block_mark(t, slot, n) : nullptr;
    if (!mark) return false;
    return write_mark(*mark, {static_cast<int32_t>(span->first), static_cast<int32_t>(span->end)});
}

bool move_sound_block(SongTransaction& t, int slot, int n, uint32_t first) {
    const uint32_t frames = sound_frames(t.view_sample(slot));
    const auto block = frames ? sound_block(t.record(), slot, n, frames) : std::nullopt;
    if (!block || block->first >= block->end) return false;
    const uint32_t length = std::min(block->end, frames) - std::min(block->first, frames);
    first = std::min(first, frames - length);
    return set_sound_block(t, slot, n, {first, first + length});
}

bool clear_sound_block(SongTransaction& t, int slot, int n) {
    PatMark* mark = block_mark(t, slot, n);
    return mark && write_mark(*mark, kNoBlock);
}

uint64_t FrameShift::start_point(uint64_t p, int shift) const {
    const uint64_t a = uint64_t{first} << shift, n = uint64_t{count} << shift, b = a + n;
    switch (kind) {
        case Kind::Cut: return p < a ? p : p >= b ? p - n : a;
        case Kind::Insert: return p >= a ? p + n : p;
        case Kind::Crop: return std::clamp(p, a, b) - a;
    }
    return p;
}

uint64_t FrameShift::end_point(uint64_t p, int shift) const {
    if (kind == Kind::Insert) return p > (uint64_t{first} << shift) ? p + (uint64_t{count} << shift) : p;
    return start_point(p, shift);
}

void follow_frames(SongTransaction& t, int slot, const FrameShift& shift) {
    const p_s* view = t.view_sample(slot);
    if (!view) return;
    change_header(t, slot, [&](p_s& s) {
        const int bytes_shift = std::countr_zero(frame_bytes(s));
        s.loopstart =
            static_cast<uint32_t>(std::min<uint64_t>(shift.start_point(s.loopstart, bytes_shift), s.length));
        s.loopend =
            static_cast<uint32_t>(std::min<uint64_t>(shift.end_point(s.loopend, bytes_shift), s.length));
        if (s.loopon && s.loopstart >= s.loopend) s.loopon = 0;
    });
    const int entry = block_entry(slot);
    if (entry < 0) return;
    const uint64_t frames = sound_frames(view);
    for (PatMark& mark : t.record().patmark[entry]) {
        if (mark.position == kEmptyMark) continue;
        if (mark.position < 0 || mark.value < 0) {
            mark = kNoBlock;
            continue;
        }
        const uint64_t start = shift.start_point(static_cast<uint64_t>(mark.position), 0);
        uint64_t end = mark.value ? shift.end_point(static_cast<uint64_t>(mark.value), 0) : 0;
        if (end > frames) end = frames;
        if (start >= frames || (end != 0 && start >= end))
            mark = kNoBlock;
        else
            mark = {static_cast<int32_t>(start), static_cast<int32_t>(end)};
    }
}

}  // namespace ondrel
