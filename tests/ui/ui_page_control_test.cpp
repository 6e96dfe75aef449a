// The page control through the desktop's input path: switching pages from anywhere, disabled pages,
// a switch's events, the layout of both orientations, contracts, a deleted page, and layouts.
#include "ui_page_control.h"

#include "engine_interfaces.h"
#include "test_world.h"
#include "ui_button.h"

#include <gtest/gtest.h>

#include <functional>
#include <sstream>

using namespace qorui;

namespace {

char const *const k_names[] = {"video", "audio", "keys"};

// Opens the protected parts, to break the control's invariants on purpose.
class CProbe : public CPageControl {
public:
    using CPageControl::CPageControl;
    using CPageControl::m_active_page_idx;
    using CPageControl::m_tabs;
    using CPageControl::on_event_tab_click;
};

class PageControlTest : public ::testing::Test {
protected:
    void SetUp() override {
        mp_control =
            m_world.place(&m_world.desktop(), new CProbe(&m_world.desktop(), "options"), 10, 20, 300, 200);
        for (char const *p_name : k_names)
            add_page(p_name);
    }
    // The page and its tab, which add_page attaches last.
    void add_page(char const *_name) {
        m_pages.push_back(mp_control->add_page(_name));
        m_tabs.push_back(class_cast<CButton>(mp_control->get_child(mp_control->get_children_count() - 1)));
    }
    void click_tab(int _idx) {
        m_world.click_at(m_tabs[_idx]->get_global_pos().x + 2, m_tabs[_idx]->get_global_pos().y + 2);
    }
    void send(int _page, EEventType _id) {
        m_world.desktop().send_event(m_pages[_page], _id, CWndEvent::DISPATCH_NONE);
    }
    // Page _shown alone is visible and its tab alone checked; -1: none is shown, and the tabs are
    // not looked at (the tab of a disabled active page stays checked).
    void expect_shown(int _shown, char const *_when) {
        SCOPED_TRACE(_when);
        for (int i = 0; i < (int)m_pages.size(); ++i) {
            EXPECT_EQ(i != _shown, m_pages[i]->is_hidden()) << i;
            if (_shown != -1) {
                EXPECT_EQ(i == _shown, m_tabs[i]->is_checked()) << i;
            }
        }
        EXPECT_EQ(_shown == -1 ? nullptr : m_pages[_shown], mp_control->get_active_page());
    }

    qortest::CWorld m_world;
    CProbe *mp_control = nullptr;
    std::vector<CWindowVisual *> m_pages;
    std::vector<CButton *> m_tabs;
};

} // namespace

// One control through a run of steps; after each, exactly the expected page is shown.
TEST_F(PageControlTest, EveryWayOfShowingAPageSwitchesToItAlone) {
    enum EStep { CLICK, SHOW, SET, ENABLE, DISABLE, ADD };
    struct {
        char const *m_what;
        EStep m_step;
        int m_idx, m_shown;
    } const steps[] = {
        {"a click on a tab", CLICK, 2, 2},
        {"a click on the tab of the shown page", CLICK, 2, 2},
        {"a show from the desktop", SHOW, 1, 1},
        {"set_active_page", SET, 0, 0},
        {"the active page disabled", DISABLE, 0, -1},
        {"a click on its disabled tab", CLICK, 0, -1},
        {"a click on another tab", CLICK, 1, 1},
        {"the page enabled again: its tab only", ENABLE, 0, 1},
        {"a click on its enabled tab", CLICK, 0, 0},
        {"a page disabled while hidden", DISABLE, 2, 0},
        {"a show of the disabled page", SHOW, 2, 2},
        {"a click on another tab", CLICK, 1, 1},
        {"that page disabled too", DISABLE, 1, -1},
        {"a page added then: the first one shows", ADD, 0, 0},
        {"a click on the added tab of the first page's name", CLICK, 3, 0},
    };
    std::function<void(int)> const act[] = {
        [this](int _idx) { click_tab(_idx); },
        [this](int _idx) { send(_idx, EVENT_SHOW); },
        [this](int _idx) { mp_control->set_active_page(_idx); },
        [this](int _idx) { send(_idx, EVENT_ENABLE); },
        [this](int _idx) { send(_idx, EVENT_DISABLE); },
        [this](int _idx) { add_page(k_names[_idx]); },
    };
    expect_shown(0, "the first page added");
    for (auto const &step : steps) {
        act[step.m_step](step.m_idx);
        expect_shown(step.m_shown, step.m_what);
    }
}

// The switch runs in the page's show callback, before anyone registered later hears the show; the
// new page is activated with its children, the old one only hidden.
TEST_F(PageControlTest, ASwitchHidesTheOldPageAndActivatesTheNewOneWithItsChildren) {
    CWindow *p_content =
        m_world.place(m_pages[2], new CWindowVisual(&m_world.desktop(), "content"), 0, 0, 9, 9);
    qortest::CEventLog log;
    for (CWindow *p_wnd : {(CWindow *)m_pages[0], (CWindow *)m_pages[1], (CWindow *)m_pages[2], p_content})
        log.watch(p_wnd, {EVENT_HIDE, EVENT_SHOW, EVENT_ACTIVATE, EVENT_DEACTIVATE});
    click_tab(2);
    EXPECT_EQ((std::vector<std::string>{"video:EVENT_HIDE", "keys:EVENT_SHOW", "keys:EVENT_ACTIVATE",
                                        "content:EVENT_ACTIVATE"}),
              log.take());
}

// One control through the rows in turn: each row sets everything that its layout depends on, but
// an unknown orientation lays nothing out and leaves the layout of the row before. A tab size acts
// on later tabs, each moving on by its own width, while the pages follow it at once.
TEST_F(PageControlTest, TabsAndPagesStandWhereTheOrientationAndAlignmentPutThem) {
    struct {
        char const *m_case;
        int m_orientation;
        EAlignment m_alignment;
        int m_margin, m_tabs_interval;
        int m_tab_x[3], m_tab_y[3];
        char const *m_page;
    } const rows[] = {
        {"horizontal", 0, ALIGNMENT_LEFT, 0, 8, {0, 72, 144}, {0, 0, 0}, "0,40 300x160"},
        {"orientation 2: none", 2, ALIGNMENT_LEFT, 5, 4, {0, 72, 144}, {0, 0, 0}, "0,40 300x160"},
        {"horizontal, bottom ignored", 0, ALIGNMENT_BOTTOM, 5, 8, {5, 77, 149}, {5, 5, 5}, "5,45 290x150"},
        {"vertical", 1, ALIGNMENT_RIGHT, 0, 8, {0, 0, 0}, {0, 40, 80}, "72,0 228x200"},
        // 200 - (32 + 4) * 3 - 5
        {"vertical at the bottom", 1, ALIGNMENT_BOTTOM, 5, 4, {5, 5, 5}, {87, 123, 159}, "77,5 218x190"},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_case);
        mp_control->set_tabs_orientation(static_cast<CPageControl::ETabsOrientation>(row.m_orientation));
        mp_control->set_tabs_alignment(row.m_alignment);
        mp_control->set_tabs_interval(row.m_tabs_interval);
        mp_control->set_uniform_margins(row.m_margin);
        for (int i = 0; i < 3; ++i) {
            EXPECT_EQ(qortest::rect_text(CRectArea(row.m_tab_x[i], row.m_tab_y[i], 64, 32)),
                      qortest::place_text(m_tabs[i]))
                << i;
            EXPECT_EQ(row.m_page, qortest::place_text(m_pages[i])) << i;
        }
    }
    mp_control->set_tabs_orientation(CPageControl::TABS_HORIZONTAL);
    mp_control->set_uniform_margins(0);
    mp_control->set_tabs_interval(8);
    mp_control->set_tab_size(50, 20);
    mp_control->set_tabs_pages_interval(8);
    add_page("extra");
    add_page("more");
    EXPECT_EQ("0,28 300x172", qortest::place_text(m_pages[0])); // 0 + 20 + 8
    EXPECT_EQ("72,0 64x32", qortest::place_text(m_tabs[1]));
    EXPECT_EQ("216,0 50x20", qortest::place_text(m_tabs[3])); // 3 * (64 + 8)
    EXPECT_EQ("274,0 50x20", qortest::place_text(m_tabs[4])); // + 50 + 8
}

// Bad indices, a stranger's click, and pairs out of step are reported; the first page stays shown.
TEST_F(PageControlTest, BrokenContractsAreReportedAndChangeNothing) {
    CButton *p_stranger =
        m_world.place(&m_world.desktop(), new CButton(&m_world.desktop(), "stranger"), 0, 0, 8, 8);
    p_stranger->register_callback(EVENT_CLICK, CEventCallback(mp_control, &CProbe::on_event_tab_click));
    struct {
        char const *m_expression;
        std::function<void()> m_break;
    } const rows[] = {
        {"_idx >= 0 && _idx < (int)m_pages.size()", [this] { mp_control->set_active_page(3); }},
        {"_idx >= 0 && _idx < (int)m_pages.size()", [this] { mp_control->set_active_page(-1); }},
        {"idx != -1", [this] { m_world.click_at(2, 2); }},
        {"_p_event && _p_event->get_receiver()", [this] { mp_control->on_event_tab_click(nullptr); }},
        {"m_active_page_idx >= 0 && m_active_page_idx < (int)m_pages.size()",
         [this] {
             mp_control->m_active_page_idx = 7;
             EXPECT_EQ(nullptr, mp_control->get_active_page());
             mp_control->m_active_page_idx = 0;
         }},
        {"m_pages.size() == m_tabs.size()",
         [this] { mp_control->m_tabs.push_back(nullptr), mp_control->set_active_page(1); }},
        {"p_tab", [this] { mp_control->m_tabs.push_back(nullptr), mp_control->set_tabs_interval(8); }},
    };
    for (auto const &row : rows) {
        qortest::CReportCapture capture;
        row.m_break();
        ASSERT_FALSE(capture.asserts().empty()) << row.m_expression;
        EXPECT_EQ(0u, capture.asserts()[0].find(std::string("Expression:   ") + row.m_expression + ", \n"))
            << capture.asserts()[0];
        mp_control->m_tabs.resize(m_tabs.size()); // the pairs in step again
        expect_shown(0, row.m_expression);
    }
}

// The tabs after the deleted page's close up, and the switch goes on working.
TEST_F(PageControlTest, ADeletedPageTakesItsTabOutOfTheStrip) {
    click_tab(2);
    CButton *p_audio_tab = m_tabs[1];
    delete m_pages[1];
    m_pages.erase(m_pages.begin() + 1);
    m_tabs.erase(m_tabs.begin() + 1);
    EXPECT_TRUE(p_audio_tab->is_hidden());
    EXPECT_EQ(72, m_tabs[1]->get_pos().x); // "keys" moves up to the place of "audio"
    expect_shown(1, "after the deletion");
    click_tab(0);
    expect_shown(0, "a click on the first tab");
}

// Out to a layout table, into an empty desktop, where the factory makes the control, its pages
// and its tabs, and out again: the same text, and the tabs switch pages.
TEST(PageControlPersistence, ALayoutComesBackIntoAnEmptyDesktopWorkingAndUnchanged) {
    std::ostringstream saved, again;
    LuaPlus::LuaObject table = qortest::new_table();
    {
        qortest::CWorld world;
        CPageControl *p_control =
            world.place(&world.desktop(), new CPageControl(&world.desktop(), "options"), 10, 20, 300, 200);
        for (char const *p_name : k_names)
            p_control->add_page(p_name);
        world.place(p_control->get_child("audio", "WindowVisual", true),
                    new CCheckBox(&world.desktop(), "mute"), 4, 4, 80, 16);
        world.click_at(95, 25); // the audio tab
        world.click_at(20, 70); // the mute box: its page comes to the front of the control's children
        world.desktop().save_state(table);
    }
    qortest::CWorld world;
    world.desktop().load_state(table);
    auto *p_control = class_cast<CPageControl>(world.desktop().get_child("options", "PageControl", true));
    ASSERT_NE(nullptr, p_control);
    EXPECT_EQ(p_control->get_child("video", "WindowVisual", true), p_control->get_active_page());
    world.click_at(170, 25); // the keys tab
    for (char const *p_name : k_names)
        EXPECT_EQ(p_name != k_names[2], p_control->get_child(p_name, "WindowVisual", true)->is_hidden());
    EXPECT_EQ(p_control->get_child("keys", "WindowVisual", true), p_control->get_active_page());
    table.dump("ui_windows_ini", saved);
    qortest::saved_state(&world.desktop()).dump("ui_windows_ini", again);
    EXPECT_EQ(saved.str(), again.str());
}
