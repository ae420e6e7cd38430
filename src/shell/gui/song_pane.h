#pragma once

namespace ondrel {

class Program;
struct TMOD;

// The song's settings (name, tempo, speed, master volume, rows of the pattern shown,
// tracks) and those of the cursor's track (voices, pan, volume, MIDI channel).
void draw_song_pane(Program& p, const TMOD& song);
// The settings of one track, as the pane and the track header's menu show them.
void draw_track_settings(Program& p, const TMOD& song, int track);
// "Set Midi chanel": the MIDI channel of the cursor's track, 0 for its samples.
void draw_midi_channel_window(Program& p, const TMOD& song);

// The voices choices of a track, as the track menu offers them.
inline constexpr const char* kVoiceChoices[] = {"Mono (1 Voice)", "2 Voices", "3 Voices",
                                                "4 Voices",       "5 Voices", "Auto (Maximum Voices)"};

}  // namespace ondrel
