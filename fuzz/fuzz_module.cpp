// One reader per build of this file (ONDREL_FUZZ_READER picks it): the bytes go through
// the bounded reader exactly as a file would, and must never be read outside.
#include <cstddef>
#include <cstdint>
#include <span>

#include "import/module_reader.h"
#include "import/sound_reader.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    ondrel::ByteReader file(std::span<const uint8_t>(data, size));
    ondrel::ModuleRead out;
    ONDREL_FUZZ_READER(file, out);
    return 0;
}
