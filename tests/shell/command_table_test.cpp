// The menu commands: each code with its exact label and shortcut, in menu order, and each
// reaching a handler; the check marks of the pan modes.
#include "shell/command_table.h"

#include <gtest/gtest.h>

#include "shell/program_fixture.h"

namespace ondrel {
namespace {

struct Expected {
    const char* code;
    const char* label;
    KeyChord shortcut;
};

// The menu commands in menu order: the main window's, then the file browser's, the
// envelope selector's and the analyser's.
const Expected kMenuCommands[] = {
    {"news", "New Song", {}},
    {"OPen", "Open Song", ctrl('o')},
    {"SAve", "Save Song", ctrl('s')},
    {"SAva", "Save as...", ctrl_shift('s')},
    {"SAvm", "Save as Midifile", {}},
    {"SAvs", "Save Sound", {}},
    {"abou", "About Ondrel Tracker...", {}},
    {"_QRQ", "Quit", ctrl('q')},
    {"Pclr", "Pattern Clear", {}},
    {"Pcut", "Pattern Cut", ctrl('x')},
    {"Pcpy", "Pattern Copy", {}},
    {"Ppas", "Pattern Paste", ctrl('v')},
    {"Tclr", "Track Clear", {}},
    {"Tcut", "Track Cut", ctrl_shift('x')},
    {"Tcpy", "Track Copy", {}},
    {"Tpas", "Track Paste", ctrl_shift('v')},
    {"Tplu", "Next Pos", {}},
    {"Tmoi", "Prev Pos", {}},
    {"Tdel", "Pos Delete", {}},
    {"Tins", "Pos Insert", {}},
    {"Tnpt", "New Pattern", {}},
    {"Tppt", "Next position & New Pattern", {}},
    {"Trpt", "Remove Pattern", {}},
    {"J001", "Jump 1 line", ctrl('1')},
    {"J002", "Jump 2 lines", ctrl('2')},
    {"J003", "Jump 3 lines", ctrl('3')},
    {"J004", "Jump 4 lines", ctrl('4')},
    {"J005", "Jump 5 lines", ctrl('5')},
    {"J006", "Jump 6 lines", ctrl('6')},
    {"J007", "Jump 7 lines", ctrl('7')},
    {"J008", "Jump 8 lines", ctrl('8')},
    {"Rsnd", "Remove Sounds", {}},
    {"Rseq", "Remove Sequence", {}},
    {"Rall", "Remove All", {}},
    {"FIIT", "Find instruments not used in the music", {}},
    {"CUIT", "Find current instrument", {}},
    {"wmed", "Documentation", {}},
    {"itli", "Instrument List", {}},
    {"arra", "Arrangement", {}},
    {"wfft", "FFT Window", {}},
    {"MulL", "Multiple Music Loading", {}},
    {"kiLL", "Kill current Music", {}},
    {"NEWM", "New Music", {}},
    {"ZI00", "No name", {}},
    {"GOte", "Tempo", {}},
    {"Mfil", "File Mode", {}},
    {"Mami", "Amiga Mode", {}},
    {"Mler", "L&R Mode", {}},
    {"Mpan", "Panoramic Mode", {}},
    {"Mnor", "Normal", {}},
    {"Mint", "Interpolation", {}},
    {"full", "Full Screen", {}},
    {"vuvu", "Vumeter", {}},
    {"accd", "Accord Edit", {}},
    {"ATRI", "Atari", {}},
    {"AMIG", "Amiga", {}},
    {"GO00", "Add Path To music", {}},
    {"GO01", "Add Path To sound", {}},
    {"GO02", "Remove path", {}},
    {"seea", "See All Files", {}},
    {"seed", "See All Directory", {}},
    {"see1", "See Directory with audio sound level 1", {}},
    {"seeA", "See Directory with audio sound all levels", {}},
    {"find", "Find all audio files", {}},
    {"NDMN", "Refresh", {}},
    {"co00", "Velocity", {}},
    {"co01", "Efx Env", {}},
    {"co02", "Panoramic", {}},
    {"co03", "Coarse tune", {}},
    {"co04", "Velocity off", {}},
    {"FFTs", "Song", {}},
    {"FFTi", "Input", {}},
    {"FTv0", "Classic", {}},
    {"FTv1", "Radar", {}},
};

using test::code_of;

TEST(CommandTable, EveryMenuCommandHasItsLabelAndShortcutInMenuOrder) {
    const CommandInfo* last = command_table().data();
    for (const Expected& e : kMenuCommands) {
        SCOPED_TRACE(e.code);
        const CommandInfo* c = find_command(code_of(e.code));
        ASSERT_NE(c, nullptr);
        EXPECT_STREQ(c->label, e.label);
        EXPECT_EQ(c->shortcut, e.shortcut);
        EXPECT_NE(c->menu, Menu::None);
        EXPECT_GE(c, last) << "out of menu order";
        last = c;
    }
}

// A shortcut finding its own command is one no other command shares.
TEST(CommandTable, EveryCommandReachesAHandlerAndItsShortcutFindsIt) {
    for (const CommandInfo& c : command_table()) {
        SCOPED_TRACE(c.label);
        EXPECT_NE(c.handler, nullptr);
        EXPECT_TRUE(c.shortcut.empty() || command_for_shortcut(c.shortcut) == &c);
    }
}

int handled = 0;
void count_handled(Program&, const ShellMessage&) {
    ++handled;
}

TEST(CommandTable, ACommandRunsOnlyWhenItCanAndOneWithoutAHandlerSaysSo) {
    struct Case {
        CommandHandler handler;
        CommandTest enabled;
        int runs;
        const char* said;
    };
    const Case cases[] = {
        {count_handled, nullptr, 1, ""},
        {count_handled, [](const Program&) { return true; }, 1, ""},
        {count_handled, [](const Program&) { return false; }, 0, ""},
        {nullptr, nullptr, 0, "\"Try me\" is not available in this build"},
        {nullptr, [](const Program&) { return true; }, 0, "\"Try me\" is not available in this build"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.said);
        Program p;
        handled = 0;
        const CommandInfo command{code_of("tRYm"), "Try me", Menu::None, nullptr, {}, c.handler, c.enabled};
        run_command(p, command, ShellMessage(command.code));
        EXPECT_EQ(handled, c.runs);
        EXPECT_EQ(p.last_said(), c.said);
    }
}

TEST(CommandTable, OnePanModeShowsItsMarkAndFileModeWhenTheModeIsTheFilesOwn) {
    struct Case {
        int16_t format;  // 1 MOD, 2 S3M, 0 a new song
        const char* chosen;
        const char* marked;  // the pan modes with a check mark, in menu order
    };
    const Case cases[] = {
        {1, "Mfil", "Mfil Mami "}, {2, "Mfil", "Mfil Mpan "}, {0, "Mfil", "Mfil "},
        {1, "Mpan", "Mpan "},      {2, "Mler", "Mler "},      {2, "Mami", "Mami "},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(std::string(c.chosen) + " of format " + std::to_string(c.format));
        Program p;
        p.engine.bank.current().format = c.format;
        test::run(p, c.chosen);
        std::string marked;
        for (const char* mode : {"Mfil", "Mami", "Mler", "Mpan"}) {
            const CommandInfo* command = find_command(code_of(mode));
            ASSERT_NE(command->checked, nullptr);
            if (command->checked(p)) marked += std::string(mode) + " ";
        }
        EXPECT_EQ(marked, c.marked);
    }
}

TEST(CommandTable, TheSongMenuCoversEverySongSlot) {
    EXPECT_EQ(find_command(code_of("ZI00") + 62), find_command(code_of("ZI00")));
    EXPECT_EQ(find_command(code_of("ZI00") + 63), nullptr);
}

}  // namespace
}  // namespace ondrel
