#include <cstdint>
#include <cstdlib>
#include <iostream>
#include <optional>

#include "cli/cli_load.h"
#include "cli/commands.h"
#include "edit/sound_edits.h"
#include "edit/sound_frames.h"

namespace ondrel {

namespace {

constexpr const char* kUsage =
    "usage: ondrel edit-sound SONG SLOT OPERATION [--from FRAME] [--to FRAME] -o OUT.otm\n";

struct Operation {
    const char* name;
    SoundTool tool;
};
constexpr Operation kOperations[] = {
    {"fade-in", SoundTool::FadeIn},  {"fade-out", SoundTool::FadeOut},  {"normalize", SoundTool::Normalize},
    {"reverse", SoundTool::Reverse}, {"invert", SoundTool::InvertSign},
};

std::optional<SoundTool> operation_named(const std::string& name) {
    for (const auto& op : kOperations)
        if (name == op.name) return op.tool;
    return std::nullopt;
}

std::optional<uint32_t> whole_number(const std::string& text, uint32_t max) {
    if (text.empty() || text[0] < '0' || text[0] > '9') return std::nullopt;
    char* end = nullptr;
    const unsigned long long v = std::strtoull(text.c_str(), &end, 10);
    if (*end || v > max) return std::nullopt;
    return static_cast<uint32_t>(v);
}

int usage_error(const std::string& why) {
    std::cerr << "ondrel edit-sound: " << why << "\n";
    return kExitUsage;
}

}  // namespace

int cmd_edit_sound(const Args& args) {
    std::vector<std::string> positional;
    std::string out;
    std::optional<uint32_t> from, to;
    for (size_t i = 0; i < args.size(); ++i) {
        const std::string& a = args[i];
        const bool has_value = i + 1 < args.size();
        if (a == "-h" || a == "--help") {
            std::cout << kUsage
                      << "Runs a sample editor tool on sound SLOT (1 to 128) of the song and saves the\n"
                         "song as an Ondrel Tracker Module. OPERATION is one of fade-in, fade-out,\n"
                         "normalize, reverse, invert. --from and --to choose the frames from FROM up to,\n"
                         "not including, TO (by default the first and the last); without them the tool\n"
                         "works on the whole sound. OUT is replaced only once the new file is complete.\n";
            return kExitOk;
        } else if (a == "-o" && has_value) {
            out = args[++i];
        } else if ((a == "--from" || a == "--to") && has_value) {
            const auto v = whole_number(args[++i], UINT32_MAX);
            if (!v) return usage_error(a + " wants a frame number, not '" + args[i] + "'");
            (a == "--from" ? from : to) = v;
        } else if (!a.empty() && a[0] != '-') {
            positional.push_back(a);
        } else {
            return usage_error("unexpected " + a);
        }
    }
    if (positional.size() != 3 || out.empty()) {
        std::cerr << kUsage;
        return kExitUsage;
    }
    const auto slot = whole_number(positional[1], kSamplesPerSong);
    if (!slot || *slot < 1)
        return usage_error("SLOT is a sound number from 1 to 128, not '" + positional[1] + "'");
    const auto tool = operation_named(positional[2]);
    if (!tool)
        return usage_error("unknown operation '" + positional[2] +
                           "' (fade-in, fade-out, normalize, reverse, invert)");

    Engine engine;
    if (!load_for_cli(engine, positional[0])) return kExitFailed;
    const int local = static_cast<int>(*slot) - 1;
    const uint32_t frames = sound_frames(engine.bank.song_sample(local));
    if (frames == 0) {
        std::cerr << "ondrel: " << positional[0] << ": slot " << *slot << " holds no sound\n";
        return kExitFailed;
    }
    const uint32_t first = from.value_or(0), end = to.value_or(frames);
    if (first >= end || end > frames)
        return usage_error("frames " + std::to_string(first) + " to " + std::to_string(end) +
                           " are not inside sound " + std::to_string(*slot) + " (" + std::to_string(frames) +
                           " frames)");

    SongTransaction edit(engine.bank, engine.slots, sound_tool_label(*tool));
    apply_sound_tool(edit, local, *tool, {first, end});
    edit.commit();
    return save_song_for_cli(engine, out);
}

}  // namespace ondrel
