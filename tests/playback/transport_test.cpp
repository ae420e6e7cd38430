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

TEST_F(Transport, SongEndStopsOrGoesOnFromTheRestart) {
    for (int loop : {0, 1}) {
        make_song(1, {0, 1, 0}, {2, 2});
        song().repeat = 1;
        tr.floop = static_cast<uint8_t>(loop);
        tr.nopat = 0;
        play();
        rows(6);
        EXPECT_EQ(tr.playing, loop);
        EXPECT_EQ(tr.nopat, 1);
        EXPECT_EQ(tr.nopos, 0);
        EXPECT_EQ(window_messages().size(), loop ? 0u : 1u);
        rows(2);  // stopped: nothing moves
        EXPECT_EQ(tr.nopat, loop ? 2 : 1);
        player.stoppi();
    }
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

TEST_F(Transport, JumpsAndBreaks) {
    struct Case {
        const char* what;
        std::vector<int> rows;  // of patterns 0, 1, 2, 3, played in order
        int command, parameter, played_rows, nopat, nopos, playing;
    };
    const std::vector<int> short1 = {64, 32, 64, 64}, even = {64, 64, 64, 64};
    const Case cases[] = {
        {"break to row 50 of a 32-row pattern: kept, 64 are left", short1, 13, 0x50, 1, 1, 50, 1},
        {"and leaving it at row 51 wraps to the next position", short1, 13, 0x50, 2, 2, 0, 1},
        {"break past the rows of the pattern left: one more", even, 13, 0x70, 1, 2, 0, 1},
        {"the break row is decimal", even, 13, 0x12, 1, 1, 12, 1},
        {"position jump", even, 11, 3, 1, 3, 0, 1},
        {"jump past the end plays on there", even, 11, 9, 1, 9, 0, 1},
        {"and the song ends when its row wraps", even, 11, 9, 65, 0, 0, 0},
    };
    for (const Case& c : cases) {
        make_song(1, {0, 1, 2, 3}, c.rows);
        song().sequence[9] = 1;  // what the jump past the end finds there
        put(0, 0, 0, 0, 0, c.command, c.parameter);
        tr.nopat = 0;
        play();
        rows(c.played_rows);
        EXPECT_EQ(tr.nopat, c.nopat) << c.what;
        EXPECT_EQ(tr.nopos, c.nopos) << c.what;
        EXPECT_EQ(tr.playing, c.playing) << c.what;
        player.stoppi();
    }
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
    put(0, 0, 0, 50, 2, 15, 3);
    for (int enabled : {0, 1}) {
        song().patflag[1] = static_cast<uint8_t>(enabled);
        play();
        calls(1);
        EXPECT_EQ(voice(0).active, enabled);
        EXPECT_EQ(song().speed, enabled ? 3 : 6);
        player.stoppi();
    }
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

TEST_F(Transport, SingleRowAndAuditions) {
    make_song(3, {0, 1}, {8, 2});
    add_sample(1);
    player.cursor.poscurv = 3;
    player.play_line();
    rows(1);
    EXPECT_EQ(tr.playing, 0);
    EXPECT_EQ(tr.fplayline, 0);
    EXPECT_EQ(tr.nopos, 3);

    // One note: only the cursor track when not editing, the whole row when entering chords.
    put(0, 0, 0, 48, 1);
    for (int chord : {0, 1}) {
        tr.nopos = 0;
        voice(0).active = voice(2).active = 0;
        tr.faccedit = static_cast<uint8_t>(chord);
        player.audition_note({60, 0, 0, 1, 0, 0}, 2);
        calls(1);
        EXPECT_EQ(voice(2).note, 60);
        EXPECT_EQ(voice(0).active, chord);
        EXPECT_EQ(tr.afpending, 0);
        calls(11);
        EXPECT_EQ(tr.fplayonenote, 0);  // ends with the row
        EXPECT_EQ(tr.nopos, 0);
    }

    // One track of one position, which it stays on and writes to nopat; the rows counted
    // are those of nopat's pattern.
    put(1, 1, 0, 48, 1);
    put(1, 1, 1, 50, 1);
    voice(0).active = 0;
    player.cursor.poscurv = 1;
    ASSERT_EQ(tr.nopat, 0);
    player.audition_track(1, 1);
    calls(1);
    EXPECT_EQ(voice(1).active, 1);
    EXPECT_EQ(voice(0).active, 0);
    calls(11);
    EXPECT_EQ(tr.nopat, 1);
    EXPECT_EQ(tr.nopos, 2);  // position 0's 8 rows, not the 2 of the one auditioned
    rows(1);
    EXPECT_EQ(tr.nopos, 0);
    rows(5);
    EXPECT_EQ(tr.nopat, 1);
    EXPECT_EQ(tr.nopos, 1);
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

TEST_F(Transport, EditCursorAndColumns) {
    make_song(1, {0, 1, 1}, {8, 20});
    EXPECT_EQ(player.dopatend(), 48);
    EXPECT_EQ(tr.patend, 3);
    player.cursor.poscurv = 6;
    player.jump(4, false);  // wraps into the next position
    EXPECT_EQ(player.cursor.poscurv, 2);
    EXPECT_EQ(tr.nopat, 1);
    player.jump(1, false, true);  // Control: the next position only
    EXPECT_EQ(tr.nopat, 2);
    player.jump(1, false, true);  // 0 after the last
    EXPECT_EQ(tr.nopat, 0);
    player.cursor.poscurv = 7;
    player.jump(1, true);  // stays on its position
    EXPECT_EQ(player.cursor.poscurv, 0);
    EXPECT_EQ(tr.nopat, 0);
    EXPECT_EQ(std::count_if(player.window_posts.begin(), player.window_posts.end(),
                            [](const Message& m) { return m.code == kMsgDoup; }),
              3);

    player.cursor.fshadow[1] = 1;  // hidden track
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

}  // namespace
}  // namespace ondrel
