// The desktop on a world of 200 by 100: the pointer, the hit test, press, click, double click and
// drag, modality, the stack of active windows, keys to the active window and subscribers, deferred
// deletion, and frames; all on the test's clock.
#include "ui_desktop.h"

#include "test_world.h"
#include "ui.h"
#include "ui_material.h"
#include "ui_stats_page.h"

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

TEST_F(DesktopTest, ThePointerEntersTheDeepestWindowAndStopsAtTheEdges) {
    m_world.move_to(15, 15);
    EXPECT_EQ((lines_t{"a1:EVENT_POINTER_ENTER"}), m_log.take());
    m_world.move_to(50, 50);
    EXPECT_EQ((lines_t{"a1:EVENT_POINTER_EXIT", "a:EVENT_POINTER_ENTER"}), m_log.take());
    mp_a->set_hidden(true); // hides its subtree from the pointer; its filter refuses the exit
    m_world.move_to(15, 16);
    EXPECT_TRUE(m_log.take().empty());
    desktop().on_pointer_move(vec2_t{0.5f, 0});
    desktop().on_pointer_move(vec2_t{0.5f, 0}); // fractions add up
    EXPECT_EQ(16, desktop().get_pointer_pos().x);
    desktop().on_pointer_move(vec2_t{1000, 1000});
    EXPECT_EQ(199, desktop().get_pointer_pos().x);
    EXPECT_EQ(99, desktop().get_pointer_pos().y);
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
    EXPECT_EQ("b:EVENT_DOUBLE_CLICK", m_log.take().back());
    m_world.clock().advance_ms(250);
    click();
    EXPECT_EQ("b:EVENT_CLICK", m_log.take().back());

    // A drag starts at the first movement behind the press; the window follows the pointer, so
    // the release is over it: a click as well.
    mp_b->set_can_drag(true);
    m_world.clock().advance_ms(250);
    m_world.press(1);
    m_world.move_to(140, 45);
    m_world.move_to(130, 40);
    m_world.release(1);
    EXPECT_EQ((lines_t{"b:EVENT_POINTER_DOWN", "b:EVENT_DRAG_BEGIN", "b:EVENT_DRAG", "b:EVENT_POINTER_UP",
                       "b:EVENT_DRAG_END", "b:EVENT_CLICK"}),
              m_log.take());
    EXPECT_EQ("90,-5 100x100", qortest::place_text(mp_b)); // moved by the second movement only
}

TEST_F(DesktopTest, AModalWindowKeepsOutEverythingElseAndKeysGoToTheActiveWindowAndSubscribers) {
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

    mp_b->set_is_modal(false);
    mp_a->input_subscribe(true);
    mp_b->input_subscribe(true); // the active window gets it once
    desktop().on_key_down(0x41, 0);
    m_world.type("a");
    EXPECT_EQ((lines_t{"b:EVENT_KEY_DOWN", "a:EVENT_KEY_DOWN", "b:EVENT_CHAR", "a:EVENT_CHAR"}),
              m_log.take());
}

TEST_F(DesktopTest, ActivationClimbsPastPassiveWindowsShowsHiddenOnesAndStacks31) {
    mp_a1->set_passive(true);
    desktop().set_active_window(mp_a1);
    EXPECT_EQ(mp_a, desktop().get_active_window());
    EXPECT_STREQ("desktop->a->a1", CDesktop::print_full_window_hierarchy(mp_a1));
    m_log.take();
    desktop().set_active_window(mp_a); // active already: nothing
    mp_b->set_hidden(true);
    desktop().set_active_window(mp_b);
    EXPECT_FALSE(mp_b->is_hidden());
    // Hiding the active window gives the activation back to the one before.
    mp_b->send_event(mp_b, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ((lines_t{"a:EVENT_DEACTIVATE", "b:EVENT_ACTIVATE", "b:EVENT_DEACTIVATE", "a:EVENT_ACTIVATE"}),
              m_log.take());
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

// The "ui" page's figures: the windows of the tree, what the last frame sent, the frame's time;
// an exclusive window that is hidden leaves only the pointer drawn.
TEST_F(DesktopTest, FramesDrawTheTreeThePointerLastAndShowTheirFigures) {
    mp_a->add_material(MAT_NAME_NORMAL, m_world.colour(1, 2, 3));
    mp_b->set_hidden(true);
    m_world.frame();
    m_world.clock().advance_ms(16);
    m_world.recorder().clear();
    m_world.frame();
    std::string const sequence = m_world.recorder().sequence();
    EXPECT_EQ(0u, sequence.find("begin_2d"));
    EXPECT_EQ(sequence.size() - std::string("end_2d").size(), sequence.rfind("end_2d"));
    CUserInterface service;
    IStatsPage *p_page = service.create_stats_page("ui");
    desktop().show_stats(p_page, 2);
    CText const &text = static_cast<CStatsPage *>(p_page)->get_text();
    EXPECT_STREQ("<color 255 255 255 255>Windows: 3, shown 2", text.get_string(2)->get_c()); // a1 inside a
    EXPECT_STREQ("<color 255 255 255 255>Materials set: 1, quads: 1, lines: 0", text.get_string(3)->get_c());
    EXPECT_STREQ("<color 255 255 255 255>Frame: 16.0 ms", text.get_string(4)->get_c());

    int pointer_draws = 0;
    desktop().get_pointer().register_callback(EVENT_DRAW,
                                              CEventCallback([&](CWndEvent const *) { ++pointer_draws; }));
    desktop().set_exclusive_render_window(mp_b, true);
    m_world.recorder().clear();
    desktop().draw();
    EXPECT_EQ(1, pointer_draws);
    EXPECT_EQ(std::string::npos, m_world.recorder().sequence().find("set_material draw_quad set_material"));
}

TEST(Pointer, PositionsAreThoseOfTheHotSpotOrTheLowerLeftCorner) {
    CPointer pointer(nullptr, "pointer");
    pointer.set_hotspot(point_t{3, 3});
    pointer.set_pos(100, 100);
    EXPECT_EQ(97, pointer.CWindow::get_pos().x);
    pointer.set_hotspot(point_t{5, 5});
    EXPECT_EQ(102, pointer.get_pos().y);
    CCursor cursor(nullptr, "cursor");
    cursor.set_size(5, 20);
    cursor.set_pos(10, 50);
    EXPECT_EQ(30, cursor.CWindow::get_pos().y);
    cursor.set_size(5, 30);
    EXPECT_EQ(60, cursor.get_pos().y);
    EXPECT_FLOAT_EQ(-3.0f, CDesktop::round_h(-2.5f));
}
