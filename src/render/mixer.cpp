#include "render/mixer.h"

#include <algorithm>
#include <cmath>
#include <cstring>

#include "playback/tables.h"
#include "render/output_clip.h"
#include "render/pan_table.h"
#include "render/voice_passes.h"
#include "render/voice_mix.h"

namespace ondrel {

namespace {
constexpr float kStep = 0.0078125f;       // 1/128
constexpr float kMasterStep = 0.015625f;  // 1/64
enum Envelope { kEnvVolume = 1, kEnvSend = 2, kEnvPan = 4, kEnvPitch = 8, kEnvFade = 16 };
}  // namespace

Mixer::Mixer(SongBank& bank, EffectSlots& slots, Player& player)
    : bank_(bank), slots_(slots), player_(player), tab_pan_(tab_pan()), floatnote_(floatnote()) {
    for (int bits16 = 0; bits16 < 2; ++bits16)
        for (int out = 0; out < 2; ++out) {
            const auto out_mode = static_cast<OutMode>(out);
            stereo_loops_[bits16][out] = stereo_mixer(bits16, out_mode);
            for (int interpolate = 0; interpolate < 2; ++interpolate)
                for (int send = 0; send < 3; ++send)
                    voice_loops_[bits16][interpolate][send][out] =
                        voice_mixer(bits16, interpolate, static_cast<SendMode>(send), out_mode);
        }
}

double Mixer::tick_frames() const {
    const int64_t t = bank_.current().tempo;
    const int p = std::clamp<int>(valpitch.load(std::memory_order_relaxed), 1, 255);
    int64_t scaled = t;
    if (p < 128) scaled = t * 128 / p;
    if (p > 128) scaled = (256 - p) * t / 128;
    return static_cast<double>(scaled * 441) / 480000.0;
}

void Mixer::BufferProc(void*, void* buffer, unsigned long size, const AudioFormat& format) {
    // Only interleaved stereo float is ours to render; anything else is left as given.
    if (format.format != kFormatFloat || format.channel_count != 2 || !buffer) return;
    float* out = static_cast<float*>(buffer);
    int frames = static_cast<int>((size / 4) / 2);
    // Send buffers and the recorder copy hold 4096 frames: longer buffers go in parts.
    while (frames > 0) {
        const int part = std::min(frames, kMaxFramesPerCall);
        render_call(out, part, format);
        out += 2 * part;
        frames -= part;
    }
}

void Mixer::render_call(float* out, int frames, const AudioFormat& format) {
    const bool measure = measure_load.load(std::memory_order_relaxed);
    const uint64_t entry = measure ? system_time_us() : 0;
    // Only this thread counts: no locked add.
    nbpass.store(nbpass.load(std::memory_order_relaxed) + 1, std::memory_order_relaxed);
    player_.service_audio_requests();
    if (bank_.loadin.load(std::memory_order_acquire)) {
        std::fill(out, out + 2 * frames, 0.0f);
        return;
    }

    TMOD& m = bank_.current();
    const double tick = tick_frames();
    const double frame_rate = format.frame_rate > 0 ? format.frame_rate : kOutputRate;
    int c = 0;
    bool silent = true;  // no voice has been heard in this call yet
    SynthSource* const synth = synth_.load(std::memory_order_acquire);
    while (c < frames) {
        player_.step_frame = frames_rendered_ + static_cast<uint64_t>(c);
        int n;
        if (ftemp.load(std::memory_order_relaxed)) {
            if (bpmreste < 1.0) {
                player_.gere_play();
                n = static_cast<int>(tick + bpmreste);
            } else {
                n = static_cast<int>(bpmreste);
            }
            bpmreste = 0;
            n = std::max(n, 1);  // a tick shorter than a frame still moves on
            const int rest = frames - c;
            if (n >= rest) {
                bpmreste = n - rest;
                n = rest;
            }
        } else {
            player_.gere_play();
            n = frames;
        }
        render_piece(out, c, n, m, frame_rate);
        silent = silent && !piece_has_setter_;
        // The synthesiser's notes were sent by the step above: they sound from here on.
        if (synth && synth->render_add(out + 2 * c, n)) silent = false;
        c += n;
    }
    frames_rendered_ += static_cast<uint64_t>(frames);
    // A buffer of zeros needs no clipping and has no peak: a stopped or silent stretch
    // of a song costs little more than clearing its buffer.
    silent = !effect_stage(out, frames, m) && silent;
    if (preview_ && preview_->mix(out, frames, frame_rate)) silent = false;
    output_stage(out, frames, format, silent);

    if (!measure) return;
    const double budget = std::trunc((frames * 8 * 0.125 / frame_rate) * 1000000.0);
    if (budget > 0)
        powermusic.store(static_cast<float>((system_time_us() - entry) / budget), std::memory_order_relaxed);
}

void Mixer::number_routed_slots(const TMOD& m) {
    // Clearing only what the last piece numbered keeps this cheap when nothing is routed.
    for (int i = 0; i < routed_count_; ++i) {
        const int s = routed_[i];
        control_[s] = 0;
        compact_[s] = 0;
        written_[i + 1] = 0;
    }
    routed_count_ = 0;
    routed_by_slot_count_ = 0;
    // Most songs route no track at all, and most tracks go to no slot: look at the whole
    // table at once, then at four tracks at a time.
    static_assert(kTracks % 4 == 0);
    uint64_t words[kTracks / 4];
    std::memcpy(words, m.tracke, sizeof words);
    uint64_t any = 0;
    for (const uint64_t w : words) any |= w;
    if (any == 0) return;
    for (int t0 = 0; t0 < kTracks; t0 += 4) {
        if (words[t0 / 4] == 0) continue;
        for (int t = t0; t < t0 + 4; ++t) {
            const int s = m.tracke[t];
            if (s > 0 && s < kEffectSlots && compact_[s] == 0) {
                routed_[routed_count_] = static_cast<int16_t>(s);
                compact_[s] = static_cast<int16_t>(++routed_count_);
            }
        }
    }
    if (routed_count_ == 0) return;
    // The effect stage runs the slots in their own order.
    std::copy_n(routed_.begin(), routed_count_, routed_by_slot_.begin());
    routed_by_slot_count_ = routed_count_;
    std::sort(routed_by_slot_.begin(), routed_by_slot_.begin() + routed_by_slot_count_);
}

void Mixer::render_piece(float* out, int c0, int n, const TMOD& m, double frame_rate) {
    number_routed_slots(m);
    // The first voice heard sets the piece's frames rather than adding to them (and clears
    // what it leaves), which saves clearing the buffer first.
    piece_has_setter_ = false;
    const int pitch = std::clamp<int>(valpitch.load(std::memory_order_relaxed), 1, 255);
    const PieceSettings piece{frame_rate,
                              pitch > 128   ? 1 + (pitch - 128) * 0.0078125
                              : pitch < 128 ? 2.0 - 128.0 / pitch
                                            : 1.0,
                              qual.load(std::memory_order_relaxed) == 1,
                              m.globalvol * kMasterStep,
                              m.mode};
    // In index order: the order decides which voice sets a slot's control value.
    for (int w = 0; w < kVoices / 64; ++w) {
        uint64_t& hint = player_.active_hint[w];
        for (uint64_t bits = hint; bits; bits &= bits - 1) {
            const int b = __builtin_ctzll(bits);
            const int vi = w * 64 + b;
            if (player_.nlist[vi].active)
                render_voice(vi, out, c0, n, m, piece);
            else
                hint &= ~(uint64_t{1} << b);
        }
    }
    if (!piece_has_setter_) std::fill(out + 2 * c0, out + 2 * (c0 + n), 0.0f);
}

void Mixer::render_voice(int vi, float* out, int c0, int n, const TMOD& m, const PieceSettings& piece) {
    Voice& v = player_.nlist[vi];
    const int inst = v.instrument > 0 ? v.instrument - 1 : 0;
    if (inst >= kSamplesPerSong || inst == bank_.loadininst.load(std::memory_order_relaxed)) return;
    if (v.period < 2.0f) return;
    const p_s* s = bank_.sample(m.sndbase + inst);
    if (!s || !s->data) {
        v.active = 0;
        return;
    }
    const int track = std::clamp<int>(player_.polytotrack[vi], 0, kTracks - 1);
    const int shift = std::clamp<int>(s->framecode, 0, 2);
    const int64_t frames = s->length >> shift;
    const bool loop = s->loopon != 0;
    const int64_t loop_start = s->loopstart >> shift;
    int64_t end = v.endpos ? v.endpos : frames;
    if (loop) end = s->loopend >> shift;
    end = std::min(end, frames);
    const uint16_t env = s->flagword;
    const bool released = v.keyoff != 0;

    // Step.
    double step = (floatnote_[std::clamp<int>(s->refnote, 0, 127)] / v.period) * (s->rate / piece.frame_rate);
    step *= piece.pitch_factor;
    if (env & kEnvPitch) {
        const float e = player_.compute_adsr(3, vi, static_cast<unsigned long>(frames), s);
        if (e != 64.0f) step *= std::pow(1.059463094, (e - 64) * 0.015625);
    }
    step = std::max(step, 0.0);  // below pitch 64 voices stand still rather than run back

    // Gains.
    float g = 1.0f;
    if (released && (env & kEnvFade)) {
        const float fade = player_.compute_adsr(4, vi, s->setting, s);
        if (fade == -1.0f) {
            v.active = 0;
            return;
        }
        g = fade;
    }
    if (env & kEnvVolume) g *= player_.compute_adsr(0, vi, static_cast<unsigned long>(frames), s);
    g *= v.volume * kStep;
    int pan = m.trackvol[track];
    if (env & kEnvPan)
        pan = static_cast<int>(player_.compute_adsr(2, vi, static_cast<unsigned long>(frames), s));
    pan = std::clamp(pan, 0, 127);
    float gl = g * tab_pan_[pan];
    float gr = g * tab_pan_[127 - pan];
    switch (piece.mode) {
        case 1:  // Amiga: voices 0 and 3 right, 1 and 2 left
            if (vi % 4 == 0 || vi % 4 == 3)
                gl = 0;
            else
                gr = 0;
            break;
        case 3:  // L&R: even voices right, odd voices left
            if (vi % 2 == 0)
                gl = 0;
            else
                gr = 0;
            break;
        default: break;
    }
    const float master = piece.master;
    gl *= m.trackpan[track] * kStep * master;
    gr *= m.trackpan2[track] * kStep * master;

    float* send = nullptr;
    float send_level = 0;
    const int slot = m.tracke[track];
    const int k = slot > 0 && slot < kEffectSlots ? compact_[slot] : 0;
    if (k > 0) {
        const float e1 = (env & kEnvSend) ? player_.compute_adsr(1, vi, static_cast<unsigned long>(frames), s)
                                          : static_cast<float>(m.trackc[track]);
        control_[slot] = static_cast<int16_t>(e1);
        send = slots_.pbufferefx[k - 1].get() + c0;
        send_level = e1 * kStep;
        switch (slots_.efxtype[slot]) {
            case 1:
            case 2:
            case 3:
            case 16:
            case 17:  // heard only through the filter
                send_level = m.trackpan[track] * kStep;
                gl = gr = 0;
                break;
            case 5: send_level = m.trackpan[track] * kStep; break;
            case 12:
                send_level = m.trackpan[track] * kStep * 0.4f;
                gl *= 0.4f;
                gr *= 0.4f;
                break;
            default: break;
        }
    }
    const float q = s->bits == 8 ? 0.0078125f : 3.0517578e-05f;
    const MixGains gains{q * gl, q * gr, q * (send_level * master * g)};
    const bool interpolate = piece.interpolate || (s->flag2 & 1);
    // A voice at volume 0 (a note faded or cut, still playing on) adds nothing: like a muted
    // one it only moves on, and leaves the piece's frames and the send buffer to the others.
    const bool silent = gains.left == 0 && gains.right == 0 && (!send || gains.send == 0);
    const bool heard = !silent && mute[track].load(std::memory_order_relaxed) == 0;
    const bool stereo = s->stereo != 0;
    const bool bits16 = s->bits == 16;

    const bool sets = !piece_has_setter_ && heard;
    const OutMode out_mode = sets ? OutMode::Set : OutMode::Add;
    const int out_index = static_cast<int>(out_mode);
    VoicePasses passes{s->data,
                       loop_start,
                       end,
                       step,
                       loop,
                       loop && s->loopend > s->loopstart,
                       v.position,
                       v.fraction,
                       out + 2 * c0,
                       send,
                       n,
                       v.position};
    if (!heard) {
        run_voice_passes(passes, [](int64_t, double, int, float*, float*) {});
    } else if (stereo) {
        const StereoMixFn mix_stereo = stereo_loops_[bits16][out_index];
        run_voice_passes(passes, [&](int64_t pos, double f, int count, float* o, float*) {
            mix_stereo(s->data, pos, f, step, count, o, gains);
        });
    } else {
        // The first voice into a slot's send buffer sets it, the others add to it.
        const SendMode send_mode = !send ? SendMode::None : written_[k] ? SendMode::Add : SendMode::First;
        voice_loops_[bits16][interpolate][static_cast<int>(send_mode)][out_index](passes, gains);
        if (send && passes.out > out + 2 * c0) written_[k] = 1;
    }
    if (released && (env & kEnvFade)) v.count1 += passes.advanced;
    if (passes.ended) v.active = 0;
    if (sets && passes.out > out + 2 * c0) {
        piece_has_setter_ = true;
        std::fill(passes.out, out + 2 * (c0 + n), 0.0f);  // before any other voice adds there
    }
    v.position = static_cast<uint32_t>(passes.position);
    if (passes.keeps) v.fraction = static_cast<float>(passes.f);
}

bool Mixer::effect_stage(float* out, int frames, TMOD& m) {
    pass.store(pass.load(std::memory_order_relaxed) + 1, std::memory_order_relaxed);
    if (units_) units_->begin_buffer();
    const auto& pan = tab_pan_;
    bool ran = false;
    for (int r = 0; r < routed_by_slot_count_; ++r) {
        const int s = routed_by_slot_[r];
        const int k = compact_[s];
        float* send = slots_.pbufferefx[k - 1].get();
        if (!written_[k]) std::fill(send, send + std::min(2 * frames, kSendBufferFloats), 0.0f);
        float el = 1.0f, er = 1.0f;
        if (m.efxflag[s]) {
            int16_t& a = player_.autovar[s];
            const int p = std::clamp(a >> 1, 0, 127);
            el = pan[p];
            er = pan[127 - p];
            a = static_cast<int16_t>(a + m.efxc[s]);
            if (a > m.efxb[s]) {
                a = m.efxb[s];
                m.efxc[s] = static_cast<int16_t>(-m.efxc[s]);
            }
            if (a < m.efxa[s]) {
                a = m.efxa[s];
                m.efxc[s] = static_cast<int16_t>(-m.efxc[s]);
            }
        }
        if (units_) {
            units_->run(s, slots_.efxtype[s], send, out, frames, control_[s], el, er);
            ran = true;
        }
    }
    return ran;
}

void Mixer::output_stage(float* out, int frames, const AudioFormat& format, bool silent) {
    const Peaks peaks = silent ? Peaks{0, 0} : headroom_and_clip(out, frames);
    lmax.store(peaks.left, std::memory_order_relaxed);
    rmax.store(peaks.right, std::memory_order_relaxed);
    if (f_fftmode.load(std::memory_order_relaxed) == 1)
        for (int i = 0; i < std::min(frames, 512); ++i)
            Bufferfft1[i].store(static_cast<double>(out[2 * i + 1] * 0.5f + out[2 * i] * 0.5f),
                                std::memory_order_relaxed);
    if (record_to_file.load(std::memory_order_relaxed) && frecmusic.load(std::memory_order_relaxed) &&
        recorder_) {
        for (int i = 0; i < 2 * frames; ++i) bufferrecmusic_[i] = static_cast<int16_t>(out[i] * 32767);
        recorder_->RecordFile(bufferrecmusic_.data(), static_cast<size_t>(4 * frames), format);
    }
    if (monitor.load(std::memory_order_relaxed) && !frecmusic.load(std::memory_order_relaxed) &&
        monitor_ring_) {
        // Added after the clip and the meters: the monitored input is neither.
        MonitorRing& ring = *monitor_ring_;
        constexpr size_t kValues = MonitorRing::kBytes / 2;
        size_t read = ring.read.load(std::memory_order_relaxed);
        for (int i = 0; i < frames; ++i) {
            out[2 * i] += ring.ring[read % kValues].load(std::memory_order_relaxed) / 32768.0f;
            out[2 * i + 1] += ring.ring[(read + 1) % kValues].load(std::memory_order_relaxed) / 32768.0f;
            read = (read + 2) % kValues;
        }
        ring.read.store(read, std::memory_order_relaxed);
    }
}

}  // namespace ondrel
