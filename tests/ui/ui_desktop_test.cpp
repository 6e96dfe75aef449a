// The desktop: the pointer, the hit test, press, click, double click and drag, modality, the
// stack of active windows, keys to the active window and subscribers, deferred deletion, and
// frames; all on a clock the test holds.
#include "ui_desktop.h"

#include "qor_platform.h"
#include "recording_renderer.h"
#include "test_support.h"
#include "ui_render.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using namespace qorui;

namespace {

typedef std::vector<std::string> calls_t;

class DesktopTest : public ::testing::Test {
protected:
    void SetUp() override {
        qorplatform::set_clock(&m_clock);
        {
            qortest::CReportCapture quiet; // no screen size here
            m_render.init(&m_recorder);
        }
        mp_desktop = new CDesktop(&m_render, 200, 100, "desktop");
        // Two windows side by side: a [a1] at (0, 0) and b at (100, 0), 100 by 100 each.
        mp_a = window(mp_desktop, "a", 0, 0, 100, 100);
        mp_a1 = window(mp_a, "a1", 10, 10, 20, 20);
        mp_b = window(mp_desktop, "b", 100, 0, 100, 100);
        m_calls.clear();
    }
    void TearDown() override {
        delete mp_desktop;
        qorplatform::set_clock(nullptr);
    }

    // A visual window that records the input events it takes.
    CWindowVisual *window(CWindow *_p_parent, char const *_name, int _x, int _y, int _w, int _h) {
        CWindowVisual *p_wnd = new CWindowVisual(mp_desktop, _name);
        _p_parent->attach_child(p_wnd);
        p_wnd->set_pos(_x, _y);
        p_wnd->set_size(_w, _h);
        for (EEventType id : {EVENT_ACTIVATE, EVENT_DEACTIVATE, EVENT_DRAG_BEGIN, EVENT_DRAG, EVENT_DRAG_END,
                              EVENT_POINTER_ENTER, EVENT_POINTER_EXIT, EVENT_POINTER_DOWN, EVENT_POINTER_UP,
                              EVENT_CLICK, EVENT_DOUBLE_CLICK, EVENT_KEY_DOWN, EVENT_CHAR})
            p_wnd->register_callback(id, CEventCallback([this, _name](CWndEvent const *p_event) {
                                         m_calls.push_back(std::string(_name) + ":" +
                                                           std::to_string(p_event->get_id()));
                                     }));
        return p_wnd;
    }
    // Moves the pointer to a desktop position; its true position starts at the centre.
    void move_to(float _x, float _y) {
        mp_desktop->on_pointer_move(vec2_t{_x - m_x, _y - m_y});
        m_x = _x, m_y = _y;
    }
    void click() {
        mp_desktop->on_pointer_down(0);
        mp_desktop->on_pointer_up(0);
    }

    qorplatform::CManualClock m_clock{5000};
    qorhost::CRecordingRenderer m_recorder;
    CRender m_render;
    CDesktop *mp_desktop = nullptr;
    CWindowVisual *mp_a = nullptr, *mp_a1 = nullptr, *mp_b = nullptr;
    calls_t m_calls;
    float m_x = 100, m_y = 50;
};

} // namespace

TEST_F(DesktopTest, ThePointerStopsAtTheEdgesAndKeepsFractions) {
    EXPECT_EQ(0, mp_desktop->get_pointer_pos().x); // the window waits for the first movement
    mp_desktop->on_pointer_move(vec2_t{0.5f, 0});
    EXPECT_EQ(100, mp_desktop->get_pointer_pos().x);
    mp_desktop->on_pointer_move(vec2_t{0.5f, 0});
    EXPECT_EQ(101, mp_desktop->get_pointer_pos().x);
    mp_desktop->on_pointer_move(vec2_t{1000, 1000});
    EXPECT_EQ(199, mp_desktop->get_pointer_pos().x);
    EXPECT_EQ(99, mp_desktop->get_pointer_pos().y);
    mp_desktop->on_pointer_move(vec2_t{-1000, -1000});
    EXPECT_EQ(0, mp_desktop->get_pointer_pos().x);
}

TEST_F(DesktopTest, TheDeepestWindowUnderThePointerIsEnteredAndLeft) {
    move_to(15, 15);
    EXPECT_EQ((calls_t{"a1:17"}), m_calls);
    m_calls.clear();
    move_to(50, 50);
    EXPECT_EQ((calls_t{"a1:18", "a:17"}), m_calls);
    mp_a->set_hidden(true); // a hidden window hides its subtree from the pointer
    m_calls.clear();
    move_to(15, 16); // now over the desktop itself; the hidden window's filter refuses the exit
    EXPECT_TRUE(m_calls.empty());
    mp_a->set_hidden(false);
    move_to(15, 17);
    EXPECT_EQ((calls_t{"a1:17"}), m_calls);
}

TEST_F(DesktopTest, AClickIsPressReleaseAndClickOnTheSameWindow) {
    move_to(150, 50);
    m_calls.clear();
    click();
    EXPECT_EQ((calls_t{"b:6", "b:21", "b:22", "b:24"}), m_calls);
    EXPECT_EQ(mp_b, mp_desktop->get_active_window());
    EXPECT_EQ(mp_b, mp_desktop->get_child(1u)); // brought to the front
}

TEST_F(DesktopTest, ADragStartsOnTheFirstMovementAndEndsAtTheRelease) {
    mp_b->set_can_drag(true);
    move_to(150, 50);
    m_calls.clear();
    mp_desktop->on_pointer_down(1);
    move_to(140, 45);
    move_to(130, 40);
    mp_desktop->on_pointer_up(1);
    // The window followed the pointer, so the release is over it: a click as well.
    EXPECT_EQ((calls_t{"b:6", "b:21", "b:13", "b:14", "b:22", "b:15", "b:24"}), m_calls);
    EXPECT_EQ(90, mp_b->get_pos().x); // moved by the second movement only: 100 - 10
    EXPECT_EQ(-5, mp_b->get_pos().y);
}

TEST_F(DesktopTest, DoubleClicksNeedTheSameWindowWithin250Milliseconds) {
    move_to(150, 50);
    click();
    m_clock.advance_ms(249);
    m_calls.clear();
    click();
    EXPECT_EQ((calls_t{"b:21", "b:22", "b:24", "b:25"}), m_calls);
    m_clock.advance_ms(250);
    m_calls.clear();
    click();
    EXPECT_EQ((calls_t{"b:21", "b:22", "b:24"}), m_calls);
    move_to(50, 50);
    m_clock.advance_ms(10);
    m_calls.clear();
    click();
    EXPECT_EQ((calls_t{"b:7", "a:6", "a:21", "a:22", "a:24"}), m_calls);
}

TEST_F(DesktopTest, AModalWindowKeepsOutEverythingElse) {
    mp_b->set_is_modal(true);
    move_to(150, 50);
    mp_desktop->on_pointer_down(0);
    move_to(50, 50); // outside: no enter, exit or move events
    m_calls.clear();
    mp_desktop->on_pointer_up(0);
    EXPECT_EQ((calls_t{"b:22"}), m_calls); // the release, but no click
    m_calls.clear();
    click();
    EXPECT_TRUE(m_calls.empty());
    EXPECT_EQ(mp_b, mp_desktop->get_active_window());
}

TEST_F(DesktopTest, ActivationClimbsPastPassiveWindowsAndShowsHiddenOnes) {
    mp_a1->set_passive(true);
    mp_desktop->set_active_window(mp_a1);
    EXPECT_EQ(mp_a, mp_desktop->get_active_window());
    m_calls.clear();
    mp_desktop->set_active_window(mp_a); // active already: nothing
    EXPECT_TRUE(m_calls.empty());
    mp_b->set_hidden(true);
    mp_desktop->set_active_window(mp_b);
    EXPECT_FALSE(mp_b->is_hidden());
    EXPECT_EQ((calls_t{"a:7", "b:6"}), m_calls);

    // Hiding the active window gives the activation back to the one before.
    m_calls.clear();
    mp_b->send_event(mp_b, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ((calls_t{"b:7", "a:6"}), m_calls);
}

TEST_F(DesktopTest, TheActiveStackKeepsThirtyOneEntries) {
    for (int i = 0; i < 16; ++i) {
        mp_desktop->set_active_window(mp_a);
        mp_desktop->set_active_window(mp_b);
    }
    // 32 activations: the 32nd removed the oldest. Dropping 31 times empties the stack.
    int drops = 0;
    for (CWindow *p_active; (p_active = mp_desktop->get_active_window()) && drops < 40; ++drops) {
        p_active->set_hidden(true); // hiding the active window drops it from the stack
        p_active->set_hidden(false);
    }
    EXPECT_EQ(31, drops);
}

TEST_F(DesktopTest, KeysGoToTheActiveWindowAndTheSubscribers) {
    mp_desktop->set_active_window(mp_a);
    mp_b->input_subscribe(true);
    mp_a->input_subscribe(true); // the active window gets it once
    m_calls.clear();
    mp_desktop->on_key_down(0x41, 0);
    mp_desktop->on_char('a');
    EXPECT_EQ((calls_t{"a:31", "b:31", "a:33", "b:33"}), m_calls);
}

TEST_F(DesktopTest, DeferredDeletionWaitsForTheFadeAndNeverDeletesTwice) {
    mp_a->set_auto_delete(true);
    mp_a1->set_auto_delete(true);
    mp_a1->send_event(mp_a1, EVENT_HIDE, CWndEvent::DISPATCH_NONE); // queued
    mp_a->send_event(mp_a, EVENT_HIDE, CWndEvent::DISPATCH_NONE);   // queued, with a1 inside
    mp_desktop->update(0);
    EXPECT_EQ(2u, mp_desktop->get_children_count()); // transparencies not computed yet
    m_clock.advance_ms(200);
    mp_desktop->draw(); // the fade-out has ended: transparency 0
    mp_desktop->update(0);
    ASSERT_EQ(1u, mp_desktop->get_children_count());
    EXPECT_EQ(mp_b, mp_desktop->get_child(0u));
    mp_desktop->update(0); // nothing left to delete twice
}

TEST_F(DesktopTest, FramesDrawTheTreeAndThePointerLast) {
    m_recorder.clear();
    mp_desktop->draw();
    std::string const sequence = m_recorder.sequence();
    EXPECT_EQ(0u, sequence.find("begin_2d"));
    EXPECT_EQ(sequence.size() - std::string("end_2d").size(), sequence.rfind("end_2d"));

    int pointer_draws = 0;
    mp_desktop->get_pointer().register_callback(EVENT_DRAW,
                                                CEventCallback([&](CWndEvent const *) { ++pointer_draws; }));
    int b_draws = 0;
    mp_b->register_callback(EVENT_DRAW, CEventCallback([&](CWndEvent const *) { ++b_draws; }));
    mp_b->set_hidden(true);
    mp_desktop->set_exclusive_render_window(mp_b, true);
    m_clock.advance_ms(1000);
    mp_desktop->draw();
    mp_desktop->draw();
    EXPECT_EQ(2, pointer_draws);
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

    CCursor cursor(nullptr, "cursor");
    cursor.set_size(5, 20);
    cursor.set_pos(10, 50);
    EXPECT_EQ(30, cursor.CWindow::get_pos().y);
    EXPECT_EQ(50, cursor.get_pos().y);
    cursor.set_size(5, 30);
    EXPECT_EQ(60, cursor.get_pos().y);
    EXPECT_FLOAT_EQ(0.0f, pointer.get_fade_in());
    EXPECT_FLOAT_EQ(150.0f, cursor.get_fade_in());
}

TEST_F(DesktopTest, HelpersNameWindowsAndRoundToTheGrid) {
    EXPECT_STREQ("desktop->a->a1", CDesktop::print_full_window_hierarchy(mp_a1));
    EXPECT_STREQ("", CDesktop::print_full_window_hierarchy(nullptr));
    EXPECT_FLOAT_EQ(3.0f, CDesktop::round_w(2.5f));
    EXPECT_FLOAT_EQ(-3.0f, CDesktop::round_h(-2.5f));
    EXPECT_FLOAT_EQ(2.0f, CDesktop::round_w(2.0f));
}
