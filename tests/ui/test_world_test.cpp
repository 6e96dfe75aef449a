// The test world itself: input reaches the windows through the desktop, and time is the test's.
#include "test_world.h"

#include <gtest/gtest.h>

using namespace qorui;

TEST(World, InputGoesThroughTheDesktopOnTheTestsClock) {
    qortest::CWorld world;
    CWindowVisual *p_wnd =
        world.place(&world.desktop(), new CWindowVisual(&world.desktop(), "w"), 10, 20, 30, 40);
    int clicks = 0;
    p_wnd->register_callback(EVENT_CLICK, CEventCallback([&clicks](CWndEvent const *) { ++clicks; }));
    world.click_at(10, 20);
    world.click_at(9, 20);
    EXPECT_EQ(1, clicks);
    EXPECT_EQ(9, world.desktop().get_pointer_pos().x);
    EXPECT_EQ(20, world.desktop().get_pointer_pos().y);
    EXPECT_EQ(10000u, qorplatform::get_tick_count());
    world.clock().advance_ms(5);
    EXPECT_EQ(10005u, qorplatform::get_tick_count());
}
