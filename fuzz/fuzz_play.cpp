// Loads any module (the first byte picks the reader) and renders a few seconds of it, so
// that what the readers let through is also safe to play.
#include <cstddef>
#include <cstdint>
#include <span>

#include "engine/engine.h"
#include "import/module_reader.h"
#include "render/offline_render.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    if (size < 1) return 0;
    static const ondrel::ModuleReaderFn readers[] = {ondrel::read_otm, ondrel::read_mod, ondrel::read_s3m,
                                                     ondrel::read_mtm};
    ondrel::Engine engine;
    ondrel::ByteReader file(std::span<const uint8_t>(data + 1, size - 1));
    ondrel::ModuleRead read;
    *read.song.mod = engine.bank.current();
    if (!readers[data[0] % 4](file, read)) return 0;
    engine.bank.install(0, std::move(read.song));
    engine.mixer.qual = data[0] & 4 ? 1 : 0;
    ondrel::render_offline(engine.mixer, engine.player, {512, 3.0}, [](const float*, int, double) { return true; });
    return 0;
}
