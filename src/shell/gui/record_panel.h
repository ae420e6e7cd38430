#pragma once

namespace ondrel {

class Program;

// The recording panel: the source (the input, with its chooser, or the song's own output),
// the format, the destination (the current instrument or a "D2D File"), the gain, monitor,
// record and stop, the peak meters and how much has been recorded and written.
void draw_record_panel(Program& p);

}  // namespace ondrel
