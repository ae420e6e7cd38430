#include "song/song_bank.h"

#include <algorithm>
#include <cstring>
#include <mutex>
#include <utility>

namespace ondrel {

namespace {
// RAII over the StructureLock interface, with the loadin flag raised for the swap.
class SwapGuard {
public:
    SwapGuard(StructureLock& lock, std::atomic<uint8_t>& loadin) : lock_(lock), loadin_(loadin) {
        lock_.lock();
        loadin_.store(1, std::memory_order_relaxed);
    }
    ~SwapGuard() {
        loadin_.store(0, std::memory_order_relaxed);
        lock_.unlock();
    }
    SwapGuard(const SwapGuard&) = delete;
    SwapGuard& operator=(const SwapGuard&) = delete;

private:
    StructureLock& lock_;
    std::atomic<uint8_t>& loadin_;
};
}  // namespace

SongData::SongData() : mod(std::make_unique<TMOD>()) {
    set_new_song_defaults(*mod, 0);
}

SongBank::SongBank(AlertSink* alerts) : alerts_(alerts) {
    newmusic();
    patcreate(current().patbase, current().nbtrack);
    nbvoie = current().nbtrack;
}

SongBank::~SongBank() = default;

Pattern* SongBank::pattern(int global) const {
    if (global < 0 || static_cast<size_t>(global) >= p_pat.size()) return nullptr;
    return p_pat[global].get();
}

p_s* SongBank::sample(int global) const {
    if (global < 0 || static_cast<size_t>(global) >= t_sound.size()) return nullptr;
    return t_sound[global].get();
}

int SongBank::addmusic() {
    if (nbimod >= kSongsUsable) return 0;
    // Grow the tables outside the swap, then move them in: the audio thread may be
    // reading the old ones.
    std::vector<PatternRef> pats(static_cast<size_t>(nbimod + 1) * kPatternsPerSong);
    std::vector<SampleRef> snds(static_cast<size_t>(nbimod + 1) * kSamplesPerSong);
    std::lock_guard<StructureLock> guard(*lock_);
    std::move(p_pat.begin(), p_pat.end(), pats.begin());
    std::move(t_sound.begin(), t_sound.end(), snds.begin());
    p_pat.swap(pats);
    t_sound.swap(snds);
    ++nbimod;
    return 1;
}

std::unique_ptr<TMOD> SongBank::default_record(int song) const {
    auto m = std::make_unique<TMOD>();
    set_new_song_defaults(*m, song);
    return m;
}

bool SongBank::newmusic() {
    auto record = default_record(nbimod);
    if (!addmusic()) {
        if (alerts_) alerts_->show({"title", "Can't create new music", {"My god..."}});
        return false;
    }
    std::lock_guard<StructureLock> guard(*lock_);
    timod[nbimod - 1] = std::move(record);
    noimod = static_cast<int16_t>(nbimod - 1);
    nbvoie = 0;
    return true;
}

void SongBank::patcreate(int pattern, short tracks) {
    if (pattern < 0 || static_cast<size_t>(pattern) >= p_pat.size() || p_pat[pattern]) return;
    const int song = pattern / kPatternsPerSong;
    const int rows = timod[song] ? timod[song]->rows[pattern % kPatternsPerSong] : 64;
    auto made = make_pattern(tracks, rows);
    std::lock_guard<StructureLock> guard(*lock_);
    p_pat[pattern] = std::move(made);
}

void SongBank::Gofree(int pattern) {
    if (pattern < 0 || static_cast<size_t>(pattern) >= p_pat.size()) return;
    PatternRef old;
    {
        std::lock_guard<StructureLock> guard(*lock_);
        old = std::move(p_pat[pattern]);
    }
}

void SongBank::Raz_data(int sample) {
    std::lock_guard<StructureLock> guard(*lock_);
    if (p_s* s = this->sample(sample)) ondrel::Raz_data(*s);
}

void SongBank::replace_sound(int slot, SampleRef& sample) {
    if (slot < 0 || slot >= kSamplesPerSong) return;
    const size_t global = static_cast<size_t>(current().sndbase + slot);
    if (global >= t_sound.size()) return;
    loadininst.store(static_cast<uint16_t>(slot), std::memory_order_relaxed);
    {
        std::lock_guard<StructureLock> guard(*lock_);
        t_sound[global].swap(sample);
    }
    loadininst.store(65535, std::memory_order_relaxed);
}

void SongBank::updatenbvoice(short tracks) {
    if (tracks <= nbvoie) return;
    tracks = std::min<short>(tracks, kTracks);
    const TMOD& m = current();
    for (int p = 0; p < kPatternsPerSong; ++p) {
        Pattern* pat = pattern(m.patbase + p);
        if (!pat) continue;
        std::array<std::unique_ptr<TNOTE[]>, kTracks> fresh;
        for (int t = 0; t < tracks; ++t)
            if (!pat->col[t]) fresh[t] = std::make_unique<TNOTE[]>(static_cast<size_t>(pat->nrows));
        std::lock_guard<StructureLock> guard(*lock_);
        for (int t = 0; t < tracks; ++t)
            if (fresh[t]) pat->col[t] = std::move(fresh[t]);
    }
    nbvoie = tracks;
}

void SongBank::select(int song) {
    if (song < 0 || song >= nbimod) return;
    std::lock_guard<StructureLock> guard(*lock_);
    noimod = static_cast<int16_t>(song);
    nbvoie = current().nbtrack;
}

void SongBank::install(int song, SongData&& data) {
    if (song < 0 || song >= nbimod) return;
    data.mod->patbase = static_cast<int16_t>(song * kPatternsPerSong);
    data.mod->sndbase = static_cast<int16_t>(song * kSamplesPerSong);
    {
        SwapGuard guard(*lock_, loadin);
        timod[song].swap(data.mod);
        for (int i = 0; i < kPatternsPerSong; ++i) p_pat[song * kPatternsPerSong + i].swap(data.patterns[i]);
        for (int i = 0; i < kSamplesPerSong; ++i) t_sound[song * kSamplesPerSong + i].swap(data.samples[i]);
    }
    if (song == noimod) nbvoie = current().nbtrack;
    // data now holds the old song and frees it here, outside the swap.
}

void SongBank::killmusic() {
    if (nbimod <= 1) {
        SongData fresh;
        fresh.patterns[0] = make_pattern(fresh.mod->nbtrack, fresh.mod->rows[0]);
        install(0, std::move(fresh));
        return;
    }
    const int song = noimod;
    std::vector<PatternRef> old_pats;
    std::vector<SampleRef> old_snds;
    std::unique_ptr<TMOD> old_mod;
    old_pats.reserve(kPatternsPerSong);
    old_snds.reserve(kSamplesPerSong);
    {
        SwapGuard guard(*lock_, loadin);
        const auto pat_at = p_pat.begin() + song * kPatternsPerSong;
        const auto snd_at = t_sound.begin() + song * kSamplesPerSong;
        old_pats.assign(std::make_move_iterator(pat_at), std::make_move_iterator(pat_at + kPatternsPerSong));
        old_snds.assign(std::make_move_iterator(snd_at), std::make_move_iterator(snd_at + kSamplesPerSong));
        p_pat.erase(pat_at, pat_at + kPatternsPerSong);
        t_sound.erase(snd_at, snd_at + kSamplesPerSong);
        old_mod = std::move(timod[song]);
        for (int s = song; s + 1 < nbimod; ++s) {
            timod[s] = std::move(timod[s + 1]);
            timod[s]->patbase = static_cast<int16_t>(s * kPatternsPerSong);
            timod[s]->sndbase = static_cast<int16_t>(s * kSamplesPerSong);
        }
        --nbimod;
        noimod = static_cast<int16_t>(std::min<int>(song, nbimod - 1));
    }
    nbvoie = current().nbtrack;
}

SongData copy_song(SongBank& bank, int song) {
    SongData copy;
    {
        std::lock_guard<StructureLock> guard(bank.structure_lock());
        std::memcpy(static_cast<void*>(copy.mod.get()), bank.timod[song].get(), sizeof(TMOD));
    }
    for (int i = 0; i < kPatternsPerSong; ++i)
        if (const Pattern* p = bank.pattern(song * kPatternsPerSong + i)) copy.patterns[i] = copy_pattern(*p);
    for (int i = 0; i < kSamplesPerSong; ++i)
        if (const p_s* s = bank.sample(song * kSamplesPerSong + i)) copy.samples[i] = copy_sample(*s);
    return copy;
}

}  // namespace ondrel
