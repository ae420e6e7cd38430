// The sample editor's tools and frame edits: exact values on small sounds of each format,
// loop points and blocks kept inside the sound, undo giving the sound back.
#include "edit/sound_edits.h"

#include "edit/song_fixture.h"
#include "edit/sound_blocks.h"
#include "edit/sound_frames.h"

namespace ondrel {
namespace {

using test::make_sound;
using test::song_bytes;
using test::values_of;
constexpr test::SoundFormat k8Mono{8, false}, k8Stereo{8, true}, k16Mono{16, false}, k16Stereo{16, true};
constexpr int kSlot = 2;

std::string test_name(std::string n) {
    for (char& c : n)
        if (!isalnum(static_cast<unsigned char>(c))) c = '_';
    return n;
}

struct ToolCase {
    const char* name;
    test::SoundFormat format;
    std::vector<int> before;  // sample values, channels interleaved
    SoundTool tool;
    FrameRange range;
    std::vector<int> after;  // equal to before: the tool changes nothing
};
// clang-format off
const ToolCase kToolCases[] = {
    {"fade in 8 mono", k8Mono, {10, 20, 30, 40, 50}, SoundTool::FadeIn, {}, {0, 5, 15, 30, 50}},
    {"fade out 16 stereo middle", k16Stereo, {1, -1, 1000, -1000, 2000, -2001, 5, 5}, SoundTool::FadeOut, {1, 3},
                                             {1, -1, 1000, -1000, 0, 0, 5, 5}},
    {"fade in 8 stereo from the start", k8Stereo, {10, -10, 20, -20, 30, -30}, SoundTool::FadeIn, {0, 2},
                                                  {0, 0, 20, -20, 30, -30}},
    {"fade out 16 mono to the end", k16Mono, {-9, 900, 900, 900}, SoundTool::FadeOut, {1, 4}, {-9, 900, 450, 0}},
    {"normalize 8 mono", k8Mono, {-64, 32, 0, 16}, SoundTool::Normalize, {}, {-127, 64, 0, 32}},
    {"normalize 16 stereo most negative", k16Stereo, {-32768, 16384}, SoundTool::Normalize, {}, {-32767, 16384}},
    {"normalize the range", k16Mono, {30000, 100, -50, 7}, SoundTool::Normalize, {1, 3}, {30000, 32767, -16384, 7}},
    {"normalize silence", k16Mono, {0, 0, 0}, SoundTool::Normalize, {}, {0, 0, 0}},
    {"reverse 8 stereo keeps channels", k8Stereo, {1, 2, 3, 4, 5, 6}, SoundTool::Reverse, {}, {5, 6, 3, 4, 1, 2}},
    {"reverse 16 mono to the end", k16Mono, {1, 2, 3, 4}, SoundTool::Reverse, {2, 4}, {1, 2, 4, 3}},
    {"invert 8 mono", k8Mono, {-128, 127, -1, 0}, SoundTool::InvertSign, {}, {127, -127, 1, 0}},
    {"invert 16 stereo", k16Stereo, {-32768, 32767, 0, -1}, SoundTool::InvertSign, {}, {32767, -32767, 0, 1}},
    {"one frame fade in", k8Mono, {100}, SoundTool::FadeIn, {}, {0}},
    {"one frame fade out 16 stereo", k16Stereo, {100, -100}, SoundTool::FadeOut, {}, {0, 0}},
    {"one frame normalize", k8Mono, {-3}, SoundTool::Normalize, {}, {-127}},
    {"one frame reverse", k16Mono, {7}, SoundTool::Reverse, {}, {7}},
    {"range cut at the end", k8Mono, {1, 2, 3, 4}, SoundTool::InvertSign, {2, 100}, {1, 2, -3, -4}},
    {"range past the end", k8Mono, {1, 2, 3, 4}, SoundTool::InvertSign, {4, 9}, {1, 2, 3, 4}},
};
// clang-format on

class SoundTools : public test::EditFixture, public ::testing::WithParamInterface<ToolCase> {};

TEST_P(SoundTools, GiveExactValuesAndUndoGivesTheSoundBack) {
    const ToolCase& c = GetParam();
    put_sound(kSlot, make_sound(c.format, c.before));
    const auto before = song_bytes(engine.bank);
    const bool changes = c.after != c.before;
    EXPECT_EQ(edit([&](SongTransaction& t) { return apply_sound_tool(t, kSlot, c.tool, c.range); }), changes);
    EXPECT_EQ(values_of(sound(kSlot)), c.after);
    EXPECT_TRUE(!changes || (undo() && song_bytes(engine.bank) == before));
}
INSTANTIATE_TEST_SUITE_P(EachFormat, SoundTools, ::testing::ValuesIn(kToolCases),
                         [](const auto& i) { return test_name(i.param.name); });

// Frames 0..9 of each format looping over frames 2..8 (bytes in the record), block 1
// over [6, 9), block 2 [1, 3); the clip is two 16-bit stereo frames, A and B, which a paste
// converts to the sound's format.
SoundClip two_frames() {
    const SampleRef from = make_sound(k16Stereo, {512, 1024, -512, -1024});
    return {16, true, 44100, std::vector<uint8_t>(from->data, from->data + from->length)};
}
// In a case's frame list: the clip's frames, and a silent frame.
constexpr int kClipA = 1000, kClipB = -1000, kSilent = 2000;

struct FrameFormat {
    const char* name;
    test::SoundFormat format;
    std::vector<int> clip_a, clip_b;  // the clip's frames converted to the format
};
const FrameFormat kFrameFormats[] = {
    {"EightBitMono", k8Mono, {3}, {-3}},
    {"EightBitStereo", k8Stereo, {2, 4}, {-2, -4}},
    {"SixteenBitStereo", k16Stereo, {512, 1024}, {-512, -1024}},
};

// Sample values of frames: frame v is v, and v + 50 on the right channel.
std::vector<int> samples_of(const FrameFormat& f, const std::vector<int>& frames) {
    std::vector<int> out;
    for (int v : frames) {
        if (v == kSilent) {
            out.insert(out.end(), f.format.stereo ? 2 : 1, 0);
            continue;
        }
        if (v == kClipA || v == kClipB) {
            const auto& clip = v == kClipA ? f.clip_a : f.clip_b;
            out.insert(out.end(), clip.begin(), clip.end());
            continue;
        }
        out.push_back(v);
        if (f.format.stereo) out.push_back(v + 50);
    }
    return out;
}

struct FrameCase {
    const char* name;
    std::function<bool(SongTransaction&)> edit;
    std::vector<int> after;  // frames
    const char* marks;       // the loop and the blocks afterwards, in frames
};
// clang-format off
const FrameCase kFrameCases[] = {
    {"cut", [](auto& t) { return cut_frames(t, kSlot, {3, 5}); }, {0, 1, 2, 5, 6, 7, 8, 9},
     "loop on 2..6, block 1 4..7, block 2 1..3"},
    {"cut over the loop", [](auto& t) { return cut_frames(t, kSlot, {1, 9}); }, {0, 9}, "loop off 1..1"},
    {"cut all", [](auto& t) { return cut_frames(t, kSlot, {}); }, {}, "loop off 0..0"},
    {"crop", [](auto& t) { return crop_to_frames(t, kSlot, {2, 7}); }, {2, 3, 4, 5, 6},
     "loop on 0..5, block 1 4..5, block 2 0..1"},
    {"silence to the end", [](auto& t) { return silence_frames(t, kSlot, {8, 10}); },
     {0, 1, 2, 3, 4, 5, 6, 7, kSilent, kSilent}, "loop on 2..8, block 1 6..9, block 2 1..3"},
    {"paste where a block starts", [](auto& t) { return paste_frames(t, kSlot, 6, two_frames()); },
     {0, 1, 2, 3, 4, 5, kClipA, kClipB, 6, 7, 8, 9}, "loop on 2..10, block 1 8..11, block 2 1..3"},
    {"paste where a block ends", [](auto& t) { return paste_frames(t, kSlot, 9, two_frames()); },
     {0, 1, 2, 3, 4, 5, 6, 7, 8, kClipA, kClipB, 9}, "loop on 2..8, block 1 6..9, block 2 1..3"},
    {"paste past the end", [](auto& t) { return paste_frames(t, kSlot, 99, two_frames()); },
     {0, 1, 2, 3, 4, 5, 6, 7, 8, 9, kClipA, kClipB}, "loop on 2..8, block 1 6..9, block 2 1..3"},
};
// clang-format on

class FrameEdits : public test::EditFixture,
                   public ::testing::WithParamInterface<std::tuple<FrameFormat, FrameCase>> {
protected:
    // Loop points are bytes: one off a frame's start shows as "+N bytes".
    static std::string frame_text(uint32_t bytes, uint32_t frame_bytes) {
        std::string text = std::to_string(bytes / frame_bytes);
        if (bytes % frame_bytes) text += "+" + std::to_string(bytes % frame_bytes) + " bytes";
        return text;
    }
    std::string marks() const {
        const p_s& s = *sound(kSlot);
        const uint32_t frame_bytes = uint32_t(s.bits / 8) * (s.stereo ? 2 : 1);
        std::string text = std::string("loop ") + (s.loopon ? "on " : "off ") +
                           frame_text(s.loopstart, frame_bytes) + ".." + frame_text(s.loopend, frame_bytes);
        for (int n = 1; n <= kSoundBlocks; ++n)
            if (const auto b = sound_block(engine.bank.current(), kSlot, n, sound_frames(&s)))
                text += ", block " + std::to_string(n) + " " + std::to_string(b->first) + ".." +
                        std::to_string(b->end);
        return text;
    }
};

TEST_P(FrameEdits, MoveLoopAndBlocksWithTheFramesAndUndo) {
    const auto& [format, c] = GetParam();
    SampleRef s = make_sound(format.format, samples_of(format, {0, 1, 2, 3, 4, 5, 6, 7, 8, 9}));
    const uint32_t frame_bytes = uint32_t(format.format.bits / 8) * (format.format.stereo ? 2 : 1);
    s->loopon = 1;
    s->loopstart = 2 * frame_bytes;
    s->loopend = 8 * frame_bytes;
    put_sound(kSlot, std::move(s));
    edit([](SongTransaction& t) {
        return set_sound_block(t, kSlot, 1, {6, 9}) && set_sound_block(t, kSlot, 2, {1, 3});
    });
    const auto before = song_bytes(engine.bank);
    ASSERT_TRUE(edit(c.edit));
    EXPECT_EQ(values_of(sound(kSlot)), samples_of(format, c.after));
    EXPECT_EQ(marks(), c.marks);
    EXPECT_TRUE(undo() && song_bytes(engine.bank) == before);
}
INSTANTIATE_TEST_SUITE_P(EachFormat, FrameEdits,
                         ::testing::Combine(::testing::ValuesIn(kFrameFormats),
                                            ::testing::ValuesIn(kFrameCases)),
                         [](const auto& i) {
                             return std::string(std::get<0>(i.param).name) + "_" +
                                    test_name(std::get<1>(i.param).name);
                         });

class SoundClips : public test::EditFixture {};

TEST_F(SoundClips, PasteIntoOtherFormatsAndEmptySlots) {
    put_sound(kSlot, make_sound(k8Mono, {0, 1, 2, 3}));
    SoundClip clip;
    edit([&](SongTransaction& t) {
        clip = copy_frames(t, kSlot, {1, 3});
        return false;
    });
    EXPECT_EQ(std::make_tuple(clip.bits, clip.stereo, clip.rate, clip.frames()),
              std::make_tuple(int16_t{8}, false, 22050u, 2u));
    SampleRef looped = make_sound(k16Stereo, {7, 8});
    looped->loopon = 1;
    looped->loopend = 4;  // bytes: its one frame
    put_sound(5, std::move(looped));
    ASSERT_TRUE(edit([&](SongTransaction& t) { return paste_frames(t, 5, 0, clip); }));
    EXPECT_EQ(values_of(sound(5)), (std::vector<int>{256, 256, 512, 512, 7, 8}));
    EXPECT_EQ(std::make_pair(sound(5)->loopstart, sound(5)->loopend), std::make_pair(8u, 12u));
    // An empty slot takes the clip's format and rate, at full volume.
    ASSERT_TRUE(edit([&](SongTransaction& t) { return paste_frames(t, 9, 40, clip); }));
    EXPECT_EQ(values_of(sound(9)), (std::vector<int>{1, 2}));
    EXPECT_EQ(std::make_tuple(sound(9)->framecode, sound(9)->rate, sound(9)->volume),
              std::make_tuple(int16_t{0}, 22050u, int16_t{128}));
    ASSERT_TRUE(undo());
    EXPECT_EQ(sound(9), nullptr);
    EXPECT_FALSE(edit([&](SongTransaction& t) { return paste_frames(t, 9, 0, SoundClip{}); }));
}

}  // namespace
}  // namespace ondrel
