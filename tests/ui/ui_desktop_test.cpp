// The desktop on a world of 200 by 100: the pointer, the hit test, press, click, double click and
// drag, modality, the stack of active windows, keys to the active window and subscribers, deferred
// deletion, and frames; all on the test's clock.
#include "ui_desktop.h"

#include "test_world.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

typedef std::vector<std::string> lines_t;

// Two windows side by side: a [a1] at (0, 0) and b at (100, 0), 100 by 100 each.
class DesktopTest : public ::testing::Test {
protected:
    void SetUp() override {
        mp_a = window(&desktop(), "a", 0, 0, 100, 100);
        mp_a1 = window(mp_a, "a1", 10, 10, 20, 20);
        mp_b = window(&desktop(), "b", 100, 0, 100, 100);
        m_log.take();
    }
    CWindowVisual *window(CWindow *_p_parent, char const *_name, int _x, int _y, int _w, int _h) {
        CWindowVisual *p_wnd = m_world.place(_p_parent, new CWindowVisual(&desktop(), _name), _x, _y, _w, _h);
        m_log.watch(p_wnd, {EVENT_ACTIVATE, EVENT_DEACTIVATE, EVENT_DRAG_BEGIN, EVENT_DRAG, EVENT_DRAG_END,
                            EVENT_POINTER_ENTER, EVENT_POINTER_EXIT, EVENT_POINTER_DOWN, EVENT_POINTER_UP,
                            EVENT_CLICK, EVENT_DOUBLE_CLICK, EVENT_KEY_DOWN, EVENT_CHAR});
        return p_wnd;
    }
    CDesktop &desktop() { return m_world.desktop(); }
    void click() {
        m_world.press();
        m_world.release();
    }

    qortest::CWorld m_world{200, 100};
    qortest::CEventLog m_log;
    CWindowVisual *mp_a = nullptr, *mp_a1 = nullptr, *mp_b = nullptr;
};

} // namespace

TEST_F(DesktopTest, ThePointerStopsAtTheEdgesAndKeepsFractions) {
    desktop().on_pointer_move(vec2_t{0.5f, 0});
    EXPECT_EQ(100, desktop().get_pointer_pos().x);
    desktop().on_pointer_move(vec2_t{0.5f, 0});
    EXPECT_EQ(101, desktop().get_pointer_pos().x);
    desktop().on_pointer_move(vec2_t{1000, 1000});
    EXPECT_EQ(199, desktop().get_pointer_pos().x);
    EXPECT_EQ(99, desktop().get_pointer_pos().y);
    desktop().on_pointer_move(vec2_t{-1000, -1000});
    EXPECT_EQ(0, desktop().get_pointer_pos().x);
}

TEST_F(DesktopTest, TheDeepestWindowUnderThePointerIsEnteredAndLeft) {
    m_world.move_to(15, 15);
    EXPECT_EQ((lines_t{"a1:EVENT_POINTER_ENTER"}), m_log.take());
    m_world.move_to(50, 50);
    EXPECT_EQ((lines_t{"a1:EVENT_POINTER_EXIT", "a:EVENT_POINTER_ENTER"}), m_log.take());
    mp_a->set_hidden(true); // hides its subtree from the pointer; its filter refuses the exit
    m_world.move_to(15, 16);
    EXPECT_TRUE(m_log.take().empty());
    mp_a->set_hidden(false);
    m_world.move_to(15, 17);
    EXPECT_EQ((lines_t{"a1:EVENT_POINTER_ENTER"}), m_log.take());
}

TEST_F(DesktopTest, ClicksDoubleClicksAndDrags) {
    m_world.move_to(150, 50);
    m_log.take();
    click();
    EXPECT_EQ((lines_t{"b:EVENT_ACTIVATE", "b:EVENT_POINTER_DOWN", "b:EVENT_POINTER_UP", "b:EVENT_CLICK"}),
              m_log.take());
    EXPECT_EQ(mp_b, desktop().get_child(1u)); // brought to the front

    // A double click needs the same window within 250 ms.
    m_world.clock().advance_ms(249);
    click();
    EXPECT_EQ(
        (lines_t{"b:EVENT_POINTER_DOWN", "b:EVENT_POINTER_UP", "b:EVENT_CLICK", "b:EVENT_DOUBLE_CLICK"}),
        m_log.take());
    m_world.clock().advance_ms(250);
    click();
    EXPECT_EQ((lines_t{"b:EVENT_POINTER_DOWN", "b:EVENT_POINTER_UP", "b:EVENT_CLICK"}), m_log.take());
    m_world.move_to(50, 50);
    m_log.take();
    m_world.clock().advance_ms(10);
    click();
    EXPECT_EQ((lines_t{"b:EVENT_DEACTIVATE", "a:EVENT_ACTIVATE", "a:EVENT_POINTER_DOWN", "a:EVENT_POINTER_UP",
                       "a:EVENT_CLICK"}),
              m_log.take());

    // A drag starts at the first movement behind the press; the window follows the pointer, so
    // the release is over it: a click as well.
    mp_b->set_can_drag(true);
    m_world.move_to(150, 50);
    m_log.take();
    m_world.press(1);
    m_world.move_to(140, 45);
    m_world.move_to(130, 40);
    m_world.release(1);
    EXPECT_EQ((lines_t{"a:EVENT_DEACTIVATE", "b:EVENT_ACTIVATE", "b:EVENT_POINTER_DOWN", "b:EVENT_DRAG_BEGIN",
                       "b:EVENT_DRAG", "b:EVENT_POINTER_UP", "b:EVENT_DRAG_END", "b:EVENT_CLICK"}),
              m_log.take());
    EXPECT_EQ(90, mp_b->get_pos().x); // moved by the second movement only
    EXPECT_EQ(-5, mp_b->get_pos().y);
}

TEST_F(DesktopTest, AModalWindowKeepsOutEverythingElse) {
    mp_b->set_is_modal(true);
    m_world.move_to(150, 50);
    m_world.press();
    m_world.move_to(50, 50); // outside: no enter, exit or move events
    m_log.take();
    m_world.release();
    EXPECT_EQ((lines_t{"b:EVENT_POINTER_UP"}), m_log.take()); // but no click
    click();
    EXPECT_TRUE(m_log.take().empty());
    EXPECT_EQ(mp_b, desktop().get_active_window());
}

TEST_F(DesktopTest, ActivationClimbsPastPassiveWindowsAndShowsHiddenOnes) {
    mp_a1->set_passive(true);
    desktop().set_active_window(mp_a1);
    EXPECT_EQ(mp_a, desktop().get_active_window());
    m_log.take();
    desktop().set_active_window(mp_a); // active already: nothing
    EXPECT_TRUE(m_log.take().empty());
    mp_b->set_hidden(true);
    desktop().set_active_window(mp_b);
    EXPECT_FALSE(mp_b->is_hidden());
    EXPECT_EQ((lines_t{"a:EVENT_DEACTIVATE", "b:EVENT_ACTIVATE"}), m_log.take());
    // Hiding the active window gives the activation back to the one before.
    mp_b->send_event(mp_b, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ((lines_t{"b:EVENT_DEACTIVATE", "a:EVENT_ACTIVATE"}), m_log.take());

    // The stack keeps 31 entries: of 32 activations the oldest went, and 31 drops empty it.
    for (int i = 0; i < 16; ++i) {
        desktop().set_active_window(mp_a);
        desktop().set_active_window(mp_b);
    }
    int drops = 0;
    for (CWindow *p_active; (p_active = desktop().get_active_window()) && drops < 40; ++drops) {
        p_active->set_hidden(true);
        p_active->set_hidden(false);
    }
    EXPECT_EQ(31, drops);
}

TEST_F(DesktopTest, KeysGoToTheActiveWindowAndTheSubscribers) {
    desktop().set_active_window(mp_a);
    mp_b->input_subscribe(true);
    mp_a->input_subscribe(true); // the active window gets it once
    m_log.take();
    desktop().on_key_down(0x41, 0);
    m_world.type("a");
    EXPECT_EQ((lines_t{"a:EVENT_KEY_DOWN", "b:EVENT_KEY_DOWN", "a:EVENT_CHAR", "b:EVENT_CHAR"}),
              m_log.take());
}

// Kept for the sanitizer run too: a queued window deleted with its parent must leave the queue.
TEST_F(DesktopTest, DeferredDeletionWaitsForTheFadeAndNeverDeletesTwice) {
    mp_a->set_auto_delete(true);
    mp_a1->set_auto_delete(true);
    mp_a1->send_event(mp_a1, EVENT_HIDE, CWndEvent::DISPATCH_NONE); // queued
    mp_a->send_event(mp_a, EVENT_HIDE, CWndEvent::DISPATCH_NONE);   // queued, with a1 inside
    desktop().update(0);
    EXPECT_EQ(2u, desktop().get_children_count()); // transparencies not computed yet
    m_world.clock().advance_ms(200);
    m_world.frame(); // drawn: the fade-out has ended
    m_world.frame();
    ASSERT_EQ(1u, desktop().get_children_count());
    EXPECT_EQ(mp_b, desktop().get_child(0u));
}

TEST_F(DesktopTest, FramesDrawTheTreeAndThePointerLast) {
    m_world.recorder().clear();
    desktop().draw();
    std::string const sequence = m_world.recorder().sequence();
    EXPECT_EQ(0u, sequence.find("begin_2d"));
    EXPECT_EQ(sequence.size() - std::string("end_2d").size(), sequence.rfind("end_2d"));

    int pointer_draws = 0, b_draws = 0;
    desktop().get_pointer().register_callback(EVENT_DRAW,
                                              CEventCallback([&](CWndEvent const *) { ++pointer_draws; }));
    mp_b->register_callback(EVENT_DRAW, CEventCallback([&](CWndEvent const *) { ++b_draws; }));
    mp_b->set_hidden(true);
    desktop().set_exclusive_render_window(mp_b, true); // hidden: not drawn, and nothing else is
    m_world.clock().advance_ms(1000);
    desktop().draw();
    EXPECT_EQ(1, pointer_draws);
    EXPECT_EQ(0, b_draws);
}

TEST(Pointer, PositionsAreThoseOfTheHotSpotOrTheLowerLeftCorner) {
    CPointer pointer(nullptr, "pointer");
    pointer.set_hotspot(point_t{3, 3});
    pointer.set_pos(100, 100);
    EXPECT_EQ(97, pointer.CWindow::get_pos().x);
    EXPECT_EQ(100, pointer.get_pos().x);
    pointer.set_hotspot(point_t{5, 5});
    EXPECT_EQ(102, pointer.get_pos().y);
    EXPECT_FLOAT_EQ(0.0f, pointer.get_fade_in());

    CCursor cursor(nullptr, "cursor");
    cursor.set_size(5, 20);
    cursor.set_pos(10, 50);
    EXPECT_EQ(30, cursor.CWindow::get_pos().y);
    cursor.set_size(5, 30);
    EXPECT_EQ(60, cursor.get_pos().y);
}

TEST_F(DesktopTest, HelpersNameWindowsAndRoundToTheGrid) {
    EXPECT_STREQ("desktop->a->a1", CDesktop::print_full_window_hierarchy(mp_a1));
    EXPECT_STREQ("", CDesktop::print_full_window_hierarchy(nullptr));
    EXPECT_FLOAT_EQ(3.0f, CDesktop::round_w(2.5f));
    EXPECT_FLOAT_EQ(-3.0f, CDesktop::round_h(-2.5f));
    EXPECT_FLOAT_EQ(2.0f, CDesktop::round_w(2.0f));
}
