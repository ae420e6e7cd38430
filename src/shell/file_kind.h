#pragma once
#include <string>

namespace ondrel {

// What an entry of the file browser is. Files are sorted exactly as opening them would
// sort them (returntype over the extension and the content's MIME type).
enum class EntryKind { Directory, Module, Sound, Other };

// The kind of a regular file from its extension and its content.
EntryKind kind_of_file(const std::string& path);
// The kind from the extension alone: Module or Sound here is final (the content can only
// confirm it); Other still needs a look at the content.
EntryKind kind_by_extension(const std::string& path);

inline bool is_audio(EntryKind kind) {
    return kind == EntryKind::Module || kind == EntryKind::Sound;
}

// Names starting with '.', which the browser hides unless it shows all files.
inline bool is_hidden_name(const std::string& name) {
    return !name.empty() && name[0] == '.';
}

}  // namespace ondrel
