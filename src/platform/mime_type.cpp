#include "platform/mime_type.h"

#include <magic.h>

namespace ondrel {

namespace {
// One loaded database per thread: libmagic's cookies are not shared between threads.
class Magic {
public:
    Magic() : cookie_(magic_open(MAGIC_MIME_TYPE)) {
        if (cookie_ && magic_load(cookie_, nullptr) != 0) {
            magic_close(cookie_);
            cookie_ = nullptr;
        }
    }
    ~Magic() {
        if (cookie_) magic_close(cookie_);
    }
    Magic(const Magic&) = delete;
    Magic& operator=(const Magic&) = delete;
    magic_t get() const { return cookie_; }

private:
    magic_t cookie_;
};
}  // namespace

std::string mime_type_of(const std::string& path) {
    thread_local Magic magic;
    if (!magic.get()) return {};
    const char* type = magic_file(magic.get(), path.c_str());
    return type ? type : "";
}

}  // namespace ondrel
