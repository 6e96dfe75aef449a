// The graph profiler in the test world on the test's clock: the tree, the rings and their graphs,
// the bands under the pointer, nodes taken out and brought back, pauses, contracts and layouts.
#include "ui_graph_profiler.h"

#include "test_common.h"
#include "test_world.h"
#include "ui_drop_down_list.h"
#include "ui_items.h"
#include "ui_list_box.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <set>
#include <sstream>

using namespace qorui;

namespace {

typedef std::pair<int, int> point_pair_t;

class GraphProfilerTest : public ::testing::Test {
protected:
    void SetUp() override {
        m_world.clock().advance_ms(150); // the desktop has faded in
        remake();
    }
    // A new measuring profiler of 200 by 140 at (20, 30) in place of the old one, after its first
    // frame. The first update of the process starts the frame time.
    void remake() {
        delete mp_profiler;
        mp_profiler =
            m_world.place(&desktop(), new CGraphProfiler(&desktop(), "graph profiler"), 20, 30, 200, 140);
        mp_profiler->start();
        frame();
    }

    CDesktop &desktop() { return m_world.desktop(); }
    // One frame of _ms milliseconds: the clock moves, then update and draw.
    void frame(unsigned _ms = 16) {
        m_world.clock().advance_ms(_ms);
        m_world.frame();
    }
    // Runs a script of stretches: "+name" enters a node, "-" leaves the innermost one, a number
    // lets that many microseconds pass, or nanoseconds with "ns" behind it.
    void run(std::string const &_script) {
        std::istringstream steps(_script);
        std::string step;
        while (steps >> step) {
            if (step[0] == '+')
                mp_profiler->enter_node(HUID(step.c_str() + 1));
            else if (step == "-")
                mp_profiler->exit_node();
            else if (step.size() > 2 && step.compare(step.size() - 2, 2, "ns") == 0)
                m_world.clock().advance_ns(std::stoll(step));
            else
                m_world.clock().advance_ns(std::stoll(step) * 1000);
        }
    }
    // The node of that full name, or null.
    CGraphProfilerNode *node(std::string const &_full_name, CGraphProfilerNode *_p_from = nullptr) {
        CGraphProfilerNode &from = _p_from ? *_p_from : mp_profiler->get_root();
        if (from.m_full_name.c_str() == _full_name) return &from;
        for (auto &child : from.m_children)
            if (CGraphProfilerNode *p_found = node(_full_name, &child.second)) return p_found;
        return nullptr;
    }
    // The sample that the last update wrote.
    static uint64_t newest(CGraphProfilerNode const &_node) {
        size_t const size = _node.m_history.size();
        return _node.m_history[(_node.m_history_pos + size - 1) % size];
    }
    // The line strip that the last frame drew in _colour, as the profiler's own pixels: the start
    // of the first line, then the end of each.
    std::vector<point_pair_t> strip(rgba_t const &_colour) {
        float const half_w = m_world_w / 2.0f, half_h = m_world_h / 2.0f;
        point_t const origin = mp_profiler->get_global_pos();
        auto pixel = [&](vec2_t const &_p) {
            return point_pair_t{static_cast<int>(std::lround((_p.x + 1.0f) * half_w)) - origin.x,
                                static_cast<int>(std::lround((1.0f - _p.y) * half_h)) - origin.y};
        };
        std::vector<point_pair_t> points;
        for (qorhost::SRenderCall const &call : m_world.recorder().calls()) {
            if (call.m_op != "draw_line" || !(call.m_colours[0] == _colour)) continue;
            if (points.empty()) points.push_back(pixel(call.m_points[0]));
            points.push_back(pixel(call.m_points[1]));
        }
        return points;
    }
    int const m_world_w = 400, m_world_h = 300;
    qortest::CWorld m_world{m_world_w, m_world_h};
    CGraphProfiler *mp_profiler = nullptr;
};

rgba_t const k_root_colour(255, 255, 255, 150);

} // namespace

// Nesting makes the tree: one name under two parents makes two nodes, and the root's name isn't
// part of the paths. Measuring off, nothing is made. The walk that lists the nodes starts at the root.
TEST_F(GraphProfilerTest, NestingBuildsTheTreeWithFullNames) {
    mp_profiler->stop();
    run("+off -");
    mp_profiler->start();
    run("+a +b - +c +d - - - +b - +a +b - -");
    EXPECT_EQ(0u, mp_profiler->get_open_nodes_count());
    frame();
    std::set<std::string> names;
    for (CGraphProfilerNode const *p_node : mp_profiler->get_used_nodes())
        names.insert(p_node->m_full_name.c_str());
    EXPECT_EQ((std::set<std::string>{"root", "a", "a.b", "a.c", "a.c.d", "b"}), names);
    EXPECT_EQ(6u, mp_profiler->get_used_nodes().size());
    EXPECT_EQ(&mp_profiler->get_root(), mp_profiler->get_used_nodes()[0]);
    EXPECT_EQ(2u, node("a")->m_children.size());
    EXPECT_EQ(nullptr, node("off"));
}

// The newest sample of each node after one frame: all that its stretches took in the frame, a
// parent's with its children's; the root's is the whole frame, from update to update.
TEST_F(GraphProfilerTest, EachFrameMovesTheNodesTimesIntoTheirRings) {
    struct {
        char const *m_case;
        char const *m_script;
        std::vector<std::pair<char const *, uint64_t>> m_samples; // microseconds
    } const rows[] = {
        {"one stretch", "+a 3000 -", {{"a", 3000}, {"root", 19000}}},
        {"two stretches of one node add up", "+a 2000 - 500 +a 5000 -", {{"a", 7000}, {"root", 23500}}},
        {"a parent includes its child", "+a 1000 +b 4000 - 2000 -", {{"a", 7000}, {"a.b", 4000}}},
        {"one name under two parents", "+a +b 1000 - - +b 3000 -", {{"a.b", 1000}, {"b", 3000}}},
        {"parts of a microsecond are cut", "+a 1999ns - +b 999ns -", {{"a", 1}, {"b", 0}}},
        {"a node not entered in a frame", "+b 5000 -", {{"b", 5000}, {"a", 0}}},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_case);
        run("+a - +b -"); // every node exists, so no frame makes one
        frame();
        run(row.m_script);
        frame();
        for (auto const &sample : row.m_samples) {
            ASSERT_NE(nullptr, node(sample.first)) << sample.first;
            EXPECT_EQ(sample.second, newest(*node(sample.first))) << sample.first;
        }
    }
}

// The ring [4000, 1000, 2000, 3000] (next slot 1) at a new width, then a frame: narrower loses the
// end of its storage, wider gains zeros; the graph runs from the oldest sample, a pixel an update
// and a millisecond, clamped at the window's top.
TEST_F(GraphProfilerTest, TheRingFollowsTheWindowsWidthAndTheGraphScrolls) {
    struct {
        int m_w;
        unsigned m_ms;
        std::vector<uint64_t> m_ring;
        uint32_t m_pos;
        std::vector<point_pair_t> m_strip;
    } const rows[] = {
        {4, 5, {4000, 5000, 2000, 3000}, 2, {{0, 140}, {0, 138}, {1, 137}, {2, 136}, {3, 135}}},
        {6,
         5,
         {4000, 5000, 2000, 3000, 0, 0},
         2,
         {{0, 140}, {0, 138}, {1, 137}, {2, 140}, {3, 140}, {4, 136}, {5, 135}}},
        {2, 500, {4000, 500000}, 0, {{0, 140}, {0, 136}, {1, 0}}},
        {1, 5, {5000}, 0, {{0, 140}, {0, 135}}},
        {0, 5, {5000}, 0, {{0, 140}, {0, 135}}},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_w);
        remake();
        run("+a -"); // the bands are built: the root's at the foot
        mp_profiler->set_size(4, 140);
        for (unsigned ms : {1, 2, 3, 4})
            frame(ms);
        CGraphProfilerNode const &root = mp_profiler->get_root();
        mp_profiler->set_size(row.m_w, 140);
        frame(row.m_ms);
        EXPECT_EQ(std::max(row.m_w, 1), static_cast<int>(mp_profiler->get_history_size()));
        EXPECT_EQ(row.m_ring, std::vector<uint64_t>(root.m_history.begin(), root.m_history.end()));
        EXPECT_EQ(row.m_pos, root.m_history_pos);
        EXPECT_EQ(row.m_strip, strip(k_root_colour));
    }
}

// Three bands of (140 - 20) / 3 = 40 pixels under the drop-down, the pointed one marked (over the
// drop-down it stays); a double click takes its node out to a row of the drop-down, choosing the
// row brings it back.
TEST_F(GraphProfilerTest, ADoubleClickTakesANodeOutAndTheDropDownBringsItBack) {
    run("+a - +b -");
    frame();
    for (auto const &row :
         std::vector<std::pair<int, unsigned>>{{20, 0}, {59, 0}, {60, 1}, {131, 2}, {10, 2}}) {
        SCOPED_TRACE(row.first);
        m_world.move_to(120, 30 + row.first);
        frame();
        EXPECT_EQ(row.second, mp_profiler->get_pointed_idx());
        std::vector<std::string> marks;
        for (auto const &quad : m_world.quads())
            if (quad.m_colour == rgba_t(250, 250, 250, 30)) marks.push_back(qortest::rect_text(quad.m_rect));
        EXPECT_EQ(std::vector<std::string>{qortest::rect_text(CRectArea(20, 50 + 40 * row.second, 200, 40))},
                  marks);
    }

    CGraphProfilerNode *p_top = mp_profiler->get_used_nodes()[2]; // the top band's
    m_world.click_at(120, 30 + 40);
    m_world.click_at(120, 30 + 40);
    frame();
    EXPECT_FALSE(p_top->m_is_used);
    EXPECT_EQ(2u, mp_profiler->get_used_nodes().size());
    CItems &rows = mp_profiler->get_unused_nodes()->get_items();
    ASSERT_EQ(1u, rows.get_count());
    EXPECT_EQ(CString(p_top->m_full_name.c_str()), *rows.get(0)->get_string(0).get_string(0u));

    m_world.click_at(120, 30 + 10); // opens the list below the drop-down
    CListBox *p_list = mp_profiler->get_unused_nodes()->get_list_box();
    ASSERT_FALSE(p_list->is_hidden());
    point_t const list = p_list->get_global_pos();
    m_world.click_at(list.x + 20, list.y + p_list->get_top_margin() + p_list->get_item_height() / 2);
    frame();
    EXPECT_TRUE(p_top->m_is_used);
    EXPECT_EQ(3u, mp_profiler->get_used_nodes().size());
    EXPECT_EQ(0u, rows.get_count());
}

// Stopped, nothing is measured or drawn; started again, the rings go on where they were and the
// root's first sample is the whole pause.
TEST_F(GraphProfilerTest, AfterAStopTheGraphsResumeFromTheSameRings) {
    run("+a 2000 -");
    frame();
    uint32_t const pos = mp_profiler->get_root().m_history_pos;
    mp_profiler->stop();
    run("+a 2000 -");
    frame(100);
    EXPECT_TRUE(strip(k_root_colour).empty());
    EXPECT_EQ(pos, mp_profiler->get_root().m_history_pos);
    mp_profiler->start();
    frame(16);
    EXPECT_EQ(118000u, newest(mp_profiler->get_root())); // 2 + 100 + 16 ms
    EXPECT_EQ(0u, newest(*node("a")));
}

// A broken pairing is reported with its expression; reset forgets the open nodes, after which
// start is quiet.
TEST_F(GraphProfilerTest, BrokenPairingsAreReported) {
    qortest::CReportCapture capture;
    mp_profiler->exit_node();
    run("+a");
    mp_profiler->start(); // already on: nothing to check
    mp_profiler->stop();
    mp_profiler->start();
    mp_profiler->stop();
    mp_profiler->reset();
    EXPECT_EQ(0u, mp_profiler->get_open_nodes_count());
    mp_profiler->start();
    ASSERT_EQ(2u, capture.asserts().size());
    EXPECT_EQ(0u, capture.asserts()[0].find("Expression:   !m_stack.empty(),"));
    EXPECT_EQ(0u, capture.asserts()[1].find("Expression:   m_stack.empty(),"));
}

// The profiler keeps what a dialog keeps, and a key of the wrong Lua type leaves its field. Rows that
// a layout gives the drop-down list have no node behind them: choosing one is reported once.
TEST_F(GraphProfilerTest, TheLayoutKeepsTheDialogAndBadTypesLeaveItAsItWas) {
    mp_profiler->set_caption(CString("frame times"));
    mp_profiler->set_caption_h(30);
    LuaPlus::LuaObject saved = qortest::saved_state(mp_profiler);
    saved.SetString("name", "copy");
    qortest::CReportCapture capture;
    CGraphProfiler *p_copy = m_world.place(&desktop(), new CGraphProfiler(&desktop(), "copy"), 0, 0, 50, 50);
    for (char const *layout :
         {"", "{ name = 'copy', class_name = 'GraphProfiler', caption = 12, caption_h = 'tall', "
              "size = 'large', pos = true }"}) {
        SCOPED_TRACE(layout);
        if (*layout)
            qortest::load_state(p_copy, layout);
        else
            p_copy->load_state(saved);
        EXPECT_EQ(CString("frame times"), p_copy->get_caption());
        EXPECT_EQ(30, p_copy->get_caption_h());
        EXPECT_EQ("20,30 200x140", qortest::place_text(p_copy));
    }
    EXPECT_TRUE(capture.reports().empty());

    p_copy->start();
    p_copy->get_unused_nodes()->get_items().add(new CItem(CText("a.b"), nullptr));
    p_copy->get_unused_nodes()->check(0);
    m_world.frame();
    m_world.frame();
    ASSERT_EQ(1u, capture.asserts().size());
    EXPECT_EQ(0u, capture.asserts()[0].find("Expression:   p,"));
}
