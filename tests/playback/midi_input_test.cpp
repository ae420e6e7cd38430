// What a MIDI input delivers, made into whole messages; the router that hands the
// sequencer's messages to every open output; the queue many threads send through.
#include <gtest/gtest.h>

#include <thread>
#include <vector>

#include "playback/midi_input_parser.h"
#include "playback/midi_router.h"

namespace ondrel {
namespace {

std::vector<std::vector<int>> parse(const std::vector<uint8_t>& bytes, MidiInputParser& parser) {
    std::vector<std::vector<int>> out;
    parser.feed(bytes.data(), bytes.size(), [&](const MidiEvent& m) {
        out.push_back(std::vector<int>(m.bytes.begin(), m.bytes.begin() + m.size));
    });
    return out;
}

TEST(MidiInput, BytesBecomeWholeChannelMessages) {
    using Messages = std::vector<std::vector<int>>;
    struct Case {
        const char* what;
        std::vector<uint8_t> bytes;
        Messages messages;
    };
    const Case cases[] = {
        {"a note on and its note off", {0x90, 60, 100, 0x80, 60, 64}, {{0x90, 60, 100}, {0x80, 60, 64}}},
        {"running status", {0x91, 60, 100, 62, 90, 64, 0}, {{0x91, 60, 100}, {0x91, 62, 90}, {0x91, 64, 0}}},
        {"one data byte for a program change", {0xC2, 5, 7}, {{0xC2, 5}, {0xC2, 7}}},
        {"a clock inside a message changes nothing", {0x90, 60, 0xF8, 100}, {{0x90, 60, 100}}},
        {"a system exclusive ends the running status", {0x90, 60, 100, 0xF0, 1, 2, 0xF7, 62, 90}, {{0x90, 60, 100}}},
        {"data with no status before it", {60, 100, 0xB0, 7, 127}, {{0xB0, 7, 127}}},
        {"a new status drops a half message", {0x90, 60, 0x80, 61, 0}, {{0x80, 61, 0}}},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        MidiInputParser parser;
        EXPECT_EQ(parse(c.bytes, parser), c.messages);
    }
    // Only a note-on with a velocity is a note played.
    MidiEvent on{{0x93, 60, 1}, 3, 0}, silent{{0x93, 60, 0}, 3, 0}, off{{0x83, 60, 90}, 3, 0};
    EXPECT_TRUE(MidiInputParser::is_note_played(on));
    EXPECT_FALSE(MidiInputParser::is_note_played(silent));
    EXPECT_FALSE(MidiInputParser::is_note_played(off));
}

TEST(MidiRouter, EveryOpenOutputGetsTheMessagesOnTheTracksChannels) {
    MidiRouter router;
    MidiEventQueue synth, port;
    EXPECT_FALSE(router.any_attached());
    router.NoteOn(1, 60, 100, 0);  // nobody listens: dropped quietly
    router.attach(MidiRouter::Synth, &synth);
    router.ProgramChange(16, 200, 0);  // data bytes keep seven bits
    router.attach(MidiRouter::Port, &port);
    router.NoteOff(10, 61, 100, 0);
    router.attach(MidiRouter::Synth, nullptr);
    router.NoteOn(3, 62, 127, 0);
    EXPECT_TRUE(router.any_attached());

    const auto drain = [](MidiEventQueue& q) {
        std::vector<std::vector<int>> got;
        MidiEvent e;
        while (q.pop(e)) got.push_back(std::vector<int>(e.bytes.begin(), e.bytes.begin() + e.size));
        return got;
    };
    EXPECT_EQ(drain(synth), (std::vector<std::vector<int>>{{0xCF, 72}, {0x89, 61, 100}}));
    EXPECT_EQ(drain(port), (std::vector<std::vector<int>>{{0x89, 61, 100}, {0x92, 62, 127}}));
    EXPECT_EQ(router.dropped(), 0u);
}

TEST(MidiEventQueue, ManySendersOneTakerNothingLostOrReordered) {
    MidiEventQueue queue;
    constexpr int kSenders = 3, kEach = 5000;
    std::vector<std::thread> senders;
    for (int s = 0; s < kSenders; ++s)
        senders.emplace_back([&queue, s] {
            for (int i = 0; i < kEach; ++i) {
                MidiEvent e{{static_cast<uint8_t>(s), static_cast<uint8_t>(i & 0x7F), static_cast<uint8_t>(i >> 7)},
                            3, static_cast<uint32_t>(i)};
                while (!queue.push(e)) std::this_thread::yield();
            }
        });
    std::vector<int> next(kSenders, 0);
    int taken = 0;
    while (taken < kSenders * kEach) {
        MidiEvent e;
        if (!queue.pop(e)) {
            std::this_thread::yield();
            continue;
        }
        ASSERT_LT(e.bytes[0], kSenders);
        // Each sender's messages come out in the order it sent them.
        ASSERT_EQ(static_cast<int>(e.delay_frames), next[e.bytes[0]]++);
        ++taken;
    }
    for (auto& t : senders) t.join();
    MidiEvent extra;
    EXPECT_FALSE(queue.pop(extra));
    // A full queue refuses rather than waits.
    for (size_t i = 0; i < MidiEventQueue::kCapacity; ++i) ASSERT_TRUE(queue.push(MidiEvent{}));
    EXPECT_FALSE(queue.push(MidiEvent{}));
}

}  // namespace
}  // namespace ondrel
