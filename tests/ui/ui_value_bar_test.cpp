// Value, progress and scroll bars: the range and position invariant, the progress fill, and the
// scroll bar's layout, steps, track presses and scroller drags through the pointer in both
// orientations, its buttons' looks and its layout.
#include "ui_value_bar.h"

#include "engine_interfaces.h"
#include "test_world.h"
#include "ui_button.h"

#include <gtest/gtest.h>

#include <limits>

using namespace qorui;

namespace {

typedef std::vector<std::string> events_t;

// Only a class of the family can break the range: the setters never do.
class CBrokenRange : public CValueBar {
public:
    CBrokenRange(CDesktop *_p_desktop) : CValueBar(_p_desktop, "broken") { m_min = 10.0f, m_max = 0.0f; }
};

} // namespace

// Each row: the position before (in 0..100), one setter, the range and position after, and the
// EVENT_CHANGED count after the call and after the same call once more.
TEST(ValueBar, EverySetterKeepsThePositionInsideTheRangeAndOnlyAChangeOfTheArgumentIsSent) {
    enum EOp { MIN, MAX, POSITION };
    float const nan = std::numeric_limits<float>::quiet_NaN();
    struct {
        char const *m_case;
        float m_start;
        EOp m_op;
        float m_value, m_min, m_max, m_position;
        size_t m_changed, m_changed_again;
    } const rows[] = {
        {"inside", 0, POSITION, 50, 0, 100, 50, 1, 1},
        {"the stored value", 50, POSITION, 50, 0, 100, 50, 0, 0},
        {"above the range", 100, POSITION, 150, 0, 100, 100, 1, 2}, // compared before clamping
        {"below the range", 0, POSITION, -5, 0, 100, 0, 1, 2},
        {"not a number", 40, POSITION, nan, 0, 100, 0, 1, 2},
        {"minimum above the maximum", 30, MIN, 120, 100, 100, 100, 0, 0},
        {"minimum above the position", 30, MIN, 40, 40, 100, 40, 0, 0},
        {"maximum below the minimum", 30, MAX, -10, 0, 0, 0, 0, 0},
        {"maximum below the position", 80, MAX, 60, 0, 60, 60, 0, 0},
        {"minimum not a number", 30, MIN, nan, 100, 100, 100, 0, 0},
    };
    qortest::CWorld world;
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_case);
        CValueBar bar(&world.desktop(), "bar");
        bar.set_position(row.m_start);
        events_t events;
        qortest::log_events(&bar, {EVENT_CHANGED}, events);
        for (size_t expected : {row.m_changed, row.m_changed_again}) {
            if (row.m_op == MIN) bar.set_min(row.m_value);
            if (row.m_op == MAX) bar.set_max(row.m_value);
            if (row.m_op == POSITION) bar.set_position(row.m_value);
            EXPECT_EQ((std::vector<float>{row.m_min, row.m_max, row.m_position}),
                      (std::vector<float>{bar.get_min(), bar.get_max(), bar.get_position()}));
            EXPECT_EQ(expected, events.size());
        }
    }
    qortest::CReportCapture capture;
    EXPECT_EQ(0.0f, CBrokenRange(&world.desktop()).get_position_normalized());
    ASSERT_EQ(1u, capture.asserts().size());
    EXPECT_EQ(0u, capture.asserts()[0].find("Expression:   range >= 0, \n"));
}

// The fill grows from the left whatever the orientation, by the position not shifted by the
// minimum (75 of 50 to 150 is 0.75 of 10 pixels); its height is the bar size less the margins.
TEST(ProgressBar, TheFillIsTheNormalisedShareOfTheClientWidthAndTheBarSizeHigh) {
    qortest::CWorld world;
    world.clock().advance_ms(150); // the desktop has faded in
    CProgressBar *p_bar =
        world.place(&world.desktop(), new CProgressBar(&world.desktop(), "p"), 10, 20, 12, 100);
    p_bar->set_horizontal(false);
    p_bar->set_uniform_margins(1);
    p_bar->set_max(150);
    p_bar->set_min(50);
    p_bar->set_position(75);
    world.frame();
    ASSERT_EQ(2u, world.quads().size()); // the body, then the fill
    EXPECT_EQ(rgba_t(252, 252, 252, 200), world.quads()[1].m_colour);
    EXPECT_EQ("11,21 7x10", qortest::rect_text(world.quads()[1].m_rect));
}

namespace {

// A bar 16 thick: end buttons of 16 by 16 and a scroller 10 across and 20 along. The horizontal
// bar stands at (10, 100), the vertical one at (100, 10); the pointer goes to (along, across) from
// the bar's corner.
class ScrollBarTest : public ::testing::TestWithParam<bool> {
protected:
    void make_bar(int _length) {
        bool const horizontal = GetParam();
        mp_bar = new CScrollBar(&m_world.desktop(), "bar");
        m_world.place(&m_world.desktop(), mp_bar, horizontal ? 10 : 100, horizontal ? 100 : 10,
                      horizontal ? _length : 16, horizontal ? 16 : _length);
        mp_bar->set_horizontal(horizontal);
        mp_bar->get_button_min()->set_size(16, 16);
        mp_bar->get_button_max()->set_size(16, 16);
        mp_bar->get_button_scroller()->set_size(horizontal ? 20 : 10, horizontal ? 10 : 20);
        mp_bar->set_scroller_for_position();
    }
    // A press and a release at (along, across).
    void click(int _along, int _across = 8) {
        GetParam() ? m_world.move_to(10 + _along, 100 + _across)
                   : m_world.move_to(100 + _across, 10 + _along);
        m_world.press();
        m_world.release();
    }
    // The corner of a button in the bar, as (along, across).
    std::vector<int> place_of(CButton *_p_button) const {
        point_t const pos = _p_button->get_pos();
        return GetParam() ? std::vector<int>{pos.x, pos.y} : std::vector<int>{pos.y, pos.x};
    }
    int scroller() const { return place_of(mp_bar->get_button_scroller())[0]; }

    qortest::CWorld m_world;
    CScrollBar *mp_bar = nullptr;
};

} // namespace

INSTANTIATE_TEST_SUITE_P(BothWays, ScrollBarTest, testing::Bool(),
                         [](testing::TestParamInfo<bool> const &_info) {
                             return _info.param ? "Horizontal" : "Vertical";
                         });

// The track is the bar less the scroller and the shown end buttons, 148 pixels here; the scroller
// stands the position's share of it behind the min button, centred across the bar. A vertical bar
// too short for its buttons keeps the scroller behind the min button, a horizontal one lets it run
// back over it.
TEST_P(ScrollBarTest, TheScrollerStandsWhereThePositionPutsItOnTheTrack) {
    enum { NONE, MIN, MAX, SCROLLER };
    struct {
        char const *m_case;
        int m_length, m_hidden;
        float m_min, m_max, m_position;
        int m_along, m_vertical_along;
    } const rows[] = {
        {"a third", 200, NONE, 0, 100, 33, 16 + 48, 16 + 48}, // 48.84 truncated
        {"halfway of 50 to 150", 200, NONE, 50, 150, 100, 16 + 74, 16 + 74},
        {"min button hidden", 200, MIN, 0, 100, 50, 82, 82}, // a track of 164
        {"max button hidden", 200, MAX, 0, 100, 50, 16 + 82, 16 + 82},
        {"scroller hidden", 200, SCROLLER, 0, 100, 50, 16 + 74, 16 + 74},
        {"too short, at the maximum", 40, NONE, 0, 100, 100, 16 - 12, 16}, // a track of -12
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_case);
        make_bar(row.m_length);
        CButton *const parts[] = {nullptr, mp_bar->get_button_min(), mp_bar->get_button_max(),
                                  mp_bar->get_button_scroller()};
        if (parts[row.m_hidden]) parts[row.m_hidden]->set_hidden(true);
        mp_bar->set_max(row.m_max);
        mp_bar->set_min(row.m_min);
        mp_bar->set_position(row.m_position);
        mp_bar->set_scroller_for_position();
        EXPECT_EQ((std::vector<int>{GetParam() ? row.m_along : row.m_vertical_along, 3}), // (16 - 10) / 2
                  place_of(mp_bar->get_button_scroller()));
        EXPECT_EQ(row.m_length - 16, place_of(mp_bar->get_button_max())[0]);
        delete mp_bar;
    }
}

// An end button's click is a small step, a press on the track a large step towards the pointer
// (level with the scroller counts towards the maximum), and a step beyond the range is sent all the
// same. A disabled bar's buttons take no click. The steps are 10 and 50 until the range is set,
// then 1% and 10% of it, never more than the range.
TEST_P(ScrollBarTest, EndButtonsAndTrackStepThePositionByTheSmallAndTheLargeStep) {
    make_bar(200);
    events_t events;
    qortest::log_events(mp_bar, {EVENT_SCROLL_SMALL_STEP, EVENT_SCROLL_LARGE_STEP, EVENT_CHANGED}, events);
    struct {
        int m_along, m_across;
        float m_position;
        int m_scroller;
        char const *m_step;
    } const clicks[] = {
        {190, 8, 10, 16 + 14, "EVENT_SCROLL_SMALL_STEP"},  {190, 8, 20, 16 + 29, "EVENT_SCROLL_SMALL_STEP"},
        {5, 8, 10, 16 + 14, "EVENT_SCROLL_SMALL_STEP"},    {5, 8, 0, 16, "EVENT_SCROLL_SMALL_STEP"},
        {5, 8, 0, 16, "EVENT_SCROLL_SMALL_STEP"},          {150, 8, 50, 16 + 74, "EVENT_SCROLL_LARGE_STEP"},
        {40, 8, 0, 16, "EVENT_SCROLL_LARGE_STEP"},         {150, 8, 50, 16 + 74, "EVENT_SCROLL_LARGE_STEP"},
        {90, 1, 100, 16 + 148, "EVENT_SCROLL_LARGE_STEP"}, // level with the scroller, beside it
    };
    for (auto const &row : clicks) {
        SCOPED_TRACE(testing::Message() << "click at " << row.m_along << " to " << row.m_position);
        events.clear();
        click(row.m_along, row.m_across);
        EXPECT_EQ(row.m_position, mp_bar->get_position());
        EXPECT_EQ(row.m_scroller, scroller());
        EXPECT_EQ((events_t{"EVENT_CHANGED", row.m_step}), events);
        EXPECT_FALSE(mp_bar->is_pushed());
    }
    mp_bar->send_event(mp_bar, EVENT_DISABLE, CWndEvent::DISPATCH_NONE);
    click(5);
    EXPECT_EQ(100.0f, mp_bar->get_position());
    mp_bar->set_max(1000);
    EXPECT_EQ((std::vector<float>{10, 100}),
              (std::vector<float>{mp_bar->get_small_step(), mp_bar->get_large_step()}));
    mp_bar->set_min(500);
    mp_bar->set_small_step(2000);
    qortest::CReportCapture capture;
    mp_bar->set_large_step(-1);
    EXPECT_EQ((std::vector<float>{500, 50}),
              (std::vector<float>{mp_bar->get_small_step(), mp_bar->get_large_step()}));
    ASSERT_EQ(1u, capture.asserts().size());
    EXPECT_EQ(0u, capture.asserts()[0].find("Expression:   _val >= 0, \n"));
}

// The drag offset is where the pointer took hold; the movement counts only on the side of it that
// the pointer moves to, so after running past the end the pointer has to come back first.
TEST_P(ScrollBarTest, DraggingTheScrollerMovesThePositionByTheRangeOverTheTrack) {
    make_bar(200);
    events_t events;
    qortest::log_events(mp_bar, {EVENT_CHANGED}, events);
    auto move_to = [this](int _along) {
        GetParam() ? m_world.move_to(10 + _along, 108) : m_world.move_to(108, 10 + _along);
    };
    move_to(20);
    m_world.press();
    move_to(24); // the drag begins: the pointer holds the scroller 8 behind its corner
    std::vector<int> const rows[] = {
        {61, 25, 16 + 37}, // the pointer's place, the position, the scroller's; 37 of 148 is a quarter
        {220, 100, 16 + 148}, {200, 100, 16 + 148},
        {172, 100, 16 + 148}, // past the end, back to the grab point
        {135, 75, 16 + 111},  {98, 50, 16 + 74},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(testing::Message() << "pointer at " << row[0]);
        move_to(row[0]);
        EXPECT_EQ(float(row[1]), mp_bar->get_position());
        EXPECT_EQ((std::vector<int>{row[2], 3}), place_of(mp_bar->get_button_scroller()));
    }
    m_world.release();
    EXPECT_EQ(4u, events.size());
}

// A layout finds the buttons by name and turns the bar only with a boolean; turned, the bar keeps
// its size and takes its thickness from the other side. (The buttons' looks show in the controls'
// golden.)
TEST(ScrollBar, ALayoutFindsTheButtonsByNameAndTurnsTheBar) {
    qortest::CWorld world;
    CWindow *p_wnd = get_windows_factory().Create(HUID("ScrollBar"), &world.desktop(), "bar");
    world.desktop().attach_child(p_wnd);
    CScrollBar *p_bar = class_cast<CScrollBar>(p_wnd);
    ASSERT_NE(nullptr, p_bar);
    qortest::CReportCapture capture;
    qortest::load_state(p_wnd,
                        "{ name = 'bar', class_name = 'ScrollBar', size = { 16, 200 }, is_horizontal = false,"
                        " { name = 'button scroller', class_name = 'Button', size = { 10, 20 } },"
                        " { name = 'button max', class_name = 'Button', size = { 16, 16 } } }");
    p_wnd->send_event(p_wnd, EVENT_RESIZED, CWndEvent::DISPATCH_CHILDREN); // as an import ends
    EXPECT_EQ(3u, p_wnd->get_children_count());
    EXPECT_EQ("3,0 10x20", qortest::place_text(p_bar->get_button_scroller())); // the min button has no size
    EXPECT_EQ("0,184 16x16", qortest::place_text(p_bar->get_button_max()));
    qortest::load_state(p_wnd, "{ name = 'bar', class_name = 'ScrollBar', is_horizontal = 'true' }");
    EXPECT_FALSE(p_bar->get_horizontal());
    EXPECT_TRUE(capture.reports().empty());
    p_bar->set_horizontal(true);
    EXPECT_EQ((std::vector<int>{200, 16, 200}),
              (std::vector<int>{p_bar->get_bar_size(), p_bar->get_w(), p_bar->get_h()}));
}
