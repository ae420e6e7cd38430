#include <gtest/gtest.h>

#include "engine/engine.h"

namespace ondrel {
namespace {

class Rack : public ::testing::Test {
protected:
    Engine engine;
    EffectRack& rack = engine.rack;
    TMOD& song() { return engine.bank.current(); }
};

TEST_F(Rack, TheListClonesAndRefusalsWithTheirReasons) {
    const auto list = rack.list();
    ASSERT_EQ(list.size(), 10u);
    EXPECT_EQ(list[0], (std::pair<int, std::string>{1, "(01) Low Pass Filter (FIR)"}));
    EXPECT_EQ(list[9], (std::pair<int, std::string>{17, "(17) High Pass Filter (IIR type 2)"}));
    const int s = rack.clone(11);
    EXPECT_EQ(s, 20);
    EXPECT_EQ(rack.label(20), "(20) Echo, Delay");
    EXPECT_EQ(rack.list().back().first, 20);
    ASSERT_TRUE(rack.remove(20));
    EXPECT_EQ(rack.clone(12), -1);
    EXPECT_EQ(rack.clone(5), -1);
    EXPECT_EQ(rack.clone(10), -1);
    EXPECT_FALSE(rack.remove(11));
    const auto& shown = engine.alert_log.shown;
    ASSERT_EQ(shown.size(), 4u);
    EXPECT_EQ(shown[0].text, "You don't need to clone Efx 12");
    EXPECT_EQ(shown[0].buttons, std::vector<std::string>{"ok !!"});
    EXPECT_EQ(shown[1].text, "You can't clone these Efx");
    EXPECT_EQ(shown[2].buttons, std::vector<std::string>{"why ?"});
    EXPECT_EQ(shown[3].text, "You can't remove a basic Efx, only cloned efx !!");
    EXPECT_EQ(shown[3].buttons, std::vector<std::string>{"ah ah !"});
    EXPECT_EQ(rack.list().size(), 10u);
}

TEST_F(Rack, EchoClonesStopAtFifteenAndRemovalUnroutesTracks) {
    for (int i = 0; i < 15; ++i) EXPECT_EQ(rack.clone(11), 20 + i);
    EXPECT_EQ(rack.clone(11), -1);
    EXPECT_EQ(engine.alert_log.shown.size(), 0u);  // no message
    EXPECT_EQ(rack.clone(16), 35);                 // other units still clone
    song().tracke[4] = 35;
    EXPECT_TRUE(rack.remove(35));
    EXPECT_EQ(song().tracke[4], 0);
    EXPECT_EQ(engine.slots.efxtype[35], 0);
}

TEST_F(Rack, RoutingWalksUpFrom99AndDownFrom1) {
    engine.slots.efxtype[99] = 1;  // a clone in the last slot
    song().tracke[2] = 99;
    EXPECT_EQ(rack.mnplusefx(2), 1);
    EXPECT_EQ(song().tracke[2], 1);
    EXPECT_EQ(engine.player.efxaffiche[2], 1);
    // Down from 1: slot 0 has no unit, so the walk goes on at 98, passing 99 by.
    EXPECT_EQ(rack.mnmoinsefx(2), 17);
    song().tracke[3] = 99;
    EXPECT_EQ(rack.mnmoinsefx(3), 17);
    song().tracke[3] = 0;
    EXPECT_EQ(rack.mnmoinsefx(3), 99);  // starting at 99 itself
    EXPECT_EQ(rack.mnplusefx(3), 1);
    // A third slot in use at once is routed like the first two.
    rack.mnplusefx(1);
    rack.mnplusefx(1);
    EXPECT_EQ(song().tracke[1], 2);
}

TEST_F(Rack, PanelsReachTheUnitShown) {
    const int clone = rack.clone(11);
    rack.affsousefx(clone);
    rack.aff_echo(99);
    EXPECT_EQ(song().echolevel[1], 99u);
    EXPECT_EQ(song().echolevel[0], 75u);
    rack.affsousefx(3);  // not an echo: nothing to set
    rack.aff_echo(5);
    EXPECT_EQ(song().echolevel[0], 75u);
    rack.set_reverb_delay(10, 3, 20000);
    EXPECT_EQ(engine.units.firstreverb.length(3), 882);
    rack.set_reverb_gain(9, 9, 0);  // DHS fields 5..9 are the output taps
    rack.set_reverb_delay(9, 9, 1000);
    EXPECT_EQ(engine.units.secreverb.delay_length(), 44);
}

}  // namespace
}  // namespace ondrel
