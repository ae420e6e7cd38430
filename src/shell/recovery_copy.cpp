#include "shell/recovery_copy.h"

#include <algorithm>
#include <filesystem>

#include "export/otm_writer.h"
#include "export/output_file.h"

namespace ondrel {

namespace fs = std::filesystem;

namespace {
constexpr size_t kMaxOriginBytes = 4096;
constexpr int kMaxCopies = 1000;

// recovery-N.otm holds the song; recovery-N.txt beside it one line, the original path.
std::string song_file_of(const std::string& dir, int n) {
    return (fs::path(dir) / ("recovery-" + std::to_string(n) + ".otm")).string();
}

std::string origin_file_of(const std::string& song_file) {
    return fs::path(song_file).replace_extension(".txt").string();
}

// N of a name "recovery-N.otm", or -1.
int number_of(const std::string& name) {
    const std::string head = "recovery-", tail = ".otm";
    if (name.size() <= head.size() + tail.size() || name.rfind(head, 0) != 0 ||
        name.compare(name.size() - tail.size(), tail.size(), tail) != 0)
        return -1;
    const std::string digits = name.substr(head.size(), name.size() - head.size() - tail.size());
    if (digits.size() > 3 ||
        !std::all_of(digits.begin(), digits.end(), [](char c) { return c >= '0' && c <= '9'; }))
        return -1;
    return std::stoi(digits);
}
}  // namespace

bool write_recovery_copy(const std::string& dir, const SongBank& bank, int song, const EffectSlots& slots,
                         std::string& why) {
    if (song < 0 || song >= bank.nbimod || !bank.timod[song]) {
        why = "no such song";
        return false;
    }
    std::error_code ec;
    fs::create_directories(dir, ec);
    if (ec) {
        why = "cannot create " + dir + ": " + ec.message();
        return false;
    }
    int n = 0;
    while (n < kMaxCopies && fs::exists(song_file_of(dir, n), ec)) ++n;
    if (n == kMaxCopies) {
        why = "too many recovery copies in " + dir;
        return false;
    }
    const std::string song_file = song_file_of(dir, n);
    const std::string origin = std::string(bank.timod[song]->path) + "\n";
    // The origin first: the song's file is what marks a copy as complete.
    return write_output_file(origin_file_of(song_file), std::vector<uint8_t>(origin.begin(), origin.end()),
                             why) &&
           write_output_file(song_file, write_otm(bank, song, slots), why);
}

std::vector<RecoveryCopy> find_recovery_copies(const std::string& dir) {
    std::vector<std::pair<int, RecoveryCopy>> found;
    std::error_code ec;
    for (fs::directory_iterator it(dir, ec); !ec && it != fs::directory_iterator(); it.increment(ec)) {
        const int n = number_of(it->path().filename().string());
        std::error_code kind_ec;
        if (n < 0 || !it->is_regular_file(kind_ec)) continue;
        RecoveryCopy copy{it->path().string(), ""};
        std::vector<uint8_t> bytes;
        std::string why;
        if (read_file(origin_file_of(copy.song_file), bytes, why, kMaxOriginBytes)) {
            copy.original_path.assign(bytes.begin(), bytes.end());
            copy.original_path.resize(std::min(copy.original_path.find('\n'), copy.original_path.size()));
        }
        found.emplace_back(n, std::move(copy));
    }
    std::sort(found.begin(), found.end(), [](const auto& a, const auto& b) { return a.first < b.first; });
    std::vector<RecoveryCopy> copies;
    for (auto& [n, copy] : found) copies.push_back(std::move(copy));
    return copies;
}

LoadResult reopen_recovery_copy(const RecoveryCopy& copy, SongBank& bank, EffectSlots& slots) {
    LoadResult result = load(copy.song_file, bank, slots);
    if (result.ok && result.song >= 0 && bank.timod[result.song])
        set_text(bank.timod[result.song]->path, copy.original_path.c_str());
    return result;
}

void discard_recovery_copy(const RecoveryCopy& copy) {
    std::error_code ec;
    fs::remove(copy.song_file, ec);
    fs::remove(origin_file_of(copy.song_file), ec);
}

}  // namespace ondrel
