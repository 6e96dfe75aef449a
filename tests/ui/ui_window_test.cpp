// The window tree on the test world's desktop: routing and filtering of events, the tree's order,
// geometry and alignment, deletion, and the layout tables of windows.
#include "ui_window.h"

#include "qorbase.h"
#include "test_world.h"

#include <gtest/gtest.h>

#include <sstream>

using namespace qorui;
using qortest::lua_table;

namespace {

typedef std::vector<std::string> lines_t;

// root [a [a1, a2], b] on the desktop; _watched events of each are logged.
class WindowTest : public ::testing::Test {
protected:
    void make_tree(std::vector<EEventType> const &_watched) {
        mp_root = make(&m_world.desktop(), "root", _watched);
        mp_a = make(mp_root, "a", _watched);
        mp_a1 = make(mp_a, "a1", _watched);
        mp_a2 = make(mp_a, "a2", _watched);
        mp_b = make(mp_root, "b", _watched);
        m_log.take();
    }
    CWindow *make(CWindow *_p_parent, char const *_name, std::vector<EEventType> const &_watched = {}) {
        CWindow *p_wnd = new CWindow(&m_world.desktop(), _name);
        m_log.watch(p_wnd, _watched);
        _p_parent->attach_child(p_wnd);
        return p_wnd;
    }
    // Each window named with the event, in the order given.
    static lines_t each(std::vector<char const *> const &_names, EEventType _id) {
        lines_t lines;
        for (char const *p_name : _names)
            lines.push_back(std::string(p_name) + ":" + qortest::event_name(_id));
        return lines;
    }

    qortest::CWorld m_world;
    qortest::CEventLog m_log;
    CWindow *mp_root = nullptr, *mp_a = nullptr, *mp_a1 = nullptr, *mp_a2 = nullptr, *mp_b = nullptr;
};

// The events that pass a window with the given flags, found by sending each one.
std::vector<int> passing_events(CDesktop *_p_desktop, bool _hidden, bool _disabled) {
    std::vector<int> passed;
    for (int id = EVENT_UPDATE; id <= EVENT_RESOURCE_INVALIDATE; ++id) {
        if (id == 29 || id == 30) continue; // no events of these values
        CWindow window(_p_desktop, "probe");
        window.set_hidden(_hidden);
        window.set_disabled(_disabled);
        bool taken = false;
        window.register_callback(static_cast<EEventType>(id),
                                 CEventCallback([&](CWndEvent const *) { taken = true; }));
        CWndEvent event(static_cast<EEventType>(id));
        if (id == EVENT_DRAG || id == EVENT_REPORT_POINT_INSIDE)
            event << point_t{-1, -1};
        else
            event << 0 << 0; // enough for the handlers that read
        window.send_event(&window, &event, CWndEvent::DISPATCH_NONE);
        if (taken) passed.push_back(id);
    }
    return passed;
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Routing and filtering
// ---------------------------------------------------------------------------------------------

TEST_F(WindowTest, DispatchTypesDefaultHandlersAndHiddenWindowsDecideWhereAnEventGoes) {
    make_tree({EVENT_CLICK, EVENT_UPDATE, EVENT_DRAW, EVENT_LOST_FOCUS, EVENT_RESOURCE_INVALIDATE});
    mp_root->send_event(mp_root, EVENT_CLICK, CWndEvent::DISPATCH_CHILDREN); // back to front, depth first
    EXPECT_EQ(each({"root", "a", "a1", "a2", "b"}, EVENT_CLICK), m_log.take());
    lines_t activators;
    for (CWindow *p_wnd : {mp_a, mp_root})
        p_wnd->register_callback(EVENT_CLICK, CEventCallback([&activators](CWndEvent const *p_event) {
                                     activators.push_back(p_event->get_activator()->get_name());
                                 }));
    mp_b->send_event(mp_a2, EVENT_CLICK, CWndEvent::DISPATCH_PARENT);
    EXPECT_EQ(each({"a2", "a", "root"}, EVENT_CLICK), m_log.take());
    EXPECT_EQ((lines_t{"a", "root"}), activators); // each parent sends on as activator
    for (EEventType id : {EVENT_UPDATE, EVENT_DRAW, EVENT_LOST_FOCUS, EVENT_RESOURCE_INVALIDATE}) {
        mp_root->send_event(mp_root, id, CWndEvent::DISPATCH_NONE);
        EXPECT_EQ(each({"root", "a", "a1", "a2", "b"}, id), m_log.take());
    }
    // A handler that stores type 0 stops its own subtree only; so does a hidden window.
    mp_a->register_callback(EVENT_UPDATE, CEventCallback([](CWndEvent const *p_event) {
                                p_event->set_dispatch_type(CWndEvent::DISPATCH_NONE);
                            }));
    mp_root->send_event(mp_root, EVENT_UPDATE, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ(each({"root", "a", "b"}, EVENT_UPDATE), m_log.take());
    mp_a->set_pos(10, 20);
    mp_a1->set_pos(1, 2);
    mp_a->set_hidden(true);
    mp_root->send_event(mp_root, EVENT_DRAW, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ(each({"root", "b"}, EVENT_DRAW), m_log.take());
    mp_a->set_pos(30, 30); // resized passes hidden windows: the subtree's global positions follow
    EXPECT_EQ(31, mp_a1->get_global_pos().x);
    point_t const local = mp_a1->convert_to_local(point_t{40, 40});
    EXPECT_EQ(9, local.x);
    EXPECT_EQ(8, local.y);
}

TEST_F(WindowTest, HiddenAndDisabledWindowsTakeOnlyTheirListedEvents) {
    CDesktop *p_desktop = &m_world.desktop();
    EXPECT_EQ((std::vector<int>{EVENT_UPDATE, EVENT_SHOW, EVENT_ENABLE, EVENT_DISABLE, EVENT_RESIZED,
                                EVENT_SET_TEXT, EVENT_RESOURCE_INVALIDATE}),
              passing_events(p_desktop, true, false));
    EXPECT_EQ(
        (std::vector<int>{EVENT_DRAW, EVENT_HIDE, EVENT_SHOW, EVENT_ACTIVATE, EVENT_ENABLE, EVENT_RESIZED,
                          EVENT_REPORT_POINT_INSIDE, EVENT_CHANGED, EVENT_RESOURCE_INVALIDATE}),
        passing_events(p_desktop, false, true));
    EXPECT_EQ(42u, passing_events(p_desktop, false, false).size());
}

// ---------------------------------------------------------------------------------------------
// The tree
// ---------------------------------------------------------------------------------------------

// Modal windows stay on top; lookups take direct children first, then depth first, by exact name;
// a passive parent passes its state down to a child attached to it.
TEST_F(WindowTest, AttachingOrdersLookupAndPassiveStateFollowTheTree) {
    make_tree({EVENT_RESOURCE_INVALIDATE});
    CWindow *p_top = make(mp_root, "top");
    p_top->set_is_modal(true);
    mp_root->attach_child(mp_a);
    qor_vector<CWindow *> all;
    mp_root->get_children(all);
    EXPECT_EQ((qor_vector<CWindow *>{mp_b, mp_a, mp_a1, mp_a2, p_top}), all);
    EXPECT_EQ(each({"a", "a1", "a2"}, EVENT_RESOURCE_INVALIDATE), m_log.take()); // resources looked up
    qortest::CReportCapture capture;
    mp_root->bring_to_front(mp_a1); // not a child of root
    EXPECT_EQ(1u, capture.asserts().size());

    CWindow *p_deep_b = make(mp_a1, "b");
    EXPECT_EQ(mp_b, mp_root->get_child("b", "Window", false));
    EXPECT_EQ(nullptr, mp_root->get_child("b", "WindowVisual", false));
    EXPECT_EQ(nullptr, mp_root->get_child("a2", nullptr, true));
    EXPECT_EQ(p_deep_b, mp_a->get_child("b", nullptr, false));
    EXPECT_EQ(nullptr, mp_root->get_child("B", nullptr, false));

    p_top->set_passive(true);
    mp_root->detach_child(mp_a);
    p_top->attach_child(mp_a);
    EXPECT_TRUE(mp_a1->is_passive());
    mp_a1->set_passive(false);
    mp_a->set_passive(true); // unchanged: visits nobody
    EXPECT_FALSE(mp_a1->is_passive());
}

// The desktop forgets a deleted window: activation goes back, and keys find no stale receiver.
TEST_F(WindowTest, DeletingAWindowDeletesItsSubtreeAndTheDesktopForgetsIt) {
    make_tree({});
    m_world.desktop().set_active_window(mp_b);
    m_world.desktop().set_active_window(mp_a1);
    mp_a1->input_subscribe(true);
    delete mp_a;
    EXPECT_EQ(1u, mp_root->get_children_count());
    EXPECT_EQ(mp_b, m_world.desktop().get_active_window());
    m_world.key(0x41);
    // Hidden with auto delete, a window is queued and goes at the next update.
    mp_b->set_auto_delete(true);
    mp_b->send_event(mp_b, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ(1u, mp_root->get_children_count());
    m_world.desktop().update(0);
    EXPECT_EQ(0u, mp_root->get_children_count());
}

// ---------------------------------------------------------------------------------------------
// Geometry
// ---------------------------------------------------------------------------------------------

TEST_F(WindowTest, DragMaximiseAndResizeGoThroughTheHandlersAndTheConstraints) {
    make_tree({EVENT_RESIZE, EVENT_RESIZED});
    mp_root->set_size(300, 200);
    mp_b->set_size(20, 10);
    CWndEvent drag(EVENT_DRAG);
    drag << point_t{3, -4};
    mp_b->send_event(mp_b, &drag, CWndEvent::DISPATCH_NONE); // not draggable
    mp_b->set_can_drag(true);
    mp_b->send_event(mp_b, &drag, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ("3,-4 20x10", qortest::place_text(mp_b));
    mp_b->set_maximaized(true);
    EXPECT_EQ("0,0 300x200", qortest::place_text(mp_b));
    mp_root->set_size(400, 250);
    EXPECT_EQ("0,0 400x250", qortest::place_text(mp_b));
    mp_b->set_maximaized(false);
    EXPECT_EQ("3,-4 20x10", qortest::place_text(mp_b));

    m_log.take();
    mp_a->set_size(-5, 30);
    EXPECT_EQ(0, mp_a->get_w());
    lines_t expected = {"a:EVENT_RESIZE"}; // only the window; resized spreads
    for (std::string const &line : each({"a", "a1", "a2"}, EVENT_RESIZED))
        expected.push_back(line);
    EXPECT_EQ(expected, m_log.take());
    mp_a->set_constraints(SConstraints{0, 40, 0, 0});
    mp_a->set_size(100, 30);
    EXPECT_EQ(40, mp_a->get_w());
    mp_a->set_can_resize(false);
    mp_a->set_size(10, 10);
    EXPECT_EQ(40, mp_a->get_w());
    mp_a->set_hidden(true); // the filter keeps resize from the handler: the size goes through
    mp_a->set_size(10, 10);
    EXPECT_EQ(10, mp_a->get_w());
    mp_b->register_callback(EVENT_RESIZE, CEventCallback([](CWndEvent const *p_event) {
                                p_event->get<int>() *= 2; // corrected in place
                            }));
    mp_b->set_size(21, 7);
    EXPECT_EQ(42, mp_b->get_w());
}

TEST_F(WindowTest, EachAlignmentPlacesAndSizesInTheParentsClientArea) {
    make_tree({});
    mp_root->set_size(101, 81);
    struct {
        EAlignment m_alignment;
        char const *mp_place;
    } const rows[] = {
        {ALIGNMENT_NONE, "7,9 50x21"},     {ALIGNMENT_TOP, "0,0 101x21"},
        {ALIGNMENT_LEFT, "0,0 50x81"},     {ALIGNMENT_RIGHT, "51,0 50x81"},
        {ALIGNMENT_BOTTOM, "0,60 101x21"}, {ALIGNMENT_CENTER, "25,30 50x21"},
        {ALIGNMENT_CLIENT, "0,0 101x81"},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(g_alignment_names[row.m_alignment]);
        mp_b->set_alignment(ALIGNMENT_NONE);
        mp_b->set_pos(7, 9);
        mp_b->set_size(50, 21);
        mp_b->set_alignment(row.m_alignment);
        EXPECT_EQ(row.mp_place, qortest::place_text(mp_b));
    }
    mp_root->set_size(200, 100); // children follow their parent's size
    EXPECT_EQ(200, mp_b->get_w());
    mp_b->set_alignment(ALIGNMENT_NONE);
    mp_b->set_constraints(SConstraints{0, 30, 0, 0});
    mp_b->set_alignment(ALIGNMENT_CENTER); // placed by its constrained size
    EXPECT_EQ(85, mp_b->get_pos().x);
}

// A click activates the window the hit test found: disabled windows are found too, and the left
// and top edges lie inside, the right and bottom ones outside.
TEST_F(WindowTest, TheHitTestFindsTheDeepestWindowInsideItsEdges) {
    make_tree({});
    mp_a->set_pos(10, 10);
    mp_a->set_size(5, 5);
    mp_a1->set_size(2, 2);
    mp_a->set_disabled(true);
    CWindow *const p_desktop = &m_world.desktop();
    struct {
        int m_x, m_y;
        CWindow *mp_expected;
    } const rows[] = {{10, 10, mp_a1},     {14, 14, mp_a},     {15, 10, p_desktop},
                      {10, 15, p_desktop}, {9, 10, p_desktop}, {10, 9, p_desktop}};
    for (auto const &row : rows) {
        SCOPED_TRACE(std::to_string(row.m_x) + ", " + std::to_string(row.m_y));
        m_world.click_at(row.m_x, row.m_y);
        EXPECT_EQ(row.mp_expected, m_world.desktop().get_active_window());
    }
}

// ---------------------------------------------------------------------------------------------
// Layouts
// ---------------------------------------------------------------------------------------------

std::string dumped(LuaPlus::LuaObject const &_table) {
    std::ostringstream out;
    _table.dump("ui_windows_ini", out);
    return out.str();
}

TEST_F(WindowTest, ATreeSavedAndLoadedComesBackTheSameAndBadKeysLeaveValuesAlone) {
    mp_root = make(&m_world.desktop(), "root");
    CWindow *p_panel = m_world.place(mp_root, new CWindow(&m_world.desktop(), "panel"), 10, 20, 300, 200);
    p_panel->set_can_drag(true);
    p_panel->set_alignment(ALIGNMENT_CENTER);
    make(p_panel, "ok")->set_is_modal(true);
    LuaPlus::LuaObject table = qortest::saved_state(mp_root);
    EXPECT_EQ(11, table.GetTableCount()); // a child goes behind the ten keys of a window
    EXPECT_STREQ("ALIGNMENT_CENTER", table.GetByIndex(11).GetByName("alignment").GetString());
    CWindow *p_fresh = make(&m_world.desktop(), "root");
    p_fresh->load_state(table);
    p_fresh->load_state(table); // the second load finds every window and makes none
    ASSERT_EQ(1u, p_fresh->get_children_count());
    CWindow *p_ok = p_fresh->get_child("ok", "Window", false);
    ASSERT_NE(nullptr, p_ok);
    EXPECT_TRUE(p_ok->is_always_on_top());
    EXPECT_EQ(dumped(table), dumped(qortest::saved_state(p_fresh)));

    qortest::load_state(p_fresh, "{ name = 'root', class_name = 'Window', pos = 5, size = { 7.9, -3.7 },"
                                 " can_drag = 'yes', alignment = 'alignment_client', is_modal = 1 }");
    EXPECT_EQ("0,0 7x0", qortest::place_text(p_fresh)); // truncated toward zero
    EXPECT_FALSE(p_fresh->is_can_drag());
    EXPECT_EQ(ALIGNMENT_NONE, p_fresh->get_alignment());
    EXPECT_FALSE(p_fresh->is_modal());
    qortest::CReportCapture capture; // a table for another window
    qortest::load_state(p_panel, "{ name = 'other', class_name = 'Window' }");
    ASSERT_EQ(1u, capture.asserts().size());
    EXPECT_NE(std::string::npos, capture.asserts()[0].find("GetString(), get_name()) == 0"));
}

// An unknown class is left out with its subtree and named in the engine's log.
TEST_F(WindowTest, UnknownClassesAreSkippedAndNamedInTheLog) {
    mp_root = make(&m_world.desktop(), "root");
    qortest::CReportCapture capture;
    unsigned const first = m_world.host().log().get_next_index();
    qortest::load_state(
        mp_root, "{ name = 'root', class_name = 'Window',"
                 " { name = 'ghost', class_name = 'NoSuchClass', { name = 'inner', class_name = 'Window' } },"
                 " { name = 'panel', class_name = 'WINDOW' } }"); // hashes fold case
    EXPECT_EQ(nullptr, mp_root->get_child("inner", nullptr, false));
    EXPECT_EQ("Window class not registered: NoSuchClass ('ghost' left out)",
              m_world.host().log().get_message_text(first));
    // "WINDOW" isn't the class name "Window": the panel is made by the hash, whose own load then
    // finds the class name differing.
    EXPECT_EQ(1u, mp_root->get_children_count());
    EXPECT_EQ(1u, capture.asserts().size());
}

// Missing presets are the import's one report, and it goes on; a layout that fails or sets nothing
// changes nothing, and the script module stays quiet about it.
TEST_F(WindowTest, ImportRunsThePresetsAndTheLayoutFromTheUiFolder) {
    mp_root = make(&m_world.desktop(), "root");
    std::string const dir = qortest::make_temp_dir();
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, dir.c_str());
    qortest::write_file(dir + "/layout.lua",
                        "ui_windows_ini = { name = 'root', class_name = 'Window', size = { 640, 480 },"
                        " { name = 'panel', class_name = 'Window', alignment = 'ALIGNMENT_CLIENT' } }");
    qortest::write_file(dir + "/broken.lua", "ui_windows_ini = { name = ");
    qortest::CReportCapture capture;
    mp_root->import(0, "layout.lua");
    EXPECT_EQ((lines_t{"UI: File 'ui_material_presets.lua' not found"}), capture.errors());
    EXPECT_EQ(1u, capture.reports().size());
    EXPECT_EQ(640, mp_root->get_child("panel", nullptr, true)->get_w());
    qortest::write_file(dir + "/ui_material_presets.lua", "ui_material_presets = {}");
    capture.clear();
    mp_root->import(0, "broken.lua");
    mp_root->import(0, "missing.lua");
    EXPECT_EQ(640, mp_root->get_w());
    EXPECT_TRUE(capture.reports().empty());
}
