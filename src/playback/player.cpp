#include "playback/player.h"

#include <algorithm>
#include <chrono>
#include <mutex>
#include <thread>

#include "playback/effect_commands.h"
#include "playback/tables.h"

namespace ondrel {

uint64_t system_time_us() {
    return static_cast<uint64_t>(std::chrono::duration_cast<std::chrono::microseconds>(
                                     std::chrono::steady_clock::now().time_since_epoch())
                                     .count());
}

Player::Player(SongBank& bank, EffectSlots& slots) : bank_(bank), slots_(slots) {
    for (int t = 0; t < kTracks; ++t) curvoice_[t] = static_cast<int16_t>(t);
}

int Player::ilestou(int position) const {
    const TMOD& m = bank_.current();
    if (position < 0 || position >= kPositions) return -1;
    const int pattern = m.sequence[position];
    if (pattern >= kPatternsPerSong) return -1;
    return m.patbase + pattern;
}

int Player::dopatend() {
    const TMOD& m = bank_.current();
    tr.patend = m.nbpos;
    int rows = 0;
    for (int i = 0; i < m.nbpos; ++i) rows += m.rows[m.sequence[i]];
    return rows;
}

void Player::gere_play() {
    // What this thread writes here, the window thread only shows: relaxed stores, since a
    // sequentially consistent one is a locked exchange, paid several times a buffer.
    constexpr auto relaxed = std::memory_order_relaxed;
    if (tr.fvuvu.load(relaxed)) {
        // Only meters a note lit still fall; the rest stay at zero.
        static_assert(kTracks <= 64, "a bit per track");
        for (uint64_t bits = falling_meters_; bits; bits &= bits - 1) {
            const int t = __builtin_ctzll(bits);
            const float v = tr.valvu[t].load(relaxed) - 1.0f;
            tr.valvu[t].store(std::max(v, 0.0f), relaxed);
            if (v <= 0.0f) falling_meters_ &= ~(uint64_t{1} << t);
        }
    }
    const uint8_t playing = tr.playing.load(std::memory_order_acquire);
    if (playing != tr.oldplaying.load(relaxed)) {
        tr.startplaying.store(static_cast<int64_t>(system_time_us()), relaxed);
        tr.oldplaying.store(playing, relaxed);
    }
    if (!playing && !tr.fplayonenote.load(relaxed) && !tr.fplaytrack.load(relaxed)) {
        tr.notick.store(0, relaxed);
        return;
    }

    const TMOD& m = bank_.current();
    const bool track_mode = tr.fplaytrack.load(relaxed);
    const int left_pos = track_mode ? tr.nopatplaytrack.load(relaxed) : tr.nopat.load(relaxed);
    local_pos_ = left_pos;
    int first = 0;
    int last = std::min<int>(bank_.nbvoie.load(relaxed), kTracks) - 1;
    if (track_mode) first = last = std::clamp<int>(tr.notrkplaytrack.load(relaxed), 0, kTracks - 1);
    const bool one_note = tr.fplayonenote.load(relaxed);
    const bool audition = one_note && tr.afpending.load(std::memory_order_acquire);
    const int audition_track = std::clamp<int>(tr.aftrack.load(relaxed), 0, kTracks - 1);
    if (one_note && !tr.faccedit.load(relaxed) && !playing) first = last = audition_track;

    if (const Pattern* pattern = bank_.pattern(ilestou(left_pos)))
        for (int t = first; t <= last; ++t) read_track(t, left_pos, pattern, audition && t == audition_track);

    int notick;
    if (const int16_t delay = tr.patdelay.load(relaxed); delay > 0) {
        tr.patdelay.store(static_cast<int16_t>(delay - 1), relaxed);
        notick = 1;
    } else {
        notick = tr.notick.load(relaxed) + 1;
    }
    if (notick < 2 * m.speed) {
        tr.notick.store(static_cast<int16_t>(notick), relaxed);
        return;
    }

    // End of the row.
    tr.notick.store(0, relaxed);
    if (one_note) tr.fplayonenote.store(0, relaxed);
    if (!tr.playing.load(relaxed)) return;
    if (tr.fplayline.load(relaxed)) {
        tr.fplayline.store(0, relaxed);
        tr.playing.store(0, relaxed);
        return;
    }
    int pos = local_pos_;
    int row;
    if (tr.fbreak.load(relaxed)) {
        pos = tr.breakpat.load(relaxed);
        row = tr.breaklig.load(relaxed);
        tr.fbreak.store(0, relaxed);
        tr.patdelay.store(0, relaxed);
    } else {
        row = tr.nopos.load(relaxed) + 1;
    }
    // The row count is that of nopat's pattern: the position being left, even after a jump,
    // and in the one-track audition the song's position rather than the auditioned one.
    const int counted = track_mode ? tr.nopat.load(relaxed) : left_pos;
    const int rows = m.rows[m.sequence[std::clamp(counted, 0, kPositions - 1)]];
    const bool wrapped = row > rows - 1;
    tr.nopos.store(static_cast<int16_t>(wrapped ? 0 : row), relaxed);
    const bool floop = tr.floop.load(relaxed);
    // The end of the song is looked for only where the row wraps: a jump to or past the
    // last position plays the pattern there first.
    if (wrapped && !track_mode) {
        if (!tr.playp.load(relaxed)) {
            if (++pos >= tr.patend.load(relaxed)) {
                if (!floop) {
                    tr.playing.store(0, relaxed);
                    to_window.push({kMsgStop});
                }
                pos = tr.patstart.load(relaxed);
            }
        } else if (!floop) {
            tr.playing.store(0, relaxed);
            to_window.push({kMsgStop});
        }
    }
    tr.nopat.store(static_cast<int16_t>(std::clamp(pos, 0, kPositions - 1)), relaxed);
    if (watching_ && tr.playing.load(relaxed)) mark_visited();
}

void Player::watch_for_repeats(bool on) {
    // Only the rows of positions marked last time need clearing.
    for (size_t w = 0; w < visited_positions_.size(); ++w)
        for (uint64_t bits = visited_positions_[w]; bits; bits &= bits - 1) {
            const size_t p = w * 64 + static_cast<size_t>(__builtin_ctzll(bits));
            std::fill_n(visited_.begin() + p * kWordsPerPosition, kWordsPerPosition, 0);
        }
    visited_positions_ = {};
    watching_ = on;
    repeated = false;
    if (on) mark_visited();
}

void Player::mark_visited() {
    const size_t bit = static_cast<size_t>(std::clamp<int>(tr.nopat, 0, kPositions - 1)) * kMaxRows +
                       static_cast<size_t>(std::clamp<int>(tr.nopos, 0, kMaxRows - 1));
    visited_positions_[bit / kMaxRows / 64] |= uint64_t{1} << (bit / kMaxRows % 64);
    uint64_t& word = visited_[bit / 64];
    const uint64_t mask = uint64_t{1} << (bit % 64);
    if (word & mask) repeated.store(true, std::memory_order_relaxed);
    word |= mask;
}

void Player::read_track(int t, int position, const Pattern* pattern, bool audition_cell) {
    const TMOD& m = bank_.current();
    TNOTE cell{};
    if (audition_cell) {
        cell = tr.afnote;
    } else if (const TNOTE* c = pattern->cell(t, tr.nopos)) {
        if (tr.nopos < m.rows[m.sequence[position]]) cell = *c;
    }
    // Most cells of a sparse song are empty: at row start such a cell only ends the
    // track's portamento row, and on the other calls it does nothing.
    if (cell.empty() && !audition_cell) {
        if (tr.notick.load(std::memory_order_relaxed) == 0 &&
            tr.patdelay.load(std::memory_order_relaxed) == 0) {
            nlist[t].portaflag = 0;
            nlist[t].noteperiod = 0;
            curvoice_[t] = static_cast<int16_t>(t);
        }
        return;
    }
    const bool delayed =
        (cell.command == 14 && (cell.parameter >> 4) == 13) || (cell.command == 26 && cell.parameter != 0);
    // A disabled instrument silences its cells, commands included.
    if (cell.instrument && cell.instrument <= kSamplesPerSong && m.patflag[cell.instrument - 1] == 0) return;

    const bool row_start = (tr.notick == 0 && tr.patdelay == 0) || (audition_cell && tr.playing);
    if (row_start) {
        if (audition_cell) tr.afpending.store(0, std::memory_order_relaxed);
        if (!delayed) {
            nlist[t].portaflag = 0;
            nlist[t].noteperiod = 0;
        }
        const bool has_note = cell.note >= 1 && cell.note <= 127;
        curvoice_[t] = static_cast<int16_t>(cell.instrument || has_note ? track_to_poly(t) : t);
        Voice& v = nlist[curvoice_[t]];
        if (cell.instrument && !delayed && !(cell.note & 0x80)) take_instrument(t, v, cell);
        if (cell.volume) v.volume = cell.volume;
        if (cell.note & 0x80) v.keyoff = 1;
        if (has_note) {
            v.noteperiod = floatnote()[cell.note];
            tr.valvu[t].store(128.0f, std::memory_order_relaxed);
            falling_meters_ |= uint64_t{1} << t;
            if (cell.command == 3 || cell.command == 5) {
                v.portatarget = finetune_factor(v.finetune) * v.noteperiod;
                v.portaflag = 1;
            } else if (!delayed) {
                trigger(t, v, cell.note);
                v.vibpos = 0;
            }
        }
    }
    Voice& v = nlist[curvoice_[t]];
    const int tick = tr.notick / 2;
    if (row_start) EffectCommands::row_start(*this, t, v, cell, tick);
    if (tr.notick % 2 == 0 || cell.command == 26) EffectCommands::per_tick(*this, t, v, cell, tick);
}

void Player::send_program(int t, const Voice& v) {
    const TMOD& m = bank_.current();
    MidiOut* out = papi.load(std::memory_order_acquire);
    if (!m.trackword1[t] || !out) return;
    if (tr.instsended[t] == v.instrument) return;
    // The program sent is the one the voice held before this cell: the synthesiser
    // follows one change late, as songs written for it expect.
    out->ProgramChange(static_cast<uint8_t>(m.trackword1[t]), static_cast<uint8_t>(v.instrument),
                       system_time_us() / 1000);
    tr.instsended[t] = static_cast<int16_t>(v.instrument);
}

void Player::take_instrument(int t, Voice& v, const TNOTE& cell) {
    send_program(t, v);
    v.instrument = cell.instrument;
    v.keyoff = 0;
    set_start(v);
    if (const p_s* s = sample_of(cell.instrument)) {
        v.volume = s->volume;
        v.finetune = static_cast<uint16_t>(s->finetune);
    }
    v.count1 = v.count2 = 0;
    v.fraction = 0;
}

const p_s* Player::sample_of(int instrument) const {
    if (instrument < 1 || instrument > kSamplesPerSong) return nullptr;
    return bank_.sample(bank_.current().sndbase + instrument - 1);
}

void Player::set_start(Voice& v) const {
    v.position = 0;
    v.endpos = 0;
    if (v.block >= 1 && v.block <= kMarksPerPattern) {
        const PatMark& mark = bank_.current().patmark[std::clamp<int>(cursor.cursnd, 0, 127)][v.block - 1];
        v.position = static_cast<uint32_t>(mark.position);
        v.endpos = static_cast<uint32_t>(mark.value);
    }
    if (cursor.fplayblock && v.instrument == cursor.cursnd + 1) {
        v.position = cursor.blockstart;
        v.endpos = cursor.blockend;
    }
}

void Player::trigger(int t, Voice& v, int note) {
    const TMOD& m = bank_.current();
    note &= 127;
    v.note = static_cast<uint16_t>(note);
    MidiOut* out = papi.load(std::memory_order_acquire);
    if (m.trackword1[t] && out) {
        const uint8_t channel = static_cast<uint8_t>(m.trackword1[t]);
        const uint64_t now = system_time_us() / 1000;
        if (tr.notesended[t]) out->NoteOff(channel, static_cast<uint8_t>(tr.notesended[t] - 1), 100, now);
        const int volume = v.volume == 0 ? 128 : v.volume;
        out->NoteOn(channel, static_cast<uint8_t>(note),
                    static_cast<uint8_t>(std::min(volume * 127 / 128, 127)), now);
        tr.notesended[t] = static_cast<int16_t>(note + 1);
    } else {
        activate(static_cast<int>(&v - nlist.data()));
    }
    v.period = v.baseperiod = finetune_factor(v.finetune) * floatnote()[note];
    v.keyoff = 0;
    set_start(v);
    v.count1 = v.count2 = 0;
    v.fraction = 0;
}

int Player::route_to_slot(int t, int slot) {
    TMOD& m = bank_.current();
    // Every slot's send buffer exists from the start: a slot with a type is always taken.
    if (slot != 0 && (slot > 99 || slots_.efxtype[slot] == 0)) return -1;
    m.tracke[t] = static_cast<uint16_t>(slot);
    efxaffiche[t] = static_cast<int16_t>(slot);
    return slot;
}

void Player::start(bool pattern_mode) {
    std::lock_guard<StructureLock> guard(bank_.structure_lock());
    const TMOD& m = bank_.current();
    if (!tr.playing) {
        tr.nopos = cursor.poscurv.load();
        tr.notick = 0;
        tr.patdelay = 0;
        tr.fbreak = 0;
    }
    tr.playp = pattern_mode ? 1 : 0;
    std::copy(std::begin(m.efxa), std::end(m.efxa), autovar.begin());
    tr.fplaytrack = 0;
    dopatend();
    tr.patstart = m.repeat < m.nbpos ? m.repeat : 0;
    window_posts.push_back({kMsgActi});
    tr.playing = 1;
    status = pattern_mode ? kStatusPlayingPattern : kStatusPlayingAll;
}

void Player::silence_voices() {
    for (auto& v : nlist) {
        v.block = 0;
        v.active = 0;
    }
    polytour.fill(0);
}

void Player::stoppi(bool sound_only) {
    const bool was_playing = tr.playing || tr.fplaytrack;
    if (was_playing) {
        tr.playing = 0;
        tr.fplaytrack = 0;
        window_posts.push_back({kMsgActi});
    }
    if (audio_running.load()) {
        // The voices and the effect units are the audio thread's while it runs: ask it,
        // and wait until it has done so, at most a few buffers.
        stop_silences_.store(was_playing, std::memory_order_relaxed);
        const uint32_t ticket = stop_request_.fetch_add(1, std::memory_order_release) + 1;
        const auto deadline = std::chrono::steady_clock::now() + std::chrono::milliseconds(500);
        while (stop_done_.load(std::memory_order_acquire) < ticket && audio_running.load() &&
               std::chrono::steady_clock::now() < deadline)
            std::this_thread::sleep_for(std::chrono::milliseconds(1));
        if (!audio_running.load()) stop_audio_side(was_playing);
    } else {
        stop_audio_side(was_playing);
    }
    status = sound_only ? kStatusSoundStopped : kStatusStopped;
}

void Player::stop_audio_side(bool silence) {
    if (units) units->delefx();
    if (silence) silence_voices();
}

void Player::service_audio_requests() {
    const uint32_t asked = stop_request_.load(std::memory_order_acquire);
    if (asked == stop_done_.load(std::memory_order_relaxed)) return;
    stop_audio_side(stop_silences_.load(std::memory_order_relaxed));
    stop_done_.store(asked, std::memory_order_release);
}

void Player::audition_note(const TNOTE& cell, int track) {
    std::lock_guard<StructureLock> guard(bank_.structure_lock());
    tr.afnote = cell;
    tr.aftrack = static_cast<int16_t>(track);
    tr.afpending.store(1, std::memory_order_release);
    tr.fplayonenote = 1;
}

void Player::audition_track(int position, int track) {
    tr.nopatplaytrack = static_cast<int16_t>(position);
    tr.notrkplaytrack = static_cast<int16_t>(track);
    if (!tr.playing) tr.nopos = cursor.poscurv.load();
    tr.fplaytrack = 1;
    tr.playing = 1;
}

void Player::play_line() {
    if (tr.playing) return;
    tr.nopos = cursor.poscurv.load();
    tr.notick = 0;
    tr.fplayline = 1;
    tr.playing = 1;
}

int Player::fan(int column) const {
    int shown = 0;
    for (int t = 0; t < kTracks; ++t) {
        if (cursor.fshadow[t]) continue;
        if (shown++ == column) return t;
    }
    return -1;
}

int Player::fun(int track) const {
    if (track < 0 || track >= kTracks || cursor.fshadow[track]) return -1;
    int column = 0;
    for (int t = 0; t < track; ++t) column += !cursor.fshadow[t];
    return column;
}

int Player::prochain(const TNOTE* column, int row, int rows) {
    for (int r = std::max(row, 0); r < rows; ++r)
        if (!column[r].empty()) return r;
    return rows;
}

void Player::jump(int step, bool stay, bool control) {
    const TMOD& m = bank_.current();
    auto next_position = [&] {
        const int next = tr.nopat + 1;
        tr.nopat = static_cast<int16_t>(next >= m.nbpos ? 0 : next);
        window_posts.push_back({kMsgDoup});
    };
    if (control) {
        next_position();
        return;
    }
    const int rows = std::max<int>(m.rows[m.sequence[std::clamp<int>(tr.nopat, 0, kPositions - 1)]], 1);
    int row = cursor.poscurv + step;
    if (row > rows - 1) {
        row %= rows;
        if (!stay) next_position();
    }
    cursor.poscurv = static_cast<int16_t>(row);
}

}  // namespace ondrel
