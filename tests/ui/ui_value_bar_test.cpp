// Value, progress and scroll bars in the test world: the range and position invariant, the
// normalised position, orientation and bar size, the progress fill, and the scroll bar's layout,
// steps, track presses and scroller drags through the pointer, for both orientations.
#include "ui_value_bar.h"

#include "engine_interfaces.h"
#include "qorscriptsystem.h"
#include "test_support.h"
#include "test_world.h"
#include "ui_button.h"
#include "ui_material.h"
#include "ui_static_text.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

using namespace qorui;

namespace {

typedef std::vector<std::string> events_t;

LuaPlus::LuaObject table(std::string const &_chunk) {
    lua_machine().DoString(("value_bar_probe = " + _chunk).c_str());
    return lua_machine().GetGlobals().GetByName("value_bar_probe");
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Range and position
// ---------------------------------------------------------------------------------------------

TEST(ValueBar, EverySetterKeepsThePositionInsideTheRangeAndOnlyAChangeOfTheArgumentIsSent) {
    enum EOp { MIN, MAX, POSITION };
    float const nan = std::numeric_limits<float>::quiet_NaN();
    struct {
        char const *m_case;
        float m_start; // the position before, in the range 0 to 100
        EOp m_op;
        float m_value;
        float m_min, m_max, m_position;
        size_t m_changed;       // events sent
        size_t m_changed_again; // events sent after the same call once more
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
        auto call = [&] {
            if (row.m_op == MIN) bar.set_min(row.m_value);
            if (row.m_op == MAX) bar.set_max(row.m_value);
            if (row.m_op == POSITION) bar.set_position(row.m_value);
        };
        call();
        EXPECT_EQ(row.m_min, bar.get_min());
        EXPECT_EQ(row.m_max, bar.get_max());
        EXPECT_EQ(row.m_position, bar.get_position());
        EXPECT_EQ(row.m_changed, events.size());
        call();
        EXPECT_EQ(row.m_changed_again, events.size()) << "the same call again";
        EXPECT_EQ(row.m_position, bar.get_position());
    }
}

// The range's width divides the position without the minimum taken off.
TEST(ValueBar, TheNormalisedPositionIsThePositionOverTheRangesWidthCutToOne) {
    struct {
        float m_min, m_max, m_position, m_normalised;
    } const rows[] = {
        {0, 100, 50, 0.5f},  {0, 200, 50, 0.25f}, {50, 150, 100, 1.0f},
        {50, 150, 60, 0.6f}, {20, 20, 20, 0.0f},
    };
    qortest::CWorld world;
    for (auto const &row : rows) {
        SCOPED_TRACE(testing::Message() << row.m_min << ".." << row.m_max << " at " << row.m_position);
        CValueBar bar(&world.desktop(), "bar");
        bar.set_max(row.m_max);
        bar.set_min(row.m_min);
        bar.set_position(row.m_position);
        EXPECT_FLOAT_EQ(row.m_normalised, bar.get_position_normalized());
    }
}

namespace {

// Only a class of the family can break the range: the setters never do.
class CBrokenRange : public CValueBar {
public:
    CBrokenRange(IWindowDesktop *_p_desktop) : CValueBar(_p_desktop, "broken") {
        m_min = 10.0f;
        m_max = 0.0f;
    }
};

} // namespace

TEST(ValueBar, ARangeBelowZeroIsAContractFailureWithNoValue) {
    qortest::CWorld world;
    CBrokenRange bar(&world.desktop());
    qortest::CReportCapture capture;
    EXPECT_EQ(0.0f, bar.get_position_normalized());
    auto const asserts = capture.texts(qordebug::REPORT_ASSERT);
    ASSERT_EQ(1u, asserts.size());
    EXPECT_EQ(0u, asserts[0].find("Expression:   range >= 0, \n")) << asserts[0];
}

// The window keeps its size; only the thickness is read anew from the other side.
TEST(ValueBar, OrientationTakesTheBarSizeFromTheOtherSideAndSwapsNothing) {
    qortest::CWorld world;
    CValueBar *p_bar = world.place(&world.desktop(), new CValueBar(&world.desktop(), "bar"), 0, 0, 200, 12);
    EXPECT_EQ(12, p_bar->get_bar_size());
    events_t events;
    qortest::log_events(p_bar, {EVENT_RESIZE, EVENT_RESIZED}, events);
    p_bar->set_horizontal(false);
    EXPECT_EQ(200, p_bar->get_bar_size());
    EXPECT_EQ(200, p_bar->get_w());
    EXPECT_EQ(12, p_bar->get_h());
    EXPECT_EQ((events_t{"EVENT_RESIZED", "EVENT_RESIZE", "EVENT_RESIZED"}), events);
    p_bar->set_size(30, 90);
    EXPECT_EQ(30, p_bar->get_bar_size());
    EXPECT_EQ(0, CValueBar(&world.desktop(), "fresh").get_bar_size()); // no size yet
}

TEST(ValueBar, OrientationGoesThroughALayoutOnlyAsABoolean) {
    qortest::CWorld world;
    CValueBar bar(&world.desktop(), "bar");
    bar.set_horizontal(false);
    LuaPlus::LuaObject saved;
    saved.AssignNewTable(&lua_machine());
    bar.save_state(saved);
    ASSERT_TRUE(saved.GetByName("is_horizontal").IsBoolean());
    EXPECT_FALSE(saved.GetByName("is_horizontal").GetBoolean());
    CValueBar copy(&world.desktop(), "bar");
    copy.load_state(saved);
    EXPECT_FALSE(copy.get_horizontal());
    qortest::CReportCapture capture;
    for (char const *row : {"is_horizontal = 1", "is_horizontal = 'true'", "is_horizontal = {}"}) {
        SCOPED_TRACE(row);
        LuaPlus::LuaObject layout =
            table(std::string("{ name = 'bar', class_name = 'ValueBar', ") + row + " }");
        copy.load_state(layout);
        EXPECT_FALSE(copy.get_horizontal());
    }
    EXPECT_TRUE(capture.reports().empty());
}

// ---------------------------------------------------------------------------------------------
// Progress bar
// ---------------------------------------------------------------------------------------------

// The fill grows from the left whatever the orientation; its height is the bar size less the
// margins, so a vertical bar fills as high as it is wide.
TEST(ProgressBar, TheFillIsTheNormalisedShareOfTheClientWidthAndTheBarSizeHigh) {
    struct {
        bool m_horizontal;
        int m_w, m_h;
        float m_position;
        CRectArea m_fill;
    } const rows[] = {
        {true, 200, 12, 100, CRectArea(11, 21, 198, 10)},
        {true, 200, 12, 75, CRectArea(11, 21, 148, 10)}, // 75 over the width 100 of 50..150: 148.5
        {false, 12, 100, 100, CRectArea(11, 21, 10, 10)},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(testing::Message() << row.m_w << " by " << row.m_h << " at " << row.m_position);
        qortest::CWorld world;
        world.clock().advance_ms(150); // the desktop has faded in
        CProgressBar *p_bar = world.place(&world.desktop(), new CProgressBar(&world.desktop(), "progress"),
                                          10, 20, row.m_w, row.m_h);
        p_bar->set_horizontal(row.m_horizontal);
        p_bar->set_uniform_margins(1);
        p_bar->set_max(150);
        p_bar->set_min(50);
        p_bar->set_position(row.m_position);
        world.frame();
        std::vector<qortest::CWorld::SDrawn> quads;
        for (auto const &drawn : world.drawn())
            if (drawn.m_op == "quad") quads.push_back(drawn);
        ASSERT_EQ(2u, quads.size());
        EXPECT_EQ(rgba_t(52, 52, 52, 50), quads[0].m_colour); // the body
        EXPECT_EQ(10, quads[0].m_rect.x);
        EXPECT_EQ(row.m_w, quads[0].m_rect.w);
        EXPECT_EQ(rgba_t(252, 252, 252, 200), quads[1].m_colour);
        EXPECT_EQ(row.m_fill.x, quads[1].m_rect.x);
        EXPECT_EQ(row.m_fill.y, quads[1].m_rect.y);
        EXPECT_EQ(row.m_fill.w, quads[1].m_rect.w);
        EXPECT_EQ(row.m_fill.h, quads[1].m_rect.h);
        EXPECT_TRUE(p_bar->is_passive());
    }
}

// ---------------------------------------------------------------------------------------------
// Scroll bar
// ---------------------------------------------------------------------------------------------

namespace {

// A bar 16 thick: end buttons of 16 by 16 and a scroller 10 across and 20 along. The horizontal
// bar stands at (10, 100), the vertical one at (100, 10); at(along, across) is a desktop pixel
// measured from the bar's corner.
class ScrollBarTest : public ::testing::TestWithParam<bool> {
protected:
    CScrollBar *make_bar(int _length, bool _horizontal) {
        mp_bar = new CScrollBar(&m_world.desktop(), "bar");
        point_t const corner = _horizontal ? point_t{10, 100} : point_t{100, 10};
        m_world.place(&m_world.desktop(), mp_bar, corner.x, corner.y, _horizontal ? _length : 16,
                      _horizontal ? 16 : _length);
        mp_bar->set_horizontal(_horizontal);
        mp_bar->get_button_min()->set_size(16, 16);
        mp_bar->get_button_max()->set_size(16, 16);
        mp_bar->get_button_scroller()->set_size(_horizontal ? 20 : 10, _horizontal ? 10 : 20);
        mp_bar->set_scroller_for_position();
        return mp_bar;
    }
    bool horizontal() const { return GetParam(); }
    point_t at(int _along, int _across) const {
        return horizontal() ? point_t{10 + _along, 100 + _across} : point_t{100 + _across, 10 + _along};
    }
    void move_to(int _along, int _across) {
        point_t const p = at(_along, _across);
        m_world.move_to(p.x, p.y);
    }
    void click_at(int _along, int _across) {
        move_to(_along, _across);
        m_world.press();
        m_world.release();
    }
    // The scroller's corner in the bar, as (along, across).
    point_t scroller() const {
        point_t const pos = mp_bar->get_button_scroller()->get_pos();
        return horizontal() ? pos : point_t{pos.y, pos.x};
    }

    qortest::CWorld m_world;
    CScrollBar *mp_bar = nullptr;
};

std::string orientation(testing::TestParamInfo<bool> const &_info) {
    return _info.param ? "Horizontal" : "Vertical";
}

} // namespace

INSTANTIATE_TEST_SUITE_P(BothWays, ScrollBarTest, testing::Bool(), orientation);

// The track is the bar less the scroller and the shown end buttons; the scroller stands the
// position's share of it behind the min button, centred across the bar.
TEST_P(ScrollBarTest, TheScrollerStandsWhereThePositionPutsItOnTheTrack) {
    enum { NONE, MIN, MAX, SCROLLER };
    struct {
        char const *m_case;
        int m_length, m_hidden;
        float m_min, m_max, m_position;
        int m_along;
    } const rows[] = {
        {"at the minimum", 200, NONE, 0, 100, 0, 16},
        {"halfway", 200, NONE, 0, 100, 50, 16 + 74}, // the track is 200 - 20 - 2 * 16 = 148
        {"at the maximum", 200, NONE, 0, 100, 100, 16 + 148},
        {"a third", 200, NONE, 0, 100, 33, 16 + 48}, // 48.84 truncated
        {"halfway of 50 to 150", 200, NONE, 50, 150, 100, 16 + 74},
        {"no range", 200, NONE, 20, 20, 20, 16},
        {"min button hidden", 200, MIN, 0, 100, 50, 82}, // the track is 164
        {"max button hidden", 200, MAX, 0, 100, 50, 16 + 82},
        {"scroller hidden", 200, SCROLLER, 0, 100, 50, 16 + 74},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_case);
        make_bar(row.m_length, horizontal());
        CButton *const parts[] = {nullptr, mp_bar->get_button_min(), mp_bar->get_button_max(),
                                  mp_bar->get_button_scroller()};
        if (parts[row.m_hidden]) parts[row.m_hidden]->set_hidden(true);
        mp_bar->set_max(row.m_max);
        mp_bar->set_min(row.m_min);
        mp_bar->set_position(row.m_position);
        mp_bar->set_scroller_for_position();
        EXPECT_EQ(row.m_along, scroller().x);
        EXPECT_EQ(3, scroller().y); // (16 - 10) / 2
        point_t const max_button = mp_bar->get_button_max()->get_pos();
        EXPECT_EQ(row.m_length - 16, horizontal() ? max_button.x : max_button.y);
        EXPECT_EQ(0, mp_bar->get_button_min()->get_pos().x + mp_bar->get_button_min()->get_pos().y);
    }
}

// A vertical bar too short for its buttons keeps the scroller behind the min button; a horizontal
// one lets the negative track run it back over the min button.
TEST_P(ScrollBarTest, ABarTooShortForItsButtonsStopsTheScrollerOnlyWhenVertical) {
    struct {
        float m_position;
        int m_horizontal_along;
    } const rows[] = {{0, 16}, {50, 16 - 6}, {100, 16 - 12}}; // the track is 40 - 20 - 32 = -12
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_position);
        make_bar(40, horizontal());
        mp_bar->set_position(row.m_position);
        EXPECT_EQ(horizontal() ? row.m_horizontal_along : 16, scroller().x);
    }
}

// One click, one step; a step beyond the range sends EVENT_CHANGED all the same.
TEST_P(ScrollBarTest, TheEndButtonsStepByTheSmallStepAndTheScrollerFollows) {
    make_bar(200, horizontal());
    events_t events;
    qortest::log_events(mp_bar, {EVENT_SCROLL_SMALL_STEP, EVENT_CHANGED}, events);
    struct {
        int m_along;
        float m_position;
        int m_scroller;
    } const rows[] = {
        {190, 10, 16 + 14}, // 10% of 148 is 14.8
        {190, 20, 16 + 29}, {5, 10, 16 + 14}, {5, 0, 16}, {5, 0, 16},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(testing::Message() << "click at " << row.m_along << " to " << row.m_position);
        events.clear();
        click_at(row.m_along, 8);
        EXPECT_EQ(row.m_position, mp_bar->get_position());
        EXPECT_EQ(row.m_scroller, scroller().x);
        EXPECT_EQ((events_t{"EVENT_CHANGED", "EVENT_SCROLL_SMALL_STEP"}), events);
    }
}

// A press on the track is a large step towards the pointer; level with the scroller counts
// towards the maximum. The bar doesn't stay pushed behind the press.
TEST_P(ScrollBarTest, APressOnTheTrackStepsByTheLargeStepTowardsThePointer) {
    struct {
        char const *m_case;
        int m_along, m_across;
        float m_position;
    } const rows[] = {
        {"before the scroller", 40, 8, 0},
        {"behind the scroller", 150, 8, 100},
        {"level with the scroller, beside it", 90, 1, 100},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_case);
        make_bar(200, horizontal());
        mp_bar->set_position(50);
        ASSERT_EQ(90, scroller().x);
        events_t events;
        qortest::log_events(mp_bar, {EVENT_SCROLL_LARGE_STEP, EVENT_CHANGED}, events);
        click_at(row.m_along, row.m_across);
        EXPECT_EQ(row.m_position, mp_bar->get_position());
        EXPECT_EQ((events_t{"EVENT_CHANGED", "EVENT_SCROLL_LARGE_STEP"}), events);
        EXPECT_FALSE(mp_bar->is_pushed());
        delete mp_bar;
    }
}

// The drag offset is where the pointer took hold; the movement counts only on the side of it that
// the pointer moves to, so after running past the end the pointer has to come back first.
TEST_P(ScrollBarTest, DraggingTheScrollerMovesThePositionByTheRangeOverTheTrack) {
    make_bar(200, horizontal());
    events_t events;
    qortest::log_events(mp_bar, {EVENT_CHANGED}, events);
    move_to(20, 8);
    m_world.press();
    move_to(24, 8); // the drag begins: the pointer holds the scroller 8 behind its corner
    struct {
        int m_along;
        float m_position;
        int m_scroller;
    } const rows[] = {
        {61, 25, 16 + 37},    // 37 pixels of 148 are a quarter of the range
        {220, 100, 16 + 148}, // beyond the end
        {200, 100, 16 + 148}, // coming back, still behind the grab point at 172
        {172, 100, 16 + 148}, // on it
        {135, 75, 16 + 111},  {98, 50, 16 + 74},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(testing::Message() << "pointer at " << row.m_along);
        move_to(row.m_along, 8);
        EXPECT_EQ(row.m_position, mp_bar->get_position());
        EXPECT_EQ(row.m_scroller, scroller().x);
        EXPECT_EQ(3, scroller().y);
    }
    m_world.release();
    EXPECT_EQ(4u, events.size());
    EXPECT_FALSE(mp_bar->get_button_scroller()->is_pushed());
}

TEST_P(ScrollBarTest, TheStepsFollowTheRangeAndAreCutToIt) {
    make_bar(200, horizontal());
    EXPECT_EQ(10.0f, mp_bar->get_small_step());
    EXPECT_EQ(50.0f, mp_bar->get_large_step());
    mp_bar->set_max(1000);
    EXPECT_EQ(10.0f, mp_bar->get_small_step());
    EXPECT_EQ(100.0f, mp_bar->get_large_step());
    mp_bar->set_min(500);
    EXPECT_EQ(5.0f, mp_bar->get_small_step());
    EXPECT_EQ(50.0f, mp_bar->get_large_step());
    mp_bar->set_small_step(2000);
    EXPECT_EQ(500.0f, mp_bar->get_small_step());
    qortest::CReportCapture capture;
    mp_bar->set_large_step(-1);
    EXPECT_EQ(50.0f, mp_bar->get_large_step());
    auto const asserts = capture.texts(qordebug::REPORT_ASSERT);
    ASSERT_EQ(1u, asserts.size());
    EXPECT_EQ(0u, asserts[0].find("Expression:   _val >= 0, \n")) << asserts[0];
}

TEST_P(ScrollBarTest, EnablingAndDisablingTheBarReachTheButtonsInOrder) {
    make_bar(200, horizontal());
    events_t events;
    for (CButton *p_button :
         {mp_bar->get_button_min(), mp_bar->get_button_max(), mp_bar->get_button_scroller()})
        p_button->register_callback(EVENT_DISABLE, CEventCallback([&events, p_button](CWndEvent const *) {
                                        events.push_back(p_button->get_name());
                                    }));
    mp_bar->send_event(mp_bar, EVENT_DISABLE, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ((events_t{"button min", "button max", "button scroller"}), events);
    click_at(190, 8);
    EXPECT_EQ(0.0f, mp_bar->get_position());
    mp_bar->send_event(mp_bar, EVENT_ENABLE, CWndEvent::DISPATCH_NONE);
    click_at(190, 8);
    EXPECT_EQ(10.0f, mp_bar->get_position());
}

// ---------------------------------------------------------------------------------------------
// Scroll bar: materials and layouts
// ---------------------------------------------------------------------------------------------

TEST(ScrollBar, EachButtonOwnsACloneOfTheDesktopsMaterialsThatExist) {
    qortest::CWorld world;
    world.desktop().add_material(MAT_NAME_BUTTON_UP, world.colour(1, 0, 0));
    world.desktop().add_material(MAT_NAME_BUTTON_DOWN_PUSHED, world.colour(2, 0, 0));
    world.desktop().add_material(MAT_NAME_BUTTON_SCROLLER_HIGHLIGHTED, world.colour(3, 0, 0));
    CScrollBar bar(&world.desktop(), "bar");
    struct {
        CButton *mp_button;
        HUID const &m_id;
        int m_red; // -1: none
    } const rows[] = {
        {bar.get_button_min(), MAT_NAME_NORMAL, 1},           {bar.get_button_min(), MAT_NAME_PUSHED, -1},
        {bar.get_button_max(), MAT_NAME_PUSHED, 2},           {bar.get_button_max(), MAT_NAME_NORMAL, -1},
        {bar.get_button_scroller(), MAT_NAME_HIGHLIGHTED, 3},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(testing::Message() << row.mp_button->get_name() << " " << row.m_id.GetName());
        CMaterial *p_material = row.mp_button->get_material(row.m_id);
        if (row.m_red < 0) {
            EXPECT_EQ(nullptr, p_material);
            continue;
        }
        ASSERT_NE(nullptr, p_material);
        EXPECT_EQ(row.m_red, p_material->get_color().r);
    }
    EXPECT_NE(world.desktop().get_material(MAT_NAME_BUTTON_UP),
              bar.get_button_min()->get_material(MAT_NAME_NORMAL));
    EXPECT_EQ(0, bar.get_button_min()->get_w()); // sized to the bar size of a fresh bar
}

TEST(ScrollBar, ALayoutWithoutTheButtonsKeepsThemAndOneNamingThemSizesThem) {
    qortest::CWorld world;
    CWindow *p_bar = get_windows_factory().Create(HUID("ScrollBar"), &world.desktop(), "bar");
    ASSERT_NE(nullptr, class_cast<CScrollBar>(p_bar));
    CScrollBar *p_scroll = class_cast<CScrollBar>(p_bar);
    world.desktop().attach_child(p_bar);
    qortest::CReportCapture capture;
    LuaPlus::LuaObject bare =
        table("{ name = 'bar', class_name = 'ScrollBar', size = { 16, 200 }, is_horizontal = false }");
    p_bar->load_state(bare);
    EXPECT_EQ(3u, p_bar->get_children_count());
    EXPECT_FALSE(p_scroll->get_horizontal());
    EXPECT_EQ(16, p_scroll->get_bar_size());
    LuaPlus::LuaObject named =
        table("{ name = 'bar', class_name = 'ScrollBar',"
              " { name = 'button scroller', class_name = 'Button', size = { 10, 20 } },"
              " { name = 'button max', class_name = 'Button', size = { 16, 16 } } }");
    p_bar->load_state(named);
    p_bar->send_event(p_bar, EVENT_RESIZED, CWndEvent::DISPATCH_CHILDREN); // as an import ends
    EXPECT_EQ(3u, p_bar->get_children_count());
    EXPECT_EQ(10, p_scroll->get_button_scroller()->get_w());
    EXPECT_EQ(3, p_scroll->get_button_scroller()->get_pos().x);
    EXPECT_EQ(0, p_scroll->get_button_scroller()->get_pos().y); // the min button has no size
    EXPECT_EQ(184, p_scroll->get_button_max()->get_pos().y);
    EXPECT_TRUE(capture.reports().empty());
}

TEST(ControlsFactory, MakesEachClassByItsName) {
    qortest::CWorld world;
    struct {
        char const *m_name;
        char *m_id;
    } const rows[] = {{"StaticText", CStaticText::class_id()},   {"ValueBar", CValueBar::class_id()},
                      {"ProgressBar", CProgressBar::class_id()}, {"ScrollBar", CScrollBar::class_id()},
                      {"Button", CButton::class_id()},           {"CheckBox", CCheckBox::class_id()},
                      {"RadioButton", CRadioButton::class_id()}};
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_name);
        CWindow *p_wnd = get_windows_factory().Create(HUID(row.m_name), &world.desktop(), "made");
        ASSERT_NE(nullptr, p_wnd);
        EXPECT_NE(nullptr, p_wnd->find_class_by_id(row.m_id));
        EXPECT_STREQ(row.m_name, p_wnd->get_class_id().GetName());
        delete p_wnd;
    }
}
