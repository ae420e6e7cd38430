#include "shell/file_kind.h"

#include "import/sound_reader.h"
#include "platform/mime_type.h"

namespace ondrel {

namespace {
EntryKind from_file_type(int type) {
    switch (type) {
        case kModuleFile: return EntryKind::Module;
        case kSoundFile: return EntryKind::Sound;
        default: return EntryKind::Other;
    }
}
}  // namespace

EntryKind kind_of_file(const std::string& path) {
    // A module extension decides whatever the content says; skip the sniffing then.
    const EntryKind by_name = kind_by_extension(path);
    if (by_name == EntryKind::Module) return by_name;
    return from_file_type(returntype(path, mime_type_of(path)));
}

EntryKind kind_by_extension(const std::string& path) {
    return from_file_type(returntype(path, ""));
}

}  // namespace ondrel
