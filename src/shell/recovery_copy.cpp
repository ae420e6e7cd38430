#include "shell/recovery_copy.h"

#include <filesystem>

#include "export/atomic_file.h"
#include "export/otm_writer.h"

namespace ondrel {

namespace fs = std::filesystem;

namespace {
constexpr size_t kMaxOriginBytes = 4096;

// The original path sits beside the song, one line; the song's presence marks the copy.
std::string origin_file(const std::string& dir) {
    return (fs::path(dir) / "recovery-origin.txt").string();
}
}  // namespace

std::string recovery_song_file(const std::string& dir) {
    return (fs::path(dir) / "recovery.otm").string();
}

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
    const std::string origin = std::string(bank.timod[song]->path) + "\n";
    if (!write_file_atomically(origin_file(dir), std::vector<uint8_t>(origin.begin(), origin.end()), why))
        return false;
    return write_file_atomically(recovery_song_file(dir), write_otm(bank, song, slots), why);
}

std::optional<RecoveryCopy> find_recovery_copy(const std::string& dir) {
    RecoveryCopy copy;
    copy.song_file = recovery_song_file(dir);
    std::error_code ec;
    if (!fs::is_regular_file(copy.song_file, ec)) return std::nullopt;
    std::vector<uint8_t> bytes;
    std::string why;
    if (read_file(origin_file(dir), bytes, why, kMaxOriginBytes)) {
        copy.original_path.assign(bytes.begin(), bytes.end());
        copy.original_path.resize(std::min(copy.original_path.find('\n'), copy.original_path.size()));
    }
    return copy;
}

LoadResult reopen_recovery_copy(const RecoveryCopy& copy, SongBank& bank, EffectSlots& slots) {
    LoadResult result = load(copy.song_file, bank, slots);
    if (result.ok && result.song >= 0 && bank.timod[result.song])
        set_text(bank.timod[result.song]->path, copy.original_path.c_str());
    return result;
}

void discard_recovery_copy(const std::string& dir) {
    std::error_code ec;
    fs::remove(recovery_song_file(dir), ec);
    fs::remove(origin_file(dir), ec);
}

}  // namespace ondrel
