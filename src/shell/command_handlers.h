#pragma once
#include <functional>

#include "shell/shell_message.h"

namespace ondrel {

class Program;

// What the commands of the table do, by area. Each takes the program and the message.

// Files: opening, saving, the file panel's replies.
void cmd_new_song(Program& p, const ShellMessage& m);
void cmd_open_song(Program& p, const ShellMessage& m);
void cmd_open_files(Program& p, const ShellMessage& m);
void cmd_save_song(Program& p, const ShellMessage& m);
void cmd_save_song_as(Program& p, const ShellMessage& m);
void cmd_save_song_to(Program& p, const ShellMessage& m);
void cmd_save_sound(Program& p, const ShellMessage& m);
void cmd_save_sound_to(Program& p, const ShellMessage& m);
void cmd_save_midi(Program& p, const ShellMessage& m);
void cmd_save_midi_to(Program& p, const ShellMessage& m);
void cmd_quit(Program& p, const ShellMessage& m);
// Saves the current song to its file, or asks for one; then runs next.
void save_song_then(Program& p, const std::function<void()>& next);
// Songs with unsaved changes written where the next start finds them.
void keep_recovery_copies(Program& p);
// At start: asks, one copy at a time, whether to reopen what an earlier run kept ("Reopen"
// loads it as an unsaved song under its original path, "Discard" drops it).
void offer_recovery_copies(Program& p);

// The editor's place kept on the song's file: read after a song is opened, written after
// it is saved.
void restore_editor_position(Program& p);
void store_editor_position(Program& p);

// The file browser's menus: its views, the audio search, refresh; the paths menu.
void cmd_browser_menu(Program& p, const ShellMessage& m);
void cmd_paths_item(Program& p, const ShellMessage& m);
void cmd_browser_go(Program& p, const ShellMessage& m);
// Plays a sound file on its own (none: stops what plays).
void cmd_preview_sound(Program& p, const ShellMessage& m);

// Songs in memory.
void cmd_multiple_loading(Program& p, const ShellMessage& m);
void cmd_kill_song(Program& p, const ShellMessage& m);
void cmd_new_music(Program& p, const ShellMessage& m);
void cmd_select_song(Program& p, const ShellMessage& m);

// Options.
void cmd_tempo_option(Program& p, const ShellMessage& m);
void cmd_pan_mode(Program& p, const ShellMessage& m);
void cmd_sound_quality(Program& p, const ShellMessage& m);
void cmd_full_screen(Program& p, const ShellMessage& m);
void cmd_vumeter(Program& p, const ShellMessage& m);
void cmd_chord_entry(Program& p, const ShellMessage& m);
void cmd_keyboard_layout(Program& p, const ShellMessage& m);

// Transport.
void cmd_play_song(Program& p, const ShellMessage& m);
void cmd_play_pattern(Program& p, const ShellMessage& m);
void cmd_stop(Program& p, const ShellMessage& m);
void cmd_loop(Program& p, const ShellMessage& m);
void cmd_song_ended(Program& p, const ShellMessage& m);
void cmd_mute_track(Program& p, const ShellMessage& m);

// Windows.
void cmd_about(Program& p, const ShellMessage& m);
void cmd_arrangement_follow(Program& p, const ShellMessage& m);
void cmd_documentation(Program& p, const ShellMessage& m);
void cmd_open_window(Program& p, const ShellMessage& m);

// Editing that the shell itself does.
void cmd_jump_step(Program& p, const ShellMessage& m);
void cmd_cursor_to(Program& p, const ShellMessage& m);
void cmd_mark_block(Program& p, const ShellMessage& m);
void cmd_edit_mode(Program& p, const ShellMessage& m);
void cmd_undo(Program& p, const ShellMessage& m);
void cmd_redo(Program& p, const ShellMessage& m);

// Pattern, track and block: clear, cut, copy, paste and paste-mix, transpose.
void cmd_clear_cells(Program& p, const ShellMessage& m);
void cmd_cut_cells(Program& p, const ShellMessage& m);
void cmd_copy_cells(Program& p, const ShellMessage& m);
void cmd_paste_cells(Program& p, const ShellMessage& m);
void cmd_transpose(Program& p, const ShellMessage& m);

// Positions and patterns of the sequence; removing sounds, sequence or everything.
void cmd_next_position(Program& p, const ShellMessage& m);
void cmd_previous_position(Program& p, const ShellMessage& m);
void cmd_delete_position(Program& p, const ShellMessage& m);
void cmd_insert_position(Program& p, const ShellMessage& m);
void cmd_new_pattern(Program& p, const ShellMessage& m);
void cmd_next_position_new_pattern(Program& p, const ShellMessage& m);
void cmd_remove_pattern(Program& p, const ShellMessage& m);
void cmd_remove_from_song(Program& p, const ShellMessage& m);

// Settings of the song, its tracks, instruments and positions (the panes and windows).
void cmd_song_setting(Program& p, const ShellMessage& m);
void cmd_track_setting(Program& p, const ShellMessage& m);
void cmd_instrument(Program& p, const ShellMessage& m);
void cmd_arrangement(Program& p, const ShellMessage& m);

// The instrument, sample and envelope editors.
void cmd_sound_field(Program& p, const ShellMessage& m);
void cmd_sound_tool(Program& p, const ShellMessage& m);
void cmd_sound_frames(Program& p, const ShellMessage& m);
void cmd_sound_block(Program& p, const ShellMessage& m);
void cmd_sound_selection(Program& p, const ShellMessage& m);
void cmd_play_sound(Program& p, const ShellMessage& m);
void cmd_envelope(Program& p, const ShellMessage& m);

// The effect panel and the tracks' routing.
void cmd_effect_slot(Program& p, const ShellMessage& m);
void cmd_effect_setting(Program& p, const ShellMessage& m);
void cmd_reverb_setting(Program& p, const ShellMessage& m);
void cmd_track_routing(Program& p, const ShellMessage& m);

// Recording: monitor, record, stop (also the recorder's own request to stop), the
// panel's settings, its file; and when they can be chosen.
void cmd_monitor(Program& p, const ShellMessage& m);
void cmd_record(Program& p, const ShellMessage& m);
void cmd_stop_recording(Program& p, const ShellMessage& m);
void cmd_recording_setting(Program& p, const ShellMessage& m);
void cmd_choose_recording_file(Program& p, const ShellMessage& m);
void cmd_recording_file_chosen(Program& p, const ShellMessage& m);
bool can_monitor(const Program& p);
bool can_record(const Program& p);
bool can_stop_recording(const Program& p);
bool recording_idle(const Program& p);

// The "FFT Window": opening it, its source and view menus.
void cmd_analyser(Program& p, const ShellMessage& m);

// MIDI: the internal synthesiser and its SoundFont, the ports, notes from the input.
void cmd_internal_synth(Program& p, const ShellMessage& m);
void cmd_choose_soundfont(Program& p, const ShellMessage& m);
void cmd_soundfont_chosen(Program& p, const ShellMessage& m);
void cmd_midi_port(Program& p, const ShellMessage& m);
void cmd_midi_port_lost(Program& p, const ShellMessage& m);
void cmd_midi_note(Program& p, const ShellMessage& m);
bool internal_synth_open(const Program& p);
// The editor's two MIDI range fields: the names of note - 36 (not below 0) and of that
// value + 60 (not above 127).
struct EditorState;
void setnoteg(EditorState& editor, short note);

// Searches.
void cmd_find_next(Program& p, const ShellMessage& m);
void cmd_replace_all(Program& p, const ShellMessage& m);
// Replaces the hit under the cursor, if it is on one, then finds the next.
void cmd_replace_one(Program& p, const ShellMessage& m);
void cmd_find_unused_instruments(Program& p, const ShellMessage& m);
void cmd_find_current_instrument(Program& p, const ShellMessage& m);

}  // namespace ondrel
