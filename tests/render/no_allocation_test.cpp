// The render callback must not allocate: every allocation in this program is counted
// while a flag is up (C allocations too outside sanitizer builds, whose own allocator
// must stay in place), so libraries called from the callback are held to it as well.
#include <atomic>
#include <cstdlib>
#include <new>

#include "mixer_fixture.h"
#include "platform/fluid_synthesiser.h"
#include "playback/midi_router.h"

// Replacing the global operators on purpose; GCC cannot see that both sides use malloc.
#pragma GCC diagnostic ignored "-Wmismatched-new-delete"

namespace {
std::atomic<bool> counting{false};
std::atomic<int> allocations{0};
}  // namespace

void* operator new(std::size_t n) {
    if (counting.load(std::memory_order_relaxed)) allocations.fetch_add(1, std::memory_order_relaxed);
    if (void* p = std::malloc(n ? n : 1)) return p;
    throw std::bad_alloc();
}
void* operator new[](std::size_t n) {
    return operator new(n);
}
void* operator new(std::size_t n, const std::nothrow_t&) noexcept {
    if (counting.load(std::memory_order_relaxed)) allocations.fetch_add(1, std::memory_order_relaxed);
    return std::malloc(n ? n : 1);
}
void* operator new[](std::size_t n, const std::nothrow_t& tag) noexcept {
    return operator new(n, tag);
}
void operator delete(void* p) noexcept {
    std::free(p);
}
void operator delete[](void* p) noexcept {
    std::free(p);
}
void operator delete(void* p, std::size_t) noexcept {
    std::free(p);
}
void operator delete[](void* p, std::size_t) noexcept {
    std::free(p);
}

#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
extern "C" {
void* __libc_malloc(size_t);
void* __libc_calloc(size_t, size_t);
void* __libc_realloc(void*, size_t);
void* malloc(size_t n) {
    if (counting.load(std::memory_order_relaxed)) allocations.fetch_add(1, std::memory_order_relaxed);
    return __libc_malloc(n);
}
void* calloc(size_t count, size_t size) {
    if (counting.load(std::memory_order_relaxed)) allocations.fetch_add(1, std::memory_order_relaxed);
    return __libc_calloc(count, size);
}
void* realloc(void* p, size_t n) {
    if (counting.load(std::memory_order_relaxed)) allocations.fetch_add(1, std::memory_order_relaxed);
    return __libc_realloc(p, n);
}
}
#endif

namespace ondrel {
namespace {

using NoAllocation = test::MixerFixture;

TEST_F(NoAllocation, TheSynthesiserPlaysMidiTracksWithoutAllocating) {
    MidiEventQueue events;
    std::string why;
    auto synth = FluidSynthesiser::open("", kOutputRate, events, why);
    if (!synth) GTEST_SKIP() << why;
    MidiRouter router;
    router.attach(MidiRouter::Synth, &events);
    mixer.set_synth(synth.get());
    player.papi = &router;
    // Four tracks on four channels, a note and a new instrument every other row.
    TMOD& m = song();
    m.nbtrack = 4;
    engine.bank.updatenbvoice(4);
    Pattern* p = engine.bank.song_pattern(0);
    for (int t = 0; t < 4; ++t) {
        m.trackword1[t] = static_cast<uint16_t>(t + 1);
        for (int r = 0; r < 64; r += 2)
            p->col[t][r] = {static_cast<uint8_t>(36 + (r + 7 * t) % 48), 0, 0, static_cast<uint8_t>(1 + (r / 2) % 20),
                            0, 0};
    }
    player.start(false);
    std::vector<float> out(2 * 512);
    counting = true;
    float peak = 0;
    for (int i = 0; i < 400; ++i) {
        mixer.BufferProc(nullptr, out.data(), out.size() * 4, AudioFormat{});
        for (float v : out) peak = std::max(peak, std::abs(v));
    }
    counting = false;
    mixer.set_synth(nullptr);
    EXPECT_EQ(allocations.load(), 0);
    EXPECT_GT(peak, 0.01f);  // the notes were heard
}

TEST_F(NoAllocation, BufferProcAllocatesNothingWhilePlaying) {
    // A song that uses every path: a track through each effect unit, loops, stereo and
    // 16-bit data, envelopes, interpolation, commands and auto pan.
    constexpr int kUnits[] = {1, 2, 3, 5, 9, 10, 11, 12, 16, 17};
    constexpr int kTracksUsed = 12;
    TMOD& m = song();
    m.nbtrack = kTracksUsed;
    engine.bank.updatenbvoice(kTracksUsed);
    for (int t = 0; t < 10; ++t) m.tracke[t] = static_cast<uint16_t>(kUnits[t]);
    m.efxflag[11] = 1;
    p_s& a = sample8(1, std::vector<int8_t>(5000, 40));
    a.loopon = 1;
    a.loopstart = 1000;
    a.loopend = 5000;
    a.flagword = 31;
    a.flag2 = 1;
    sample<int16_t>(2, std::vector<int16_t>(3000, 1000), true);
    sample<int16_t>(3, std::vector<int16_t>(3000, -700));
    Pattern* p = engine.bank.song_pattern(0);
    for (int r = 0; r < 64; r += 2)
        for (int t = 0; t < kTracksUsed; ++t)
            p->col[t][r] = {static_cast<uint8_t>(40 + t),
                            0,
                            0,
                            static_cast<uint8_t>(1 + t % 3),
                            static_cast<uint8_t>(t == 11 ? 33 : (t % 2 ? 4 : 10)),
                            static_cast<uint8_t>(t == 11 ? 12 : 0x21)};
    p->col[11][1] = {0x80, 0, 0, 0, 10, 0x02};
    player.start(false);
    std::vector<float> out(2 * 1024);
    mixer.BufferProc(nullptr, out.data(), out.size() * 4, AudioFormat{});  // warm up
    counting = true;
    for (int i = 0; i < 300; ++i) mixer.BufferProc(nullptr, out.data(), out.size() * 4, AudioFormat{});
    counting = false;
    EXPECT_EQ(allocations.load(), 0);
    EXPECT_GT(mixer.nbpass.load(), 300u);
    EXPECT_GT(mixer.lmax.load(), 0.0f);  // it did play
    EXPECT_GT(mixer.pass.load(), 300u);  // and ran the effect stage
}

}  // namespace
}  // namespace ondrel
