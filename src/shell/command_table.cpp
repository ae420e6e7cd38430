#include "shell/command_table.h"

#include <array>
#include <string>

#include "shell/command_handlers.h"
#include "shell/program.h"

namespace ondrel {

namespace {

constexpr KeyChord kNoKey{};

bool can_undo(const Program& p) {
    return p.history().can_undo();
}
bool can_redo(const Program& p) {
    return p.history().can_redo();
}
bool has_browser(const Program& p) {
    return p.browser != nullptr;
}
template <uint32_t Code>
bool browser_shows(const Program& p) {
    return p.browser && p.browser->checked(Code);
}
template <int Kind>
bool envelope_shown(const Program& p) {
    return p.editor.envelope_kind == Kind;
}
bool has_block(const Program& p) {
    return p.editor.block.active;
}
bool has_sound(const Program& p) {
    const p_s* s = p.engine.bank.song_sample(p.engine.player.cursor.cursnd);
    return s && s->data && s->length;
}

// clang-format off
const CommandInfo kCommands[] = {
    // File
    {fourcc("news"), "New Song", Menu::File, nullptr, kNoKey, cmd_new_song},
    {fourcc("OPen"), "Open Song", Menu::File, nullptr, ctrl('o'), cmd_open_song},
    {fourcc("SAve"), "Save Song", Menu::File, nullptr, ctrl('s'), cmd_save_song},
    {fourcc("SAva"), "Save as...", Menu::File, nullptr, ctrl_shift('s'), cmd_save_song_as},
    {fourcc("SAvm"), "Save as Midifile", Menu::File, nullptr, kNoKey, cmd_save_midi},
    {fourcc("SAvs"), "Save Sound", Menu::File, nullptr, kNoKey, cmd_save_sound, has_sound},
    {fourcc("abou"), "About Ondrel Tracker...", Menu::File, nullptr, kNoKey, cmd_about},
    {fourcc("_QRQ"), "Quit", Menu::File, nullptr, ctrl('q'), cmd_quit},
    // Edit
    {fourcc("UNDO"), "Undo", Menu::Edit, nullptr, ctrl('z'), cmd_undo, can_undo},
    {fourcc("REDO"), "Redo", Menu::Edit, nullptr, ctrl('y'), cmd_redo, can_redo},
    {fourcc("REDO"), "Redo", Menu::None, nullptr, ctrl_shift('z'), cmd_redo, can_redo},
    {fourcc("EDmd"), "Edit Mode", Menu::Edit, nullptr, plain(kKeySpace), cmd_edit_mode,
     nullptr, [](const Program& p) { return p.editor.edit_mode; }},
    {fourcc("Bcut"), "Cut Block", Menu::Edit, "Block", alt('x'), cmd_cut_cells, has_block},
    {fourcc("Bcpy"), "Copy Block", Menu::Edit, "Block", alt('c'), cmd_copy_cells, has_block},
    {fourcc("Bcpy"), "Copy Block", Menu::None, nullptr, ctrl('c'), cmd_copy_cells, has_block},
    {fourcc("Bpas"), "Paste Block", Menu::Edit, "Block", alt('v'), cmd_paste_cells},
    {fourcc("Bmix"), "Paste Block, Empty Cells Only", Menu::Edit, "Block", alt('m'), cmd_paste_cells},
    {fourcc("Bclr"), "Clear Block", Menu::Edit, "Block", alt(kKeyDelete), cmd_clear_cells, has_block},
    {fourcc("XPsu"), "Semitone Up", Menu::Edit, "Transpose", ctrl(kKeyUp), cmd_transpose},
    {fourcc("XPsd"), "Semitone Down", Menu::Edit, "Transpose", ctrl(kKeyDown), cmd_transpose},
    {fourcc("XPou"), "Octave Up", Menu::Edit, "Transpose", ctrl_shift(kKeyUp), cmd_transpose},
    {fourcc("XPod"), "Octave Down", Menu::Edit, "Transpose", ctrl_shift(kKeyDown), cmd_transpose},
    {fourcc("XPdl"), "Transpose...", Menu::Edit, "Transpose", kNoKey, cmd_open_window},
    {fourcc("XPrn"), "Transpose a range", Menu::None, nullptr, kNoKey, cmd_transpose},
    {fourcc("Srch"), "Find and Replace...", Menu::Edit, nullptr, ctrl('f'), cmd_open_window},
    {fourcc("Sfnd"), "Find Next", Menu::Edit, nullptr, plain(kKeyF1 + 2), cmd_find_next},
    {fourcc("Srpl"), "Replace All", Menu::Edit, nullptr, kNoKey, cmd_replace_all},
    {fourcc("Srp1"), "Replace", Menu::None, nullptr, kNoKey, cmd_replace_one},
    // Pattern and track
    {fourcc("Pclr"), "Pattern Clear", Menu::Pattern, nullptr, kNoKey, cmd_clear_cells},
    {fourcc("Pcut"), "Pattern Cut", Menu::Pattern, nullptr, ctrl('x'), cmd_cut_cells},
    {fourcc("Pcpy"), "Pattern Copy", Menu::Pattern, nullptr, kNoKey, cmd_copy_cells},
    {fourcc("Ppas"), "Pattern Paste", Menu::Pattern, nullptr, ctrl('v'), cmd_paste_cells},
    {fourcc("Tclr"), "Track Clear", Menu::Pattern, nullptr, kNoKey, cmd_clear_cells},
    {fourcc("Tcut"), "Track Cut", Menu::Pattern, nullptr, ctrl_shift('x'), cmd_cut_cells},
    {fourcc("Tcpy"), "Track Copy", Menu::Pattern, nullptr, kNoKey, cmd_copy_cells},
    {fourcc("Tpas"), "Track Paste", Menu::Pattern, nullptr, ctrl_shift('v'), cmd_paste_cells},
    // Positions
    {fourcc("Tplu"), "Next Pos", Menu::Position, nullptr, kNoKey, cmd_next_position},
    {fourcc("Tmoi"), "Prev Pos", Menu::Position, nullptr, kNoKey, cmd_previous_position},
    {fourcc("Tdel"), "Pos Delete", Menu::Position, nullptr, kNoKey, cmd_delete_position},
    {fourcc("Tins"), "Pos Insert", Menu::Position, nullptr, kNoKey, cmd_insert_position},
    {fourcc("Tnpt"), "New Pattern", Menu::Position, nullptr, kNoKey, cmd_new_pattern},
    {fourcc("Tppt"), "Next position & New Pattern", Menu::Position, nullptr, kNoKey, cmd_next_position_new_pattern},
    {fourcc("Trpt"), "Remove Pattern", Menu::Position, nullptr, kNoKey, cmd_remove_pattern},
    // Jump step
    {fourcc("J001"), "Jump 1 line", Menu::Pattern, "Jump", ctrl('1'), cmd_jump_step, nullptr,
     [](const Program& p) { return p.engine.player.cursor.jumpstep == 1; }},
    {fourcc("J002"), "Jump 2 lines", Menu::Pattern, "Jump", ctrl('2'), cmd_jump_step, nullptr,
     [](const Program& p) { return p.engine.player.cursor.jumpstep == 2; }},
    {fourcc("J003"), "Jump 3 lines", Menu::Pattern, "Jump", ctrl('3'), cmd_jump_step, nullptr,
     [](const Program& p) { return p.engine.player.cursor.jumpstep == 3; }},
    {fourcc("J004"), "Jump 4 lines", Menu::Pattern, "Jump", ctrl('4'), cmd_jump_step, nullptr,
     [](const Program& p) { return p.engine.player.cursor.jumpstep == 4; }},
    {fourcc("J005"), "Jump 5 lines", Menu::Pattern, "Jump", ctrl('5'), cmd_jump_step, nullptr,
     [](const Program& p) { return p.engine.player.cursor.jumpstep == 5; }},
    {fourcc("J006"), "Jump 6 lines", Menu::Pattern, "Jump", ctrl('6'), cmd_jump_step, nullptr,
     [](const Program& p) { return p.engine.player.cursor.jumpstep == 6; }},
    {fourcc("J007"), "Jump 7 lines", Menu::Pattern, "Jump", ctrl('7'), cmd_jump_step, nullptr,
     [](const Program& p) { return p.engine.player.cursor.jumpstep == 7; }},
    {fourcc("J008"), "Jump 8 lines", Menu::Pattern, "Jump", ctrl('8'), cmd_jump_step, nullptr,
     [](const Program& p) { return p.engine.player.cursor.jumpstep == 8; }},
    // Song-wide
    {fourcc("Rsnd"), "Remove Sounds", Menu::Song, nullptr, kNoKey, cmd_remove_from_song},
    {fourcc("Rseq"), "Remove Sequence", Menu::Song, nullptr, kNoKey, cmd_remove_from_song},
    {fourcc("Rall"), "Remove All", Menu::Song, nullptr, kNoKey, cmd_remove_from_song},
    {fourcc("FIIT"), "Find instruments not used in the music", Menu::Song, nullptr, kNoKey, cmd_find_unused_instruments},
    {fourcc("CUIT"), "Find current instrument", Menu::Song, nullptr, kNoKey, cmd_find_current_instrument},
    // Windows
    {fourcc("wmed"), "Documentation", Menu::Windows, nullptr, kNoKey, cmd_documentation},
    {fourcc("itli"), "Instrument List", Menu::Windows, nullptr, kNoKey, cmd_open_window},
    {fourcc("arra"), "Arrangement", Menu::Windows, nullptr, kNoKey, cmd_open_window},
    {fourcc("wfft"), "FFT Window", Menu::Windows, nullptr, kNoKey, cmd_analyser},
    // Songs in memory
    {fourcc("MulL"), "Multiple Music Loading", Menu::Music, nullptr, kNoKey, cmd_multiple_loading, nullptr,
     [](const Program& p) { return p.engine.bank.fmulload != 0; }},
    {fourcc("kiLL"), "Kill current Music", Menu::Music, nullptr, kNoKey, cmd_kill_song},
    {fourcc("NEWM"), "New Music", Menu::Music, nullptr, kNoKey, cmd_new_music},
    {fourcc("ZI00"), "No name", Menu::Music, nullptr, kNoKey, cmd_select_song, nullptr, nullptr,
     kMaxSongMenuItems},
    // Options
    {fourcc("GOte"), "Tempo", Menu::Options, nullptr, kNoKey, cmd_tempo_option, nullptr,
     [](const Program& p) { return p.engine.mixer.ftemp != 0; }},
    {fourcc("Mfil"), "File Mode", Menu::Options, "Play Mode", kNoKey, cmd_pan_mode, nullptr,
     [](const Program& p) { return p.engine.bank.current().mode == p.engine.bank.current().format; }},
    {fourcc("Mami"), "Amiga Mode", Menu::Options, "Play Mode", kNoKey, cmd_pan_mode, nullptr,
     [](const Program& p) { return p.engine.bank.current().mode == 1; }},
    {fourcc("Mler"), "L&R Mode", Menu::Options, "Play Mode", kNoKey, cmd_pan_mode, nullptr,
     [](const Program& p) { return p.engine.bank.current().mode == 3; }},
    {fourcc("Mpan"), "Panoramic Mode", Menu::Options, "Play Mode", kNoKey, cmd_pan_mode, nullptr,
     [](const Program& p) { return p.engine.bank.current().mode == 2; }},
    {fourcc("Mnor"), "Normal", Menu::Options, "Sound Quality", kNoKey, cmd_sound_quality, nullptr,
     [](const Program& p) { return p.engine.mixer.qual == 0; }},
    {fourcc("Mint"), "Interpolation", Menu::Options, "Sound Quality", kNoKey, cmd_sound_quality, nullptr,
     [](const Program& p) { return p.engine.mixer.qual == 1; }},
    {fourcc("full"), "Full Screen", Menu::Options, nullptr, kNoKey, cmd_full_screen, nullptr,
     [](const Program& p) { return p.windows.full_screen; }},
    {fourcc("vuvu"), "Vumeter", Menu::Options, nullptr, kNoKey, cmd_vumeter, nullptr,
     [](const Program& p) { return p.engine.player.tr.fvuvu != 0; }},
    {fourcc("accd"), "Accord Edit", Menu::Options, nullptr, kNoKey, cmd_chord_entry, nullptr,
     [](const Program& p) { return p.engine.player.tr.faccedit != 0; }},
    {fourcc("ATRI"), "Atari", Menu::Options, nullptr, kNoKey, cmd_keyboard_layout, nullptr,
     [](const Program& p) { return p.editor.layout == KeyboardLayout::Atari; }},
    {fourcc("AMIG"), "Amiga", Menu::Options, nullptr, kNoKey, cmd_keyboard_layout, nullptr,
     [](const Program& p) { return p.editor.layout == KeyboardLayout::Amiga; }},
    // MIDI
    {fourcc("MSYN"), "Internal Midi Synth", Menu::Midi, nullptr, kNoKey, cmd_internal_synth, nullptr,
     internal_synth_open},
    {fourcc("MSF2"), "Choose SoundFont...", Menu::Midi, nullptr, kNoKey, cmd_choose_soundfont},
    {fourcc("MPRT"), "Midi Ports...", Menu::Midi, nullptr, kNoKey, cmd_open_window},
    {fourcc("SMch"), "Set Midi chanel", Menu::Midi, nullptr, kNoKey, cmd_open_window},
    // The transport buttons and keys
    {fourcc("PLsg"), "Play Song", Menu::None, nullptr, plain(kKeyF1 + 4), cmd_play_song},
    {fourcc("PLpt"), "Play Pattern", Menu::None, nullptr, plain(kKeyF1 + 5), cmd_play_pattern},
    {fourcc("PLst"), "Stop", Menu::None, nullptr, plain(kKeyF1 + 7), cmd_stop},
    {fourcc("PLlp"), "loop", Menu::None, nullptr, kNoKey, cmd_loop, nullptr,
     [](const Program& p) { return p.engine.player.tr.floop != 0; }},
    {fourcc("MUTE"), "Mute track", Menu::None, nullptr, kNoKey, cmd_mute_track},
    {fourcc("CUto"), "Move the cursor", Menu::None, nullptr, kNoKey, cmd_cursor_to},
    {fourcc("BLck"), "Mark a block", Menu::None, nullptr, kNoKey, cmd_mark_block},
    // The panes' and windows' settings
    {fourcc("SGnm"), "Song name", Menu::None, nullptr, kNoKey, cmd_song_setting},
    {fourcc("SGtp"), "Tempo (BPM)", Menu::None, nullptr, kNoKey, cmd_song_setting},
    {fourcc("SGsp"), "Speed", Menu::None, nullptr, kNoKey, cmd_song_setting},
    {fourcc("SGvl"), "Master volume", Menu::None, nullptr, kNoKey, cmd_song_setting},
    {fourcc("SGrw"), "Pattern rows", Menu::None, nullptr, kNoKey, cmd_song_setting},
    {fourcc("SGtr"), "Tracks", Menu::None, nullptr, kNoKey, cmd_song_setting},
    {fourcc("TKvc"), "Track voices", Menu::None, nullptr, kNoKey, cmd_track_setting},
    {fourcc("TKpn"), "Track pan", Menu::None, nullptr, kNoKey, cmd_track_setting},
    {fourcc("TKvl"), "Track volume", Menu::None, nullptr, kNoKey, cmd_track_setting},
    {fourcc("TKmc"), "Track MIDI channel", Menu::None, nullptr, kNoKey, cmd_track_setting},
    {fourcc("ILsl"), "Choose instrument", Menu::None, nullptr, kNoKey, cmd_instrument},
    {fourcc("ILnm"), "Rename instrument", Menu::None, nullptr, kNoKey, cmd_instrument},
    {fourcc("ARsl"), "Choose position", Menu::None, nullptr, kNoKey, cmd_arrangement},
    {fourcc("ARdu"), "Duplicate position", Menu::None, nullptr, kNoKey, cmd_arrangement},
    {fourcc("ARmv"), "Move position", Menu::None, nullptr, kNoKey, cmd_arrangement},
    {fourcc("ARpt"), "Position pattern", Menu::None, nullptr, kNoKey, cmd_arrangement},
    {fourcc("ARrp"), "Repeat position", Menu::None, nullptr, kNoKey, cmd_arrangement},
    // Between windows and threads
    {fourcc("refs"), "Open files", Menu::None, nullptr, kNoKey, cmd_open_files},
    {fourcc("SAvt"), "Save song to file", Menu::None, nullptr, kNoKey, cmd_save_song_to},
    {fourcc("SSvt"), "Save sound to file", Menu::None, nullptr, kNoKey, cmd_save_sound_to},
    {fourcc("SMvt"), "Save MIDI file to file", Menu::None, nullptr, kNoKey, cmd_save_midi_to},
    {fourcc("stop"), "Song ended", Menu::None, nullptr, kNoKey, cmd_song_ended},
    {fourcc("acti"), "Play started or stopped", Menu::None, nullptr, kNoKey, cmd_arrangement_follow},
    {fourcc("doup"), "Cursor jumped", Menu::None, nullptr, kNoKey, cmd_arrangement_follow},
    {fourcc("midi"), "MIDI note", Menu::None, nullptr, kNoKey, cmd_midi_note},
    {fourcc("MLST"), "MIDI output lost", Menu::None, nullptr, kNoKey, cmd_midi_port_lost},
    {fourcc("MSFt"), "SoundFont chosen", Menu::None, nullptr, kNoKey, cmd_soundfont_chosen},
    {fourcc("MOsl"), "Choose MIDI output", Menu::None, nullptr, kNoKey, cmd_midi_port},
    {fourcc("MIsl"), "Choose MIDI input", Menu::None, nullptr, kNoKey, cmd_midi_port},
    {fourcc("moni"), "Monitor", Menu::None, nullptr, kNoKey, cmd_monitor, can_monitor},
    {fourcc("reco"), "Record", Menu::None, nullptr, kNoKey, cmd_record, can_record},
    {fourcc("stre"), "Stop recording", Menu::None, nullptr, kNoKey, cmd_stop_recording, can_stop_recording},
    // The recording panel
    {fourcc("RCsr"), "Record the song's output", Menu::None, nullptr, kNoKey, cmd_recording_setting, recording_idle},
    {fourcc("RCin"), "Input:", Menu::None, nullptr, kNoKey, cmd_recording_setting, recording_idle},
    {fourcc("RCfm"), "Recording format", Menu::None, nullptr, kNoKey, cmd_recording_setting, recording_idle},
    {fourcc("RCds"), "D2D File", Menu::None, nullptr, kNoKey, cmd_recording_setting, recording_idle},
    {fourcc("RCgn"), "Recording gain", Menu::None, nullptr, kNoKey, cmd_recording_setting},
    {fourcc("RCch"), "Choose the recording file", Menu::None, nullptr, kNoKey, cmd_choose_recording_file, recording_idle},
    {fourcc("RCfl"), "Record to file", Menu::None, nullptr, kNoKey, cmd_recording_file_chosen},
    // The file browser
    // Directory items carry 'GO00' + the number added before them, and the index of the
    // item in the menu, which tells them apart from the fixed items.
    {fourcc("GO00"), "Add Path To music", Menu::BrowserPaths, nullptr, kNoKey, cmd_paths_item, nullptr, nullptr,
     kMaxPathsMenuItems},
    {fourcc("GO01"), "Add Path To sound", Menu::BrowserPaths, nullptr, kNoKey, cmd_paths_item},
    {fourcc("GO02"), "Remove path", Menu::BrowserPaths, nullptr, kNoKey, cmd_paths_item},
    {fourcc("seea"), "See All Files", Menu::Browser, nullptr, kNoKey, cmd_browser_menu, has_browser,
     browser_shows<fourcc("seea")>},
    {fourcc("seed"), "See All Directory", Menu::Browser, nullptr, kNoKey, cmd_browser_menu, has_browser,
     browser_shows<fourcc("seed")>},
    {fourcc("see1"), "See Directory with audio sound level 1", Menu::Browser, nullptr, kNoKey, cmd_browser_menu,
     has_browser, browser_shows<fourcc("see1")>},
    {fourcc("seeA"), "See Directory with audio sound all levels", Menu::Browser, nullptr, kNoKey, cmd_browser_menu,
     has_browser, browser_shows<fourcc("seeA")>},
    {fourcc("find"), "Find all audio files", Menu::Browser, nullptr, kNoKey, cmd_browser_menu, has_browser},
    {fourcc("NDMN"), "Refresh", Menu::Browser, nullptr, kNoKey, cmd_browser_menu, has_browser},
    {fourcc("abou"), "About...", Menu::Browser, nullptr, kNoKey, cmd_about},
    {fourcc("BRgo"), "Go to a directory", Menu::None, nullptr, kNoKey, cmd_browser_go, has_browser},
    {fourcc("PRVw"), "Preview a sound", Menu::None, nullptr, kNoKey, cmd_preview_sound},
    // The instrument editor's envelope selector
    {fourcc("co00"), "Velocity", Menu::Envelope, nullptr, kNoKey, cmd_envelope, nullptr, envelope_shown<0>},
    {fourcc("co01"), "Efx Env", Menu::Envelope, nullptr, kNoKey, cmd_envelope, nullptr, envelope_shown<1>},
    {fourcc("co02"), "Panoramic", Menu::Envelope, nullptr, kNoKey, cmd_envelope, nullptr, envelope_shown<2>},
    {fourcc("co03"), "Coarse tune", Menu::Envelope, nullptr, kNoKey, cmd_envelope, nullptr, envelope_shown<3>},
    {fourcc("co04"), "Velocity off", Menu::Envelope, nullptr, kNoKey, cmd_envelope, nullptr, envelope_shown<4>},
    {fourcc("ENpt"), "Envelope point", Menu::None, nullptr, kNoKey, cmd_envelope},
    {fourcc("ENon"), "Envelope on or off", Menu::None, nullptr, kNoKey, cmd_envelope},
    // The instrument and sample editors
    {fourcc("SNnm"), "Sound name", Menu::None, nullptr, kNoKey, cmd_sound_field},
    {fourcc("SNvl"), "Sound volume", Menu::None, nullptr, kNoKey, cmd_sound_field},
    {fourcc("SNft"), "Finetune", Menu::None, nullptr, kNoKey, cmd_sound_field},
    {fourcc("SNrn"), "Reference note", Menu::None, nullptr, kNoKey, cmd_sound_field},
    {fourcc("SNrt"), "Rate", Menu::None, nullptr, kNoKey, cmd_sound_field},
    {fourcc("SNlp"), "Loop", Menu::None, nullptr, kNoKey, cmd_sound_field},
    {fourcc("SNtl"), "Sound tool", Menu::None, nullptr, kNoKey, cmd_sound_tool},
    {fourcc("SNcp"), "Copy frames", Menu::None, nullptr, kNoKey, cmd_sound_frames},
    {fourcc("SNct"), "Cut frames", Menu::None, nullptr, kNoKey, cmd_sound_frames},
    {fourcc("SNpa"), "Paste frames", Menu::None, nullptr, kNoKey, cmd_sound_frames},
    {fourcc("SNcr"), "Crop", Menu::None, nullptr, kNoKey, cmd_sound_frames},
    {fourcc("SNsi"), "Silence", Menu::None, nullptr, kNoKey, cmd_sound_frames},
    {fourcc("SNse"), "Select frames", Menu::None, nullptr, kNoKey, cmd_sound_selection},
    {fourcc("SNbk"), "Set a block", Menu::None, nullptr, kNoKey, cmd_sound_block},
    {fourcc("SNbm"), "Move a block", Menu::None, nullptr, kNoKey, cmd_sound_block},
    {fourcc("SNbc"), "Clear a block", Menu::None, nullptr, kNoKey, cmd_sound_block},
    {fourcc("SNpl"), "Play the sound", Menu::None, nullptr, kNoKey, cmd_play_sound},
    // The effect panel and the tracks' effect buttons
    {fourcc("FXsh"), "Show an effect", Menu::None, nullptr, kNoKey, cmd_effect_slot},
    {fourcc("FXcl"), "Clone efx", Menu::None, nullptr, kNoKey, cmd_effect_slot},
    {fourcc("FXrm"), "Remove efx", Menu::None, nullptr, kNoKey, cmd_effect_slot},
    {fourcc("FXdl"), "Echo Delay (ms)", Menu::None, nullptr, kNoKey, cmd_effect_setting},
    {fourcc("FXbp"), "Set To BPM", Menu::None, nullptr, kNoKey, cmd_effect_setting},
    {fourcc("FXfb"), "Feedback", Menu::None, nullptr, kNoKey, cmd_effect_setting},
    {fourcc("FXiv"), "Invert Phase", Menu::None, nullptr, kNoKey, cmd_effect_setting},
    {fourcc("FXap"), "Auto Pan D", Menu::None, nullptr, kNoKey, cmd_effect_setting},
    {fourcc("FXsp"), "Speed", Menu::None, nullptr, kNoKey, cmd_effect_setting},
    {fourcc("FXfq"), "Freq (Hz)", Menu::None, nullptr, kNoKey, cmd_effect_setting},
    {fourcc("FXq "), "Q", Menu::None, nullptr, kNoKey, cmd_effect_setting},
    {fourcc("RVdl"), "Reverb delay", Menu::None, nullptr, kNoKey, cmd_reverb_setting},
    {fourcc("RVgn"), "Reverb gain", Menu::None, nullptr, kNoKey, cmd_reverb_setting},
    {fourcc("RVlp"), "Reverb Lpf", Menu::None, nullptr, kNoKey, cmd_reverb_setting},
    {fourcc("TKf+"), "Next effect slot", Menu::None, nullptr, kNoKey, cmd_track_routing},
    {fourcc("TKf-"), "Previous effect slot", Menu::None, nullptr, kNoKey, cmd_track_routing},
    // The analyser's menus
    {fourcc("FFTs"), "Song", Menu::Analyser, "Source", kNoKey, cmd_analyser, nullptr,
     [](const Program& p) { return p.engine.mixer.f_fftmode == kAnalyseSong; }},
    {fourcc("FFTi"), "Input", Menu::Analyser, "Source", kNoKey, cmd_analyser, nullptr,
     [](const Program& p) { return p.engine.mixer.f_fftmode == kAnalyseInput; }},
    {fourcc("FTv0"), "Classic", Menu::Analyser, "View", kNoKey, cmd_analyser, nullptr,
     [](const Program& p) { return p.analyser.view() == kViewClassic; }},
    {fourcc("FTv1"), "Radar", Menu::Analyser, "View", kNoKey, cmd_analyser, nullptr,
     [](const Program& p) { return p.analyser.view() == kViewRadar; }},
};
// clang-format on

}  // namespace

std::span<const CommandInfo> command_table() {
    return kCommands;
}

const CommandInfo* find_command(uint32_t code) {
    // A code of its own wins over a family that also covers it ('GO01' is both "Add Path
    // To sound" and, as 'GO00' + 1, the second favourite directory).
    for (const CommandInfo& c : kCommands)
        if (code == c.code) return &c;
    for (const CommandInfo& c : kCommands)
        if (code >= c.code && code - c.code < c.family) return &c;
    return nullptr;
}

const CommandInfo* command_for_shortcut(const KeyChord& chord) {
    if (chord.empty()) return nullptr;
    for (const CommandInfo& c : kCommands)
        if (c.shortcut == chord) return &c;
    return nullptr;
}

void run_command(Program& p, const CommandInfo& command, const ShellMessage& message) {
    if (!command.handler) {
        p.say(std::string("\"") + command.label + "\" is not available in this build");
        return;
    }
    if (command.enabled && !command.enabled(p)) return;
    command.handler(p, message);
}

const char* menu_title(Menu menu) {
    switch (menu) {
        case Menu::File: return "File";
        case Menu::Edit: return "Edit";
        case Menu::Pattern: return "Pattern";
        case Menu::Position: return "Position";
        case Menu::Song: return "Song";
        case Menu::Windows: return "Windows";
        case Menu::Music: return "Music";
        case Menu::Options: return "Options";
        case Menu::Midi: return "MIDI";
        case Menu::Browser: return "Browser";
        case Menu::BrowserPaths: return "Paths";
        case Menu::Envelope: return "A.D.S.R.";
        case Menu::Analyser: return "FFT Window";
        case Menu::None: break;
    }
    return "";
}

}  // namespace ondrel
