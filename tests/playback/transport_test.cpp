#include <algorithm>
#include <future>

#include "song_fixture.h"

namespace ondrel {
namespace {

using Transport = test::SongFixture;

TEST_F(Transport, RowsAdvanceEveryTwoSpeedCallsAndPositionsAfterTheLastRow) {
    make_song(2, {0, 1}, {4, 4});
    play();
    EXPECT_STREQ(player.status, "PLAYING ALL");
    calls(11);
    EXPECT_EQ(tr.nopos, 0);
    EXPECT_EQ(tr.notick, 11);
    calls(1);
    EXPECT_EQ(tr.nopos, 1);
    EXPECT_EQ(tr.notick, 0);
    rows(3);
    EXPECT_EQ(tr.nopat, 1);
    EXPECT_EQ(tr.nopos, 0);
    EXPECT_EQ(tr.playing, 1);
}

TEST_F(Transport, SongEndStopsWithoutLoopAndResetsToTheRestart) {
    make_song(1, {0, 1, 0}, {2, 2});
    song().repeat = 1;
    play();
    rows(6);
    EXPECT_EQ(tr.playing, 0);
    EXPECT_EQ(tr.nopat, 1);
    EXPECT_EQ(tr.nopos, 0);
    EXPECT_EQ(window_messages(), std::vector<uint32_t>{kMsgStop});
    calls(5);  // stopped: nothing moves
    EXPECT_EQ(tr.nopat, 1);
    EXPECT_EQ(tr.notick, 0);
}

TEST_F(Transport, SongEndWithLoopGoesOnFromTheRestart) {
    make_song(1, {0, 1, 0}, {2, 2});
    song().repeat = 1;
    tr.floop = 1;
    play();
    rows(6);
    EXPECT_EQ(tr.playing, 1);
    EXPECT_EQ(tr.nopat, 1);
    EXPECT_TRUE(window_messages().empty());
    rows(2);
    EXPECT_EQ(tr.nopat, 2);
}

TEST_F(Transport, PatternModeRepeatsOrStops) {
    make_song(1, {0, 1}, {3, 3});
    tr.floop = 1;
    play(true);
    EXPECT_STREQ(player.status, "PLAYING PATTERN");
    rows(30);
    EXPECT_EQ(tr.nopat, 0);
    EXPECT_EQ(tr.playing, 1);
    tr.floop = 0;
    rows(3);
    EXPECT_EQ(tr.playing, 0);
    EXPECT_EQ(tr.nopat, 0);
    EXPECT_EQ(window_messages(), std::vector<uint32_t>{kMsgStop});
}

TEST_F(Transport, BreakBeyondTheTargetUsesTheRowCountOfThePatternLeft) {
    make_song(1, {0, 1, 2}, {64, 32, 64});
    put(0, 0, 0, 0, 0, 13, 0x50);  // row 50 of a 32-row pattern: kept, as 64 rows are left
    play();
    rows(1);
    EXPECT_EQ(tr.nopat, 1);
    EXPECT_EQ(tr.nopos, 50);
    rows(1);  // leaving pattern 1 (32 rows) at row 51: wraps to the next position
    EXPECT_EQ(tr.nopat, 2);
    EXPECT_EQ(tr.nopos, 0);
}

TEST_F(Transport, BreakPastTheRowsLeftAdvancesOnceMore) {
    make_song(1, {0, 1, 2}, {64, 64, 64});
    put(0, 0, 0, 0, 0, 13, 0x70);  // row 70 exceeds the 64 rows of the pattern being left
    play();
    rows(1);
    EXPECT_EQ(tr.nopat, 2);
    EXPECT_EQ(tr.nopos, 0);
}

TEST_F(Transport, PositionJumpAndPatternBreakDecimalRow) {
    make_song(1, {0, 1, 2, 3});
    put(0, 0, 0, 0, 0, 11, 3);
    play();
    rows(1);
    EXPECT_EQ(tr.nopat, 3);
    EXPECT_EQ(tr.nopos, 0);
    put(3, 0, 0, 0, 0, 13, 0x25);  // read as decimal 25, of the position after the last
    rows(1);
    EXPECT_EQ(tr.nopat, 0);  // past the end: back to the restart, and the song is over
    EXPECT_EQ(tr.nopos, 25);
    EXPECT_EQ(tr.playing, 0);
    put(0, 0, 0, 0, 0, 13, 0x12);
    tr.floop = 1;
    player.start(false);
    tr.nopos = 0;
    rows(1);
    EXPECT_EQ(tr.nopat, 1);
    EXPECT_EQ(tr.nopos, 12);
}

TEST_F(Transport, PatternDelayHoldsTheHalfTickWithoutRetrigger) {
    make_song(1, {0});
    add_sample(1);
    put(0, 0, 0, 48, 1, 14, 0xE2);
    play();
    calls(1);
    EXPECT_EQ(tr.notick, 1);
    EXPECT_EQ(tr.patdelay, 3);
    voice(0).position = 999;  // a retrigger would set it back to 0
    calls(3);                 // notick stays at 1 for 2 x 2 calls in all
    EXPECT_EQ(tr.notick, 1);
    EXPECT_EQ(tr.patdelay, 0);
    calls(10);
    EXPECT_EQ(tr.nopos, 0);
    calls(1);
    EXPECT_EQ(tr.nopos, 1);
    EXPECT_EQ(voice(0).position, 999u);
}

TEST_F(Transport, SpeedOneRunsPerTickCommandsOncePerRow) {
    make_song(1, {0});
    add_sample(1);
    song().speed = 1;
    put(0, 0, 0, 48, 1);
    for (int r = 1; r < 5; ++r) put(0, r, 0, 0, 0, 1, 3);
    play();
    calls(2);
    const float start = voice(0).baseperiod;
    calls(8);
    EXPECT_EQ(tr.nopos, 5);
    EXPECT_FLOAT_EQ(voice(0).baseperiod, start - 12);
}

TEST_F(Transport, DisabledInstrumentSkipsTheCellWithItsCommands) {
    make_song(1, {0});
    add_sample(2);
    song().patflag[1] = 0;
    put(0, 0, 0, 50, 2, 15, 3);
    play();
    calls(1);
    EXPECT_EQ(voice(0).active, 0);
    EXPECT_EQ(song().speed, 6);
    song().patflag[1] = 1;
    player.stoppi();
    play();
    calls(1);
    EXPECT_EQ(voice(0).active, 1);
    EXPECT_EQ(song().speed, 3);
}

TEST_F(Transport, StartTakesTheCursorRowAndStopSilencesEveryVoice) {
    make_song(2, {0});
    add_sample(1);
    put(0, 10, 1, 60, 1);
    player.cursor.poscurv = 10;
    play();
    calls(1);
    EXPECT_EQ(tr.nopos, 10);
    EXPECT_EQ(voice(1).active, 1);
    EXPECT_EQ(player.polytour[1], 0);
    voice(200).active = 1;
    voice(200).block = 3;
    player.polytour[5] = 2;
    player.stoppi();
    EXPECT_EQ(tr.playing, 0);
    EXPECT_STREQ(player.status, "STOPPED");
    for (const Voice& v : player.nlist) {
        EXPECT_EQ(v.active, 0);
        EXPECT_EQ(v.block, 0);
    }
    EXPECT_EQ(player.polytour[5], 0);
    EXPECT_EQ(player.window_posts.size(), 2u);  // 'acti' at start and at stop
    player.stoppi(true);
    EXPECT_STREQ(player.status, "SOUND STOPPED");
}

TEST_F(Transport, StopHandsTheVoiceResetToARunningAudioThread) {
    make_song(1, {0});
    play();
    voice(7).active = 1;
    player.audio_running = true;
    auto stopped = std::async(std::launch::async, [&] { player.stoppi(); });
    // Until the audio side takes the request, the voices are its own and stay as they are.
    EXPECT_EQ(stopped.wait_for(std::chrono::milliseconds(30)), std::future_status::timeout);
    EXPECT_EQ(voice(7).active, 1);
    player.service_audio_requests();
    stopped.wait();
    EXPECT_EQ(voice(7).active, 0);
    EXPECT_EQ(tr.playing, 0);
    player.audio_running = false;
}

TEST_F(Transport, SingleRowPlayStopsAfterOneRow) {
    make_song(1, {0});
    player.cursor.poscurv = 3;
    player.play_line();
    rows(1);
    EXPECT_EQ(tr.playing, 0);
    EXPECT_EQ(tr.fplayline, 0);
    EXPECT_EQ(tr.nopos, 3);
}

TEST_F(Transport, OneNoteAuditionPlaysOnlyTheCursorTrackWhenNotEditing) {
    make_song(3, {0});
    add_sample(1);
    put(0, 0, 0, 48, 1);  // a note on another track of the row
    tr.faccedit = 0;
    player.audition_note({60, 0, 0, 1, 0, 0}, 2);
    calls(1);
    EXPECT_EQ(voice(2).active, 1);
    EXPECT_EQ(voice(2).note, 60);
    EXPECT_EQ(voice(0).active, 0);
    EXPECT_EQ(tr.afpending, 0);
    calls(11);
    EXPECT_EQ(tr.fplayonenote, 0);  // ends with the row
    EXPECT_EQ(tr.nopos, 0);
}

TEST_F(Transport, ChordEntryAuditionReadsTheWholeRow) {
    make_song(3, {0});
    add_sample(1);
    put(0, 0, 0, 48, 1);
    tr.faccedit = 1;
    player.audition_note({60, 0, 0, 1, 0, 0}, 2);
    calls(1);
    EXPECT_EQ(voice(2).active, 1);
    EXPECT_EQ(voice(0).active, 1);
}

TEST_F(Transport, TrackAuditionReadsOneTrackAndStaysOnItsPosition) {
    make_song(2, {0, 1}, {2, 2});
    add_sample(1);
    put(1, 0, 0, 48, 1);
    put(1, 0, 1, 50, 1);
    player.audition_track(1, 1);
    calls(1);
    EXPECT_EQ(voice(1).active, 1);
    EXPECT_EQ(voice(0).active, 0);
    rows(5);
    EXPECT_EQ(tr.nopat, 0);
    EXPECT_EQ(tr.nopatplaytrack, 1);
    EXPECT_EQ(tr.playing, 1);
}

TEST_F(Transport, MetersRiseOnNotesAndFallOneACall) {
    make_song(2, {0});
    add_sample(1);
    put(0, 0, 1, 48, 1);
    play();
    calls(1);
    EXPECT_EQ(tr.valvu[1].load(), 128.0f);
    calls(10);
    EXPECT_EQ(tr.valvu[1].load(), 118.0f);
    calls(200);
    EXPECT_EQ(tr.valvu[1].load(), 0.0f);
}

TEST_F(Transport, EditCursorJumpsWrapToTheNextPosition) {
    make_song(1, {0, 1}, {8, 8});
    player.cursor.poscurv = 6;
    player.jump(4, false);
    EXPECT_EQ(player.cursor.poscurv, 2);
    EXPECT_EQ(tr.nopat, 1);
    player.cursor.poscurv = 7;
    player.jump(1, true);
    EXPECT_EQ(player.cursor.poscurv, 0);
    EXPECT_EQ(tr.nopat, 1);
    player.jump(1, false, true);  // Control: next position only, 0 after the last
    EXPECT_EQ(tr.nopat, 0);
    EXPECT_EQ(player.cursor.poscurv, 0);
    EXPECT_EQ(std::count_if(player.window_posts.begin(), player.window_posts.end(),
                            [](const Message& m) { return m.code == kMsgDoup; }),
              2);
}

TEST_F(Transport, ColumnMappingSkipsHiddenTracksAndNextCellSearch) {
    player.cursor.fshadow[1] = 1;
    EXPECT_EQ(player.fan(0), 0);
    EXPECT_EQ(player.fan(1), 2);
    EXPECT_EQ(player.fun(2), 1);
    EXPECT_EQ(player.fun(1), -1);
    TNOTE column[8]{};
    column[5].parameter = 1;
    EXPECT_EQ(Player::prochain(column, 0, 8), 5);
    EXPECT_EQ(Player::prochain(column, 5, 8), 5);
    EXPECT_EQ(Player::prochain(column, 6, 8), 8);
}

TEST_F(Transport, SongRowsAreSummedOverTheSequence) {
    make_song(1, {0, 1, 1}, {10, 20});
    EXPECT_EQ(player.dopatend(), 50);
    EXPECT_EQ(tr.patend, 3);
}

}  // namespace
}  // namespace ondrel
