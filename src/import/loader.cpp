#include "import/loader.h"

#include <cstring>
#include <fstream>
#include <mutex>

namespace ondrel {

bool read_file(const std::string& path, std::vector<uint8_t>& bytes, std::string& why, size_t max_bytes) {
    std::ifstream in(path, std::ios::binary | std::ios::ate);
    if (!in) {
        why = "cannot open " + path + ": " + std::strerror(errno);
        return false;
    }
    const std::streamoff size = in.tellg();
    if (size < 0) {
        why = "cannot read " + path;
        return false;
    }
    if (static_cast<size_t>(size) > max_bytes) {
        why = path + " is too large (" + std::to_string(size) + " bytes)";
        return false;
    }
    bytes.resize(static_cast<size_t>(size));
    in.seekg(0);
    if (size > 0 && !in.read(reinterpret_cast<char*>(bytes.data()), size)) {
        why = "cannot read " + path;
        return false;
    }
    return true;
}

const char* packer_of(const std::vector<uint8_t>& bytes) {
    static const char* const kPackers[] = {"ICE!", "PP20", "EKO!", "ATM5"};
    if (bytes.size() < 4) return nullptr;
    for (const char* p : kPackers)
        if (std::memcmp(bytes.data(), p, 4) == 0) return p;
    return nullptr;
}

namespace {

void apply_effects(const EffectsRead& fx, const TMOD& song, EffectSlots& slots, StructureLock& lock) {
    for (int u = 0; u < kEchoUnits; ++u)
        if (fx.echo_units_set & (1u << u)) slots.reserve_echo_line(u, song.echolen[u], lock);
    if (fx.has_added_types) {
        std::lock_guard<StructureLock> guard(lock);
        for (int s = kFirstClonedSlot; s < kEffectSlots; ++s) slots.efxtype[s] = fx.added_types[s];
    }
}

}  // namespace

LoadResult load(const std::string& path, SongBank& bank, EffectSlots& slots) {
    LoadResult result;
    std::vector<uint8_t> bytes;
    if (!read_file(path, bytes, result.error)) return result;
    if (const char* packer = packer_of(bytes)) {
        if (bank.alerts()) bank.alerts()->show({"title", "Packed with unknown packer", {"Arg!!"}});
        result.error = path + ": packed with an unknown packer (" + packer + ")";
        return result;
    }
    const ModuleReaderEntry& reader = reader_for(path);
    if (!reader.read) {
        result.error = path + ": " + reader.description + " files are not supported yet";
        return result;
    }

    ModuleRead read;
    if (bank.fmulload) {
        read.song.mod = bank.default_record(bank.nbimod);
    } else {
        // The sequencer may be writing the playing song's record: copy it between buffers.
        std::lock_guard<StructureLock> guard(bank.structure_lock());
        *read.song.mod = bank.current();
    }
    ByteReader file(bytes);
    if (!reader.read(file, read)) {
        result.error = path + ": " + read.error;
        return result;
    }
    set_text(read.song.mod->path, path.c_str());

    if (bank.fmulload && !bank.newmusic()) {
        result.error = "Can't create new music: 63 songs are held already";
        return result;
    }
    apply_effects(read.effects, *read.song.mod, slots, bank.structure_lock());
    result.song = bank.noimod;
    bank.install(bank.noimod, std::move(read.song));
    result.ok = true;
    result.truncated = read.truncated;
    result.notes = std::move(read.notes);
    return result;
}

}  // namespace ondrel
