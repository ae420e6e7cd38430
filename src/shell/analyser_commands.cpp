// The "FFT Window": opening it, its source and its view.
#include "shell/command_handlers.h"
#include "shell/program.h"

namespace ondrel {

void cmd_analyser(Program& p, const ShellMessage& m) {
    std::atomic<int16_t>& source = p.engine.mixer.f_fftmode;
    switch (m.code) {
        case fourcc("wfft"):
            p.windows.analyser = true;
            p.analyser.reset();
            // Something to show at once: the song, unless a source was chosen before.
            if (source.load() == 0) source.store(kAnalyseSong);
            break;
        case fourcc("FFTs"): source.store(kAnalyseSong); break;
        case fourcc("FFTi"): source.store(kAnalyseInput); break;
        case fourcc("FTv0"): p.analyser.set_view(kViewClassic); break;
        case fourcc("FTv1"): p.analyser.set_view(kViewRadar); break;
        default: break;
    }
}

}  // namespace ondrel
