// Events: the table of names, the copy that moves the stream, and dispatch to callbacks.
#include "ui_event.h"

#include "test_world.h"
#include "ui_window.h"

#include <gtest/gtest.h>

using namespace qorui;

TEST(EventNames, AreRegisteredOnceAndFoundBothWays) {
    // EVENT_RESIZED has no name of the service's, whichever tests ran before.
    EXPECT_TRUE(CWndEvent::register_event_name("TEST_EVENT_B", EVENT_RESIZED));
    EXPECT_FALSE(CWndEvent::register_event_name("TEST_EVENT_B", EVENT_CLICK)); // the old value stays
    EXPECT_TRUE(CWndEvent::register_event_name("TEST_EVENT_A", EVENT_RESIZED));
    EEventType id = EVENT_DRAW;
    EXPECT_TRUE(CWndEvent::get_id_by_name("TEST_EVENT_B", id));
    EXPECT_EQ(EVENT_RESIZED, id);
    EXPECT_FALSE(CWndEvent::get_id_by_name("test_event_b", id)); // case counts
    string name;
    EXPECT_TRUE(CWndEvent::get_name_by_id(EVENT_RESIZED, name));
    EXPECT_EQ("TEST_EVENT_A", name); // the first in sort order
    EXPECT_FALSE(CWndEvent::get_name_by_id(EVENT_PAGE_DOWN, name));
}

// A copy moves the stream. Each callback reads the stream from its head and sees what earlier ones
// changed; one registered during the pass runs in the same pass; a child's callbacks run with the
// child as receiver, whoever sent the event.
TEST(Dispatcher, CallbacksRunInOrderOfRegistrationOnTheReceiver) {
    qortest::CWorld world;
    CWindow *p_child = world.place(&world.desktop(), new CWindow(&world.desktop(), "child"), 0, 0, 1, 1);
    std::vector<int> seen;
    auto const reader = [&](CWndEvent const *p_event) {
        int &value = p_event->get<int>();
        seen.push_back(value);
        EXPECT_EQ(p_child, p_event->get_receiver());
        value += 1;
    };
    p_child->register_callback(EVENT_SCROLL_SMALL_STEP, CEventCallback(reader));
    p_child->register_callback(EVENT_SCROLL_SMALL_STEP, CEventCallback([&](CWndEvent const *p_event) {
                                   reader(p_event);
                                   if (seen.size() == 2)
                                       p_child->register_callback(EVENT_SCROLL_SMALL_STEP,
                                                                  CEventCallback(reader));
                               }));
    CWndEvent source(EVENT_SCROLL_SMALL_STEP);
    source << 10;
    source.set_dispatch_type(CWndEvent::DISPATCH_PARENT);
    CWndEvent event(source);
    EXPECT_TRUE(source.is_empty());
    EXPECT_EQ(CWndEvent::DISPATCH_PARENT, event.get_dispatch_type());
    world.desktop().send_event(p_child, &event, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ((std::vector<int>{10, 11, 12}), seen);
}
