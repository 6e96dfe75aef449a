// The host's input system: pointer and key listener lists, delivery of every kind of input in the
// order the listeners were added, and listeners that leave or join while input is delivered.
#include "host_test_support.h"
#include "input_system.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using namespace qorhost;

namespace {

typedef std::vector<std::string> event_list_t;
typedef hosttest::CInputRecord CListener;

} // namespace

// Every input reaches the listeners of its list in the order they were added; a listener is added
// once, removed from its own list only, and comes last when added again.
TEST(InputSystem, EveryInputReachesTheListenersInTheOrderTheyWereAdded) {
    CInputSystem input;
    event_list_t events;
    CListener a(events, "A"), b(events, "B");
    for (CListener *p : {&b, &a, &a, static_cast<CListener *>(nullptr)})
        input.add_pointer_listener(p);
    for (CListener *p : {&a, &b, &b, static_cast<CListener *>(nullptr)})
        input.add_key_listener(p);
    EXPECT_EQ(2u, input.get_pointer_listeners_count());
    EXPECT_EQ(2u, input.get_key_listeners_count());

    input.button_down(0);
    input.button_up(2);
    input.pointer_move(vec2_t{3, -2.5f});
    input.wheel(-1.5f);
    input.key_down(0xC0, 7);
    input.key_up(0x41);
    input.char_input(0x20AC);
    EXPECT_EQ((event_list_t{"B down 0", "A down 0", "B up 2", "A up 2", "B move 3 -2.5", "A move 3 -2.5",
                            "B wheel -1.5", "A wheel -1.5", "A key_down 0xC0 7", "B key_down 0xC0 7",
                            "A key_up 0x41", "B key_up 0x41", "A char 0x20AC", "B char 0x20AC"}),
              events);

    events.clear();
    input.remove_key_listener(&a);
    input.remove_pointer_listener(&b);
    input.remove_key_listener(nullptr);
    EXPECT_EQ(1u, input.get_pointer_listeners_count());
    EXPECT_EQ(1u, input.get_key_listeners_count());
    input.button_down(1);
    input.char_input(65);
    input.add_key_listener(&a);
    input.key_up(13);
    EXPECT_EQ((event_list_t{"A down 1", "B char 0x41", "B key_up 0xD", "A key_up 0xD"}), events);
}

// A listener removed during delivery hears nothing more, one added hears from the next input on.
TEST(InputSystem, ListenersThatLeaveOrJoinDuringDelivery) {
    CInputSystem input;
    event_list_t events;
    CListener a(events, "A"), b(events, "B"), c(events, "C");
    a.m_action = [&] { // A leaves at its first key and takes B with it
        input.remove_key_listener(&a);
        input.remove_key_listener(&b);
    };
    for (CListener *p : {&a, &b, &c})
        input.add_key_listener(p);
    input.key_down(1, 0);
    input.key_up(1);
    a.m_action = [&] { input.add_pointer_listener(&b); };
    input.add_pointer_listener(&a);
    input.wheel(1);
    input.wheel(2);
    EXPECT_EQ((event_list_t{"A key_down 0x1 0", "C key_down 0x1 0", "C key_up 0x1", "A wheel 1", "A wheel 2",
                            "B wheel 2"}),
              events);
}
