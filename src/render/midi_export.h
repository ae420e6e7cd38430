#pragma once
#include <functional>

#include "engine/engine.h"
#include "export/midi_file.h"
#include "render/offline_render.h"

namespace ondrel {

struct MidiExportOptions {
    OfflineOptions render;  // the time limit, and the buffer (a step long with "Tempo" off)
    // Called after each rendered buffer with the player of the copy and the seconds done.
    std::function<void(const Player& player, double seconds)> progress;
};

struct MidiExport {
    MidiSong file;
    RenderEnd end = RenderEnd::SongEnd;
    double seconds = 0;  // how long the song played
};

// Plays the engine's current song from its start, as `render` plays it (the mixer's
// "Tempo", pitch and buffer decide the times), on a copy: the engine and its song are left
// as they were. Gives a MIDI file of it, one track per song track that plays notes:
// - a track with a MIDI channel holds exactly what the MIDI output receives from it, in
//   the sequencer's order and at its times;
// - a track without one holds its notes on a channel no MIDI track uses (10 is left to
//   drums; once they run out they are used again in order), each note preceded by its own
//   instrument as program (instrument n is program n - 1) whenever the channel's differs.
// Notes still sounding at the end are let go there. The tempo map is the step's length:
// see MidiTempoMap.
MidiExport song_to_midi(Engine& engine, const MidiExportOptions& options);

}  // namespace ondrel
