#include "shell/browser_entry.h"

#include <cctype>
#include <cstddef>

namespace ondrel {

namespace {
int natural_compare(const std::string& a, const std::string& b) {
    size_t i = 0, j = 0;
    while (i < a.size() && j < b.size()) {
        const auto ca = static_cast<unsigned char>(a[i]);
        const auto cb = static_cast<unsigned char>(b[j]);
        if (std::isdigit(ca) && std::isdigit(cb)) {
            // Compare the runs by value: skip leading zeros, then longer is larger.
            size_t si = i, sj = j;
            while (si < a.size() && a[si] == '0') ++si;
            while (sj < b.size() && b[sj] == '0') ++sj;
            size_t ei = si, ej = sj;
            while (ei < a.size() && std::isdigit(static_cast<unsigned char>(a[ei]))) ++ei;
            while (ej < b.size() && std::isdigit(static_cast<unsigned char>(b[ej]))) ++ej;
            if (ei - si != ej - sj) return ei - si < ej - sj ? -1 : 1;
            if (const int c = a.compare(si, ei - si, b, sj, ej - sj); c != 0) return c;
            i = ei;
            j = ej;
            continue;
        }
        const int la = std::tolower(ca), lb = std::tolower(cb);
        if (la != lb) return la < lb ? -1 : 1;
        ++i;
        ++j;
    }
    if (i < a.size()) return 1;
    if (j < b.size()) return -1;
    return 0;
}

int group_of(const BrowserEntry& e) {
    if (e.name == "..") return 0;
    switch (e.kind) {
        case EntryKind::Directory: return 1;
        case EntryKind::Module: return 2;
        case EntryKind::Sound: return 3;
        case EntryKind::Other: return 4;
    }
    return 4;
}
}  // namespace

bool browser_order(const BrowserEntry& a, const BrowserEntry& b) {
    if (const int ga = group_of(a), gb = group_of(b); ga != gb) return ga < gb;
    if (const int c = natural_compare(a.name, b.name); c != 0) return c < 0;
    return a.name < b.name;  // names equal but for case or zeros: a stable, total order
}

}  // namespace ondrel
