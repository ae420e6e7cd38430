#include "record/sound_consumer.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <mutex>
#include <thread>
#include <vector>

#include "scripted_port.h"
#include "support/wait_until.h"

namespace ondrel::test {
namespace {

// What a pair of hooks saw. Each record function checks it gets its own pair's cookie.
struct HookLog {
    std::mutex mutex;
    std::vector<int32_t> codes;
    std::vector<int64_t> values;  // notify: the time-out, or the error of code 8
    std::vector<int64_t> times;   // record: the buffer's time
    std::vector<int16_t> firsts;  // record: the buffer's first sample
    std::atomic<int> wrong_cookie{0};
    std::atomic<int> buffers{0};

    template <int Pair>
    static void record(void* cookie, int64_t when, const void* data, size_t, const AudioFormat& f) {
        auto* self = static_cast<HookLog*>(cookie);
        if (self->pair != Pair || f.channel_count != 2 || f.format != kFormatShort) self->wrong_cookie++;
        std::lock_guard<std::mutex> guard(self->mutex);
        self->times.push_back(when);
        self->firsts.push_back(*static_cast<const int16_t*>(data));
        self->buffers++;
    }
    static void notify(void* cookie, int32_t code, const NotifyArgs& a) {
        auto* self = static_cast<HookLog*>(cookie);
        std::lock_guard<std::mutex> guard(self->mutex);
        self->codes.push_back(code);
        self->values.push_back(code == kNotifyServiceEnded ? a.error : a.count);
        if (code == kNotifyConnected) self->name = a.name;
    }
    int pair = 0;
    std::string name;
};

TEST(SoundConsumer, TimeOutsDoubleAndFourErrorsInARowEndTheService) {
    auto port = std::make_unique<ScriptedPort>("T T T M T E5 E5 E5 M E7 E7 E7 E7");
    ScriptedPort& script = *port;
    HookLog log;
    testing::internal::CaptureStderr();
    SoundConsumer node("SoundConsumer", HookLog::record<0>, HookLog::notify, &log, std::move(port));
    ASSERT_TRUE(wait_until([&] { return !node.serving(); }));
    const std::string errors = testing::internal::GetCapturedStderr();
    // Each read waits longer than the one before, until a message comes.
    const std::vector<int64_t> waits = {1, 2, 4, 8, 1, 2, 4, 8, 16, 1, 2, 4, 8};
    ASSERT_EQ(script.timeouts().size(), waits.size());
    for (size_t i = 0; i < waits.size(); ++i) EXPECT_EQ(script.timeouts()[i], waits[i] * 1000000) << i;
    EXPECT_EQ(log.codes, (std::vector<int32_t>{10, 10, 10, 10, 8}));
    EXPECT_EQ(log.values, (std::vector<int64_t>{1000000, 2000000, 4000000, 1000000, 7}));
    EXPECT_NE(errors.find("SoundConsumer: error 0x00000005\n"), std::string::npos) << errors;
    // Nobody serves the port any more: a command fails at once instead of waiting.
    EXPECT_EQ(node.SetHooks(nullptr, nullptr, nullptr), EBADF);
}

TEST(SoundConsumer, SetHooksGivesUpWhenNoReplyComesInTime) {
    SoundConsumer node("SoundConsumer", nullptr, nullptr, nullptr, std::make_unique<ScriptedPort>("", true),
                       50000);
    const auto before = std::chrono::steady_clock::now();
    EXPECT_EQ(node.SetHooks(nullptr, nullptr, nullptr), ETIMEDOUT);
    const auto waited = std::chrono::steady_clock::now() - before;
    EXPECT_GE(waited, std::chrono::milliseconds(50));
    EXPECT_LT(waited, std::chrono::seconds(2));
}

TEST(SoundConsumer, HooksChangeOnlyBetweenBuffers) {
    HookLog a, b;
    b.pair = 1;
    SoundConsumer node("SoundConsumer", HookLog::record<0>, HookLog::notify, &a);
    ASSERT_EQ(node.Connect(1, SoundConsumer::kDestination, SoundConsumer::preferred_format(), "Test input"),
              0);
    ASSERT_EQ(node.Start(0), 0);
    std::atomic<bool> quit{false};
    std::thread input([&] {
        std::vector<int16_t> buffer(2 * 256);
        for (int16_t n = 0; !quit.load(); ++n) {
            buffer[0] = n;
            node.deliver(buffer.data(), buffer.size() * 2, n);
            std::this_thread::sleep_for(std::chrono::microseconds(200));
        }
    });
    const int changes = 200;
    for (int i = 0; i < changes; ++i) {
        ASSERT_EQ(i % 2 ? node.SetHooks(HookLog::record<0>, HookLog::notify, &a)
                        : node.SetHooks(HookLog::record<1>, HookLog::notify, &b),
                  0);
        std::this_thread::sleep_for(std::chrono::microseconds(300));
    }
    quit = true;
    input.join();
    EXPECT_EQ(a.wrong_cookie + b.wrong_cookie, 0);
    EXPECT_GT(a.buffers + b.buffers, 100);
    // Each buffer went to exactly one pair, in the order sent.
    std::vector<int16_t> all(a.firsts);
    all.insert(all.end(), b.firsts.begin(), b.firsts.end());
    std::sort(all.begin(), all.end());
    EXPECT_EQ(std::adjacent_find(all.begin(), all.end()), all.end()) << "a buffer went to both";
    EXPECT_TRUE(std::is_sorted(a.firsts.begin(), a.firsts.end()) &&
                std::is_sorted(b.firsts.begin(), b.firsts.end()));
    // The old pair hears of each change.
    EXPECT_EQ(std::count(a.codes.begin(), a.codes.end(), 9) + std::count(b.codes.begin(), b.codes.end(), 9),
              changes);
    EXPECT_EQ(a.name, "Test input");
}

TEST(SoundConsumer, ConnectionsAndTheStartTime) {
    HookLog log;
    SoundConsumer node("SoundConsumer", HookLog::record<0>, HookLog::notify, &log);
    std::vector<int16_t> buffer(2 * 64, 0);
    node.deliver(buffer.data(), buffer.size() * 2, 0);  // not connected: not passed on
    ASSERT_EQ(node.Connect(1, SoundConsumer::kDestination, MediaFormat{}, "Mic"), 0);
    EXPECT_EQ(node.Connect(1, SoundConsumer::kDestination, MediaFormat{}, "Mic"), kErrorBadDestination);
    ASSERT_EQ(node.Start(50000), 0);
    for (int64_t t : {10000, 40000, 50000, 73000, 96000}) node.deliver(buffer.data(), buffer.size() * 2, t);
    ASSERT_TRUE(wait_until([&] { return log.buffers == 3; }));
    EXPECT_EQ(log.times, (std::vector<int64_t>{0, 23000, 46000})) << "from the first at or after the start";
    EXPECT_EQ(node.Disconnect(1, SoundConsumer::kDestination), 0);
    EXPECT_EQ(node.Disconnect(1, SoundConsumer::kDestination), kErrorBadDestination);
    node.deliver(buffer.data(), buffer.size() * 2, 120000);
    ASSERT_EQ(node.SetHooks(nullptr, nullptr, nullptr), 0);  // served after the buffer before it
    EXPECT_EQ(log.buffers, 3);
    EXPECT_EQ(log.codes, (std::vector<int32_t>{5, 6, 9}));
}

TEST(SoundConsumer, AcceptFormat) {
    const SoundConsumer node;
    const MediaFormat preferred = SoundConsumer::preferred_format();
    const struct {
        int32_t destination;
        MediaFormat in;
        int32_t result;
        MediaFormat out;  // what the format is changed to
    } cases[] = {
        {2, preferred, kErrorBadDestination, preferred},
        {1, MediaFormat{}, 0, MediaFormat{MediaType::RawAudio, 0, 0, 0}},
        {1, MediaFormat{MediaType::Other, 48000, 1, 0}, kErrorBadFormat,
         MediaFormat{MediaType::RawAudio, 0, 0, 0}},
        {1, MediaFormat{MediaType::RawAudio, 48000, 2, kFormatShort}, kErrorBadFormat, preferred},
    };
    for (const auto& c : cases) {
        MediaFormat f = c.in;
        EXPECT_EQ(node.AcceptFormat(c.destination, f), c.result);
        EXPECT_TRUE(f.type == c.out.type && f.frame_rate == c.out.frame_rate && f.format == c.out.format);
    }
}

}  // namespace
}  // namespace ondrel::test
