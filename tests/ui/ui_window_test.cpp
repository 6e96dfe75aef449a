// The window tree: routing and filtering of events, the tree's order, geometry and alignment,
// flags, and the layout tables of windows.
#include "ui_window.h"

#include "engine_interfaces.h"
#include "qorbase.h"
#include "qorscriptsystem.h"
#include "test_desktop.h"
#include "test_support.h"

#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

using namespace qorui;

namespace {

typedef std::vector<std::string> calls_t;

// A callback that writes "window:event" for every event it sees.
struct SRecorder {
    calls_t *mp_calls;
    std::string m_name;
    void operator()(CWndEvent const *_p_event) const {
        mp_calls->push_back(m_name + ":" + std::to_string(_p_event->get_id()));
    }
};

class WindowTest : public ::testing::Test {
protected:
    // A window that records the given events behind its own handlers.
    CWindow *make(char const *_name, std::vector<EEventType> const &_recorded = {}) {
        CWindow *p_wnd = new CWindow(&m_desktop, _name);
        for (EEventType id : _recorded)
            p_wnd->register_callback(id, CEventCallback(SRecorder{&m_calls, _name}));
        return p_wnd;
    }

    // root [a [a1, a2], b]
    void make_tree(std::vector<EEventType> const &_recorded) {
        mp_root = make("root", _recorded);
        mp_a = make("a", _recorded);
        mp_a1 = make("a1", _recorded);
        mp_a2 = make("a2", _recorded);
        mp_b = make("b", _recorded);
        mp_root->attach_child(mp_a);
        mp_root->attach_child(mp_b);
        mp_a->attach_child(mp_a1);
        mp_a->attach_child(mp_a2);
        m_calls.clear();
        m_desktop.m_calls.clear();
    }

    void send(CWindow *_p_to, EEventType _id, CWndEvent::EDispatchType _type) {
        _p_to->send_event(_p_to, _id, _type);
    }

    void TearDown() override { delete mp_root; }

    qortest::CTestDesktop m_desktop;
    calls_t m_calls;
    CWindow *mp_root = nullptr;
    CWindow *mp_a = nullptr;
    CWindow *mp_a1 = nullptr;
    CWindow *mp_a2 = nullptr;
    CWindow *mp_b = nullptr;
};

std::vector<EEventType> all_event_types() {
    std::vector<EEventType> types;
    for (int id = 0; id <= EVENT_RESOURCE_INVALIDATE; ++id)
        if (id != 29 && id != 30) types.push_back(static_cast<EEventType>(id));
    return types;
}

// The events that pass a window with the given flags, found by sending each one.
std::vector<int> passing_events(bool _hidden, bool _disabled) {
    qortest::CTestDesktop desktop;
    std::vector<int> passed;
    for (EEventType id : all_event_types()) {
        CWindow window(&desktop, "probe");
        window.set_hidden(_hidden);
        window.set_disabled(_disabled);
        calls_t calls;
        window.register_callback(id, CEventCallback(SRecorder{&calls, "probe"}));
        CWndEvent event(id);
        event << 0 << 0; // enough for the handlers that read
        if (id == EVENT_DRAG || id == EVENT_REPORT_POINT_INSIDE) {
            event.release();
            event << point_t{0, 0};
        }
        window.send_event(&window, &event, CWndEvent::DISPATCH_NONE);
        if (!calls.empty()) passed.push_back(id);
    }
    return passed;
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Routing and filtering
// ---------------------------------------------------------------------------------------------

TEST_F(WindowTest, DispatchTypesDecideWhereAnEventGoes) {
    make_tree({EVENT_CLICK});
    send(mp_root, EVENT_CLICK, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ((calls_t{"root:24"}), m_calls);

    m_calls.clear();
    send(mp_root, EVENT_CLICK, CWndEvent::DISPATCH_CHILDREN); // back to front, depth first
    EXPECT_EQ((calls_t{"root:24", "a:24", "a1:24", "a2:24", "b:24"}), m_calls);

    m_calls.clear();
    send(mp_a2, EVENT_CLICK, CWndEvent::DISPATCH_PARENT);
    EXPECT_EQ((calls_t{"a2:24", "a:24", "root:24"}), m_calls);
}

TEST_F(WindowTest, DefaultHandlersSpreadTheirEventsThroughTheSubtree) {
    make_tree(
        {EVENT_UPDATE, EVENT_DRAW, EVENT_LOST_FOCUS, EVENT_RESOURCE_INVALIDATE, EVENT_RESIZED, EVENT_CLICK});
    for (EEventType id :
         {EVENT_UPDATE, EVENT_DRAW, EVENT_LOST_FOCUS, EVENT_RESOURCE_INVALIDATE, EVENT_RESIZED}) {
        m_calls.clear();
        send(mp_root, id, CWndEvent::DISPATCH_NONE);
        std::string const n = std::to_string(id);
        EXPECT_EQ((calls_t{"root:" + n, "a:" + n, "a1:" + n, "a2:" + n, "b:" + n}), m_calls) << id;
    }
}

TEST_F(WindowTest, AHandlerThatStoresTypeZeroStopsOnlyItsOwnSubtree) {
    make_tree({EVENT_UPDATE});
    mp_a->register_callback(EVENT_UPDATE, CEventCallback([](CWndEvent const *p_event) {
                                p_event->set_dispatch_type(CWndEvent::DISPATCH_NONE);
                            }));
    send(mp_root, EVENT_UPDATE, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ((calls_t{"root:0", "a:0", "b:0"}), m_calls); // b's parent loop goes on
}

TEST_F(WindowTest, AnEventRisingToTheRootNamesEachParentAsActivator) {
    make_tree({});
    std::vector<std::string> activators;
    for (CWindow *p_wnd : {mp_a1, mp_a, mp_root})
        p_wnd->register_callback(EVENT_CLICK, CEventCallback([&activators](CWndEvent const *p_event) {
                                     activators.push_back(p_event->get_activator()->get_name());
                                 }));
    mp_b->send_event(mp_a1, EVENT_CLICK, CWndEvent::DISPATCH_PARENT);
    EXPECT_EQ((std::vector<std::string>{"b", "a", "root"}), activators);
}

TEST(WindowFilter, HiddenAndDisabledWindowsTakeOnlyTheirListedEvents) {
    EXPECT_EQ((std::vector<int>{0, 3, 9, 10, 12, 27, 43}), passing_events(true, false));
    EXPECT_EQ((std::vector<int>{1, 2, 3, 6, 9, 12, 16, 26, 43}), passing_events(false, true));
    EXPECT_EQ((std::vector<int>{3, 9, 12, 43}), passing_events(true, true));
    EXPECT_EQ(all_event_types().size(), passing_events(false, false).size());
}

TEST_F(WindowTest, AHiddenWindowStopsItsSubtreeButNotItsSiblings) {
    make_tree({EVENT_DRAW, EVENT_RESIZED});
    mp_a->set_hidden(true);
    send(mp_root, EVENT_DRAW, CWndEvent::DISPATCH_CHILDREN);
    EXPECT_EQ((calls_t{"root:1", "b:1"}), m_calls);
    m_calls.clear();
    send(mp_root, EVENT_RESIZED, CWndEvent::DISPATCH_NONE); // resized passes: hidden windows follow
    EXPECT_EQ((calls_t{"root:12", "a:12", "a1:12", "a2:12", "b:12"}), m_calls);
    EXPECT_EQ((calls_t{"on_hide a"}), m_desktop.m_calls);
}

TEST_F(WindowTest, GlobalPositionsAreRefreshedByEvents) {
    make_tree({});
    mp_a->set_pos(10, 20);
    mp_a1->set_pos(1, 2);
    EXPECT_EQ(11, mp_a1->get_global_pos().x);
    EXPECT_EQ(22, mp_a1->get_global_pos().y);
    mp_a->set_hidden(true);
    mp_root->set_pos(100, 100); // the root has no parent: its global position stays (0, 0)
    mp_a->set_pos(30, 30);      // resized passes hidden windows
    EXPECT_EQ(31, mp_a1->get_global_pos().x);
    point_t const local = mp_a1->convert_to_local(point_t{40, 40});
    EXPECT_EQ(9, local.x);
    EXPECT_EQ(8, local.y);
}

// ---------------------------------------------------------------------------------------------
// The tree
// ---------------------------------------------------------------------------------------------

TEST_F(WindowTest, AttachingTwiceMovesToTheFrontOnce) {
    make_tree({EVENT_RESOURCE_INVALIDATE});
    mp_root->attach_child(mp_a);
    EXPECT_EQ(2u, mp_root->get_children_count());
    EXPECT_EQ(mp_b, mp_root->get_child(0u));
    EXPECT_EQ(mp_a, mp_root->get_child(1u));
    EXPECT_EQ((calls_t{"a:43", "a1:43", "a2:43"}), m_calls); // the subtree looks its resources up
}

TEST_F(WindowTest, AlwaysOnTopWindowsStayInFront) {
    make_tree({});
    CWindow *p_top = make("top");
    p_top->set_always_on_top(true);
    mp_root->attach_child(p_top);
    mp_root->bring_to_front(mp_a);
    EXPECT_EQ(mp_b, mp_root->get_child(0u));
    EXPECT_EQ(mp_a, mp_root->get_child(1u));
    EXPECT_EQ(p_top, mp_root->get_child(2u));

    qortest::CReportCapture capture;
    mp_root->bring_to_front(mp_a1); // not a child of root
    EXPECT_EQ(1u, capture.texts(qordebug::REPORT_ASSERT).size());
    EXPECT_EQ(nullptr, mp_root->get_child(3u));
    EXPECT_EQ(2u, capture.texts(qordebug::REPORT_ASSERT).size());
}

TEST_F(WindowTest, PassiveStateFlowsDownward) {
    make_tree({});
    CWindow *p_passive_parent = make("passive");
    p_passive_parent->set_passive(true);
    mp_root->detach_child(mp_a);
    p_passive_parent->attach_child(mp_a);
    EXPECT_TRUE(mp_a->is_passive());
    EXPECT_TRUE(mp_a1->is_passive());
    mp_root->attach_child(p_passive_parent);

    // Attaching to a non-passive parent doesn't clear a passive child.
    p_passive_parent->detach_child(mp_a);
    mp_root->attach_child(mp_a);
    EXPECT_TRUE(mp_a->is_passive());

    // An unchanged value visits nobody, even a child with another value.
    mp_a1->set_passive(false);
    mp_a->set_passive(true);
    EXPECT_FALSE(mp_a1->is_passive());
    mp_a->set_passive(false);
    EXPECT_FALSE(mp_a2->is_passive());
}

TEST_F(WindowTest, LookupPrefersDirectChildrenThenGoesDepthFirst) {
    make_tree({});
    CWindow *p_deep_b = make("b");
    mp_a1->attach_child(p_deep_b);
    EXPECT_EQ(mp_b, mp_root->get_child("b", nullptr, false));
    EXPECT_EQ(mp_b, mp_root->get_child("b", "Window", true));
    EXPECT_EQ(nullptr, mp_root->get_child("b", "WindowVisual", false));
    EXPECT_EQ(nullptr, mp_root->get_child("a2", nullptr, true));
    EXPECT_EQ(mp_a2, mp_root->get_child("a2", nullptr, false));
    EXPECT_EQ(p_deep_b, mp_a->get_child("b", nullptr, false));
    EXPECT_EQ(nullptr, mp_root->get_child("B", nullptr, false)); // exact names

    qor_vector<CWindow *> all;
    mp_root->get_children(all);
    EXPECT_EQ((qor_vector<CWindow *>{mp_a, mp_a1, p_deep_b, mp_a2, mp_b}), all);
}

TEST_F(WindowTest, DeletingAWindowDeletesItsSubtreeAndTellsTheDesktop) {
    make_tree({});
    mp_a->input_subscribe(true);
    delete mp_a;
    EXPECT_EQ((calls_t{"subscribe a", "unsubscribe a", "unsubscribe a1", "on_delete a1", "unsubscribe a2",
                       "on_delete a2", "on_delete a"}),
              m_desktop.m_calls);
    EXPECT_EQ(1u, mp_root->get_children_count());
}

// ---------------------------------------------------------------------------------------------
// Geometry
// ---------------------------------------------------------------------------------------------

TEST_F(WindowTest, ResizeGoesThroughTheHandlerAndTheConstraints) {
    make_tree({EVENT_RESIZE, EVENT_RESIZED});
    mp_a->set_size(-5, 30);
    EXPECT_EQ(0, mp_a->get_w());
    EXPECT_EQ(30, mp_a->get_h());
    // Resize reaches only the window; resized spreads.
    EXPECT_EQ((calls_t{"a:11", "a:12", "a1:12", "a2:12"}), m_calls);

    mp_a->set_constraints(SConstraints{0, 40, 0, 0});
    mp_a->set_size(100, 30);
    EXPECT_EQ(40, mp_a->get_w());

    mp_a->set_can_resize(false);
    m_calls.clear();
    mp_a->set_size(10, 10);
    EXPECT_EQ(40, mp_a->get_w());
    EXPECT_EQ((calls_t{"a:11", "a:12", "a1:12", "a2:12"}), m_calls); // resized is sent all the same

    mp_a->set_hidden(true); // the filter keeps resize from the handler: the size goes through
    mp_a->set_size(10, 10);
    EXPECT_EQ(10, mp_a->get_w());
}

TEST_F(WindowTest, AHandlerCorrectsTheSizeInPlace) {
    make_tree({});
    mp_b->register_callback(EVENT_RESIZE, CEventCallback([](CWndEvent const *p_event) {
                                int &w = p_event->get<int>();
                                w = w * 2;
                            }));
    mp_b->set_size(21, 7);
    EXPECT_EQ(42, mp_b->get_w());
    EXPECT_EQ(7, mp_b->get_h());
}

TEST_F(WindowTest, EachAlignmentPlacesAndSizesInTheParentsClientArea) {
    make_tree({});
    mp_root->set_size(101, 81);
    struct {
        EAlignment m_alignment;
        int m_x, m_y, m_w, m_h;
    } const cases[] = {
        {ALIGNMENT_NONE, 7, 9, 50, 21},     {ALIGNMENT_TOP, 0, 0, 101, 21},
        {ALIGNMENT_LEFT, 0, 0, 50, 81},     {ALIGNMENT_RIGHT, 51, 0, 50, 81},
        {ALIGNMENT_BOTTOM, 0, 60, 101, 21}, {ALIGNMENT_CENTER, 25, 30, 50, 21},
        {ALIGNMENT_CLIENT, 0, 0, 101, 81},
    };
    for (auto const &c : cases) {
        mp_b->set_alignment(ALIGNMENT_NONE);
        mp_b->set_pos(7, 9);
        mp_b->set_size(50, 21);
        mp_b->set_alignment(c.m_alignment);
        EXPECT_EQ(c.m_x, mp_b->get_pos().x) << g_alignment_names[c.m_alignment];
        EXPECT_EQ(c.m_y, mp_b->get_pos().y) << g_alignment_names[c.m_alignment];
        EXPECT_EQ(c.m_w, mp_b->get_w()) << g_alignment_names[c.m_alignment];
        EXPECT_EQ(c.m_h, mp_b->get_h()) << g_alignment_names[c.m_alignment];
    }
    // Children follow their parent's new size.
    mp_b->set_alignment(ALIGNMENT_CLIENT);
    mp_root->set_size(200, 100);
    EXPECT_EQ(200, mp_b->get_w());
    // Constraints count: a centred window is placed by its constrained size.
    mp_b->set_alignment(ALIGNMENT_NONE);
    mp_b->set_constraints(SConstraints{0, 30, 0, 0});
    mp_b->set_alignment(ALIGNMENT_CENTER);
    EXPECT_EQ(85, mp_b->get_pos().x);
}

TEST_F(WindowTest, MaximisedWindowsFillTheWholeParentAndComeBack) {
    make_tree({});
    mp_root->set_size(300, 200);
    mp_b->set_pos(5, 6);
    mp_b->set_size(20, 10);
    mp_b->set_maximaized(true);
    EXPECT_TRUE(mp_b->is_maximaized());
    EXPECT_EQ(0, mp_b->get_pos().x);
    EXPECT_EQ(300, mp_b->get_w());
    mp_root->set_size(400, 250);
    EXPECT_EQ(250, mp_b->get_h());
    mp_b->set_maximaized(false);
    EXPECT_EQ(5, mp_b->get_pos().x);
    EXPECT_EQ(6, mp_b->get_pos().y);
    EXPECT_EQ(20, mp_b->get_w());
    EXPECT_EQ(10, mp_b->get_h());
}

TEST_F(WindowTest, DraggingMovesOnlyWindowsThatAllowIt) {
    make_tree({});
    CWndEvent drag(EVENT_DRAG);
    drag << point_t{3, -4};
    mp_b->send_event(mp_b, &drag, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ(0, mp_b->get_pos().x);
    mp_b->set_can_drag(true);
    mp_b->send_event(mp_b, &drag, CWndEvent::DISPATCH_NONE);
    mp_b->send_event(mp_b, &drag, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ(6, mp_b->get_pos().x);
    EXPECT_EQ(-8, mp_b->get_pos().y);
}

TEST_F(WindowTest, ThePointTestExcludesRightAndBottomEdges) {
    make_tree({});
    mp_a->set_pos(10, 10);
    mp_a->set_size(5, 5);
    mp_a1->set_size(2, 2);
    mp_a->set_disabled(true); // disabled windows still report points
    for (point_t const point : {point_t{10, 10}, point_t{14, 14}, point_t{15, 10}}) {
        CWndEvent report(EVENT_REPORT_POINT_INSIDE);
        report << point;
        mp_root->send_event(mp_root, &report, CWndEvent::DISPATCH_CHILDREN);
    }
    EXPECT_EQ((calls_t{"report a", "report a1", "report a"}), m_desktop.m_calls);
}

TEST_F(WindowTest, HidingAnAutoDeleteWindowQueuesItAtTheDesktop) {
    make_tree({});
    mp_b->set_auto_delete(true);
    send(mp_b, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
    EXPECT_TRUE(mp_b->is_hidden());
    EXPECT_EQ((calls_t{"on_hide b", "delete_window b"}), m_desktop.m_calls);
    m_desktop.m_calls.clear();
    mp_a->set_auto_delete(true);
    mp_a->set_hidden(true); // the quiet way looks at nothing
    EXPECT_EQ((calls_t{"on_hide a"}), m_desktop.m_calls);
}

TEST_F(WindowTest, ModalWindowsAreAlwaysOnTopUntilCleared) {
    make_tree({});
    mp_a->set_is_modal(true);
    EXPECT_TRUE(mp_a->is_always_on_top());
    mp_a->set_is_modal(false);
    EXPECT_TRUE(mp_a->is_always_on_top());
}
