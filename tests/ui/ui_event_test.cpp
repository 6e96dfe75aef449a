// Events: the table of names, the copy that moves the stream, and dispatch to callbacks.
#include "ui_event.h"

#include "test_desktop.h"
#include "ui_window.h"

#include <gtest/gtest.h>

#include <vector>

using namespace qorui;

TEST(EventNames, AreRegisteredOnceAndFoundBothWays) {
    // EVENT_RESIZED has no name of the service's, whichever tests ran before.
    EXPECT_TRUE(CWndEvent::register_event_name("TEST_EVENT_B", EVENT_RESIZED));
    EXPECT_FALSE(CWndEvent::register_event_name("TEST_EVENT_B", EVENT_CLICK)); // the old value stays
    EXPECT_TRUE(CWndEvent::register_event_name("TEST_EVENT_A", EVENT_RESIZED));

    EEventType id = EVENT_DRAW;
    EXPECT_TRUE(CWndEvent::get_id_by_name("TEST_EVENT_B", id));
    EXPECT_EQ(EVENT_RESIZED, id);
    id = EVENT_DRAW;
    EXPECT_FALSE(CWndEvent::get_id_by_name("test_event_b", id)); // case counts
    EXPECT_EQ(EVENT_DRAW, id);

    string name = "untouched";
    EXPECT_TRUE(CWndEvent::get_name_by_id(EVENT_RESIZED, name));
    EXPECT_EQ("TEST_EVENT_A", name); // the first in sort order
    EXPECT_FALSE(CWndEvent::get_name_by_id(EVENT_PAGE_DOWN, name));
    EXPECT_EQ("TEST_EVENT_A", name);
}

TEST(Event, CopyingMovesTheStreamAndKeepsTheLinks) {
    qortest::CTestDesktop desktop;
    CWindow window(&desktop, "w");
    CWndEvent source(EVENT_KEY_DOWN);
    source << 65 << 0;
    source.set_activator(&window);
    source.set_dispatch_type(CWndEvent::DISPATCH_PARENT);
    CWndEvent const copy(source);
    EXPECT_TRUE(source.is_empty());
    EXPECT_EQ(EVENT_KEY_DOWN, copy.get_id());
    EXPECT_EQ(&window, copy.get_activator());
    EXPECT_EQ(CWndEvent::DISPATCH_PARENT, copy.get_dispatch_type());
    EXPECT_EQ(65, copy.get<int>());
}

TEST(Dispatcher, EachCallbackReadsFromTheHeadAndSeesChangesInPlace) {
    qortest::CTestDesktop desktop;
    CWindow window(&desktop, "w");
    std::vector<int> seen;
    std::vector<CWindow *> receivers;
    auto const reader = [&](CWndEvent const *p_event) {
        int &value = p_event->get<int>();
        seen.push_back(value);
        receivers.push_back(p_event->get_receiver());
        value += 1;
    };
    window.register_callback(EVENT_SCROLL_SMALL_STEP, CEventCallback(reader));
    window.register_callback(EVENT_SCROLL_SMALL_STEP, CEventCallback(reader)); // twice runs twice
    CWndEvent event(EVENT_SCROLL_SMALL_STEP);
    event << 10;
    window.send_event(&window, &event, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ((std::vector<int>{10, 11}), seen);
    EXPECT_EQ((std::vector<CWindow *>{&window, &window}), receivers);
}

TEST(Dispatcher, ACallbackRegisteredDuringThePassRunsInTheSamePass) {
    qortest::CTestDesktop desktop;
    CWindow window(&desktop, "w");
    int late_runs = 0;
    window.register_callback(EVENT_CHECKED, CEventCallback([&](CWndEvent const *) {
                                 if (late_runs == 0)
                                     window.register_callback(
                                         EVENT_CHECKED,
                                         CEventCallback([&](CWndEvent const *) { ++late_runs; }));
                             }));
    window.send_event(&window, EVENT_CHECKED, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ(1, late_runs);
}

TEST(Dispatcher, AParentListeningToAChildFindsItAsReceiver) {
    qortest::CTestDesktop desktop;
    CWindow *p_parent = new CWindow(&desktop, "parent");
    CWindow *p_child = new CWindow(&desktop, "child");
    p_parent->attach_child(p_child);
    CWindow *p_clicked = nullptr;
    p_child->register_callback(
        EVENT_CLICK, CEventCallback([&](CWndEvent const *p_event) { p_clicked = p_event->get_receiver(); }));
    p_parent->send_event(p_child, EVENT_CLICK, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ(p_child, p_clicked);
    delete p_parent;
}
