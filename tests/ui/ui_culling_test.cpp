// Work that can't be seen is left out, and nothing else changes: culled text, the visible area
// behind a pop, exact device coordinates, the pruned hit test and the layout's order.
#include "engine_interfaces.h"
#include "qorbase.h"
#include "test_world.h"
#include "ui_canvas.h"
#include "ui_desktop.h"
#include "ui_font.h"
#include "ui_render.h"
#include "ui_string.h"

#include <gtest/gtest.h>

#include <memory>
#include <sstream>

using namespace qorui;

namespace {

// The owner at (100, 50) of a desktop of 400 by 300. In the grid font 'b' is 16 pixels wide, ' '
// 4, and 'd' moves the pen 16 pixels back; a line is 16 high.
class TextCullingTest : public ::testing::Test {
protected:
    void SetUp() override {
        std::string const dir = qortest::make_temp_dir();
        qorbase::set_category_root(qorbase::FILE_CATEGORY_FONTS, dir.c_str());
        qortest::write_file(dir + "/cull.fnt", "[common] dimension = 4 font_h = 1 [chars] 32 = 0.25 98 = 1 "
                                               "60 = 1 62 = 1 99 = 1 111 = 1 108 = 1 114 = 1 100 = -1");
        lua_machine().DoString(
            "charsets = { cull_grid = { file_type = 'nehe', file_name = 'cull.fnt' } }"
            "fonts = { cull = { charset_name = 'cull_grid', size = 64,"
            " material = { material_template = 'ui_color', color = { r = 9, g = 8, b = 7 } } } }");
        mp_font.reset(get_fonts_factory().create("cull", &m_world.desktop()));
    }

    // The calls of one text_out at the owner's (_x, 0) behind a clip area relative to the owner, as
    // lines of text: the operation, then for a quad its corners, texture coordinates and colour.
    std::vector<std::string> text_calls(char const *_text, int _x, CRectArea const &_clip) {
        m_canvas.set_clip_area(_clip.x, _clip.y, _clip.w, _clip.h);
        m_world.recorder().clear();
        m_canvas.text_out(_x, 0, CString(_text), mp_font.get());
        std::vector<std::string> lines;
        for (qorhost::SRenderCall const &call : m_world.recorder().calls()) {
            std::ostringstream line;
            line << call.m_op;
            for (size_t i = 0; i < call.m_points.size(); ++i)
                line << ' ' << call.m_points[i].x << ',' << call.m_points[i].y << '/' << call.m_uvs[i].x
                     << ',' << call.m_uvs[i].y << '/' << int(call.m_colours[i].r) << '.'
                     << int(call.m_colours[i].a);
            lines.push_back(line.str());
        }
        return lines;
    }

    qortest::CWorld m_world{400, 300};
    CWindowVisual *mp_owner =
        m_world.place(&m_world.desktop(), new CWindowVisual(&m_world.desktop(), "owner"), 100, 50, 200, 100);
    CCanvas &m_canvas = mp_owner->get_canvas();
    std::unique_ptr<CFont> mp_font;
};

} // namespace

TEST_F(TextCullingTest, CharactersWhollyOutsideTheClipAreNotSentTheOthersAreSentUnchanged) {
    struct {
        char const *mp_text;
        int m_x;
        CRectArea m_clip;              // relative to the owner
        std::vector<size_t> m_visible; // indices among the quads drawn without a clip
    } const rows[] = {
        // Quads of 16 from 0: the one ending at the clip's left edge and the one starting at its
        // right edge are out, those that only touch the inside are in.
        {"bbbbbbbbbb", 0, {40, 0, 40, 16}, {2, 3, 4}},
        {"bbbbbbbbbb", 0, {32, 0, 48, 16}, {2, 3, 4}},
        {"bbbbbbbbbb", 0, {31, 0, 50, 16}, {1, 2, 3, 4, 5}},
        {"bbbb", -40, {0, 0, 200, 100}, {2, 3}},      // left of the owner
        {"bbbb", 0, {0, 16, 200, 10}, {}},            // the line's rows aren't in the clip
        {"bbbb", 0, {0, -10, 200, 11}, {0, 1, 2, 3}}, // one row is
        {"bbbb", 0, {20, 0, 0, 16}, {}},              // an empty clip
        {"<color 1 2 3 255>bbb</color>b", 0, {20, 0, 40, 16}, {1, 2, 3}}, // the tag before still colours
        {"bbbbdddd", 0, {0, 0, 40, 16}, {0, 1, 2, 5, 6, 7}},              // the pen comes back into the clip
        {"bbbb", 500, {0, 0, 200, 100}, {}},                              // right of the desktop
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.mp_text + std::string(" at ") + std::to_string(row.m_x) + " in " +
                     qortest::rect_text(row.m_clip));
        std::vector<std::string> const all = text_calls(row.mp_text, row.m_x, CRectArea(-100, -50, 400, 300));
        std::vector<std::string> expected;
        if (!row.m_visible.empty()) expected.push_back(all.at(0)); // one material for the run
        for (size_t index : row.m_visible)
            expected.push_back(all.at(index + 1));
        EXPECT_EQ(expected, text_calls(row.mp_text, row.m_x, row.m_clip));
    }
}

// The engine may restore either the area set before the push or the one before that.
TEST_F(TextCullingTest, BehindAPopTheVisibleAreaCoversBothAreasThatMayStand) {
    IRender &render = *m_world.desktop().get_render();
    render.set_clip_area(100, 50, 64, 16); // four characters
    render.set_clip_area(100, 50, 16, 16); // one
    render.push_clip_area();
    render.pop_clip_area();
    m_world.recorder().clear();
    m_canvas.text_out(0, 0, CString("bbbbbb"), mp_font.get());
    EXPECT_EQ(4u, m_world.quads().size());
    SPixelRect const area = render.get_visible_area();
    EXPECT_EQ((std::vector<int>{100, 50, 164, 66}),
              (std::vector<int>{area.m_l, area.m_t, area.m_r, area.m_b}));
    render.pop_clip_area(); // a pop without its push knows nothing: the whole desktop
    SPixelRect const desktop = render.get_visible_area();
    EXPECT_EQ((std::vector<int>{0, 0, 400, 300}),
              (std::vector<int>{desktop.m_l, desktop.m_t, desktop.m_r, desktop.m_b}));
}

// A product by 2 / size in double gives the float of (p / size - 0.5) * 2 exactly.
TEST(DeviceCoordinates, AreTheFloatsOfTheDivisionForEveryPixelOfCommonResolutions) {
    qortest::CWorld world(320, 240);
    IRender &render = *world.desktop().get_render();
    struct {
        int m_w, m_h;
    } const resolutions[] = {{1024, 768}, {800, 600}, {1366, 768}, {1920, 1080}, {333, 217}};
    for (auto const &resolution : resolutions) {
        SCOPED_TRACE(std::to_string(resolution.m_w) + "x" + std::to_string(resolution.m_h));
        render.set_resolution(resolution.m_w, resolution.m_h);
        int mismatches = 0;
        for (int p = -resolution.m_w; p <= 2 * resolution.m_w; ++p) {
            world.recorder().clear();
            render.draw_line(point_t{p, p}, point_t{p, p}, rgba_t(), rgba_t());
            vec2_t const device = world.recorder().calls().at(0).m_points.at(0);
            mismatches +=
                device.x != static_cast<float>((static_cast<double>(p) / resolution.m_w - 0.5) * 2.0);
            mismatches +=
                device.y != static_cast<float>((static_cast<double>(p) / resolution.m_h - 0.5) * -2.0);
        }
        EXPECT_EQ(0, mismatches);
    }
}

namespace {

// A window whose own test reaches farther than its rectangle.
class CEverywhere : public CWindowVisual {
public:
    using CWindowVisual::CWindowVisual;
    bool is_point_inside(point_t const &) const override { return true; }
};

} // namespace

// The hit test passes by windows that can't answer it; these still answer or hear it.
TEST(HitTest, ReachesAChildOutsideItsParentAListenerAndAWiderOwnTest) {
    qortest::CWorld world(400, 300);
    CDesktop &desktop = world.desktop();
    CWindow *p_everywhere = world.place(&desktop, new CEverywhere(&desktop, "everywhere"), 0, 290, 1, 1);
    CWindow *p_parent = world.place(&desktop, new CWindowVisual(&desktop, "parent"), 0, 0, 50, 50);
    CWindow *p_outside = world.place(p_parent, new CWindowVisual(&desktop, "outside"), 200, 200, 20, 20);
    CWindow *p_listener = world.place(&desktop, new CWindowVisual(&desktop, "listener"), 300, 0, 10, 10);
    std::vector<std::string> heard;
    p_listener->register_callback(EVENT_REPORT_POINT_INSIDE,
                                  CEventCallback([&heard](CWndEvent const *p_event) {
                                      point_t const at = p_event->get<point_t>();
                                      heard.push_back(std::to_string(at.x) + "," + std::to_string(at.y));
                                  }));
    qortest::CEventLog log;
    for (CWindow *p_wnd : {p_everywhere, p_parent, p_outside, p_listener})
        log.watch(p_wnd, {EVENT_POINTER_ENTER});
    world.move_to(205, 205);
    world.move_to(100, 100);
    world.move_to(305, 5);
    EXPECT_EQ((std::vector<std::string>{"outside:EVENT_POINTER_ENTER", "everywhere:EVENT_POINTER_ENTER",
                                        "listener:EVENT_POINTER_ENTER"}),
              log.take());
    EXPECT_EQ((std::vector<std::string>{"205,205", "100,100", "305,5"}), heard);
}

// A layout's children are sorted by z order, highest first (drawn first, farthest back), whether
// or not they came in order; a window that isn't visual among them leaves the order to the sort.
TEST(LayoutOrder, ChildrenKeepTheOrderThatTheSortGivesThem) {
    struct {
        char const *mp_children;
        char const *mp_order;
    } const rows[] = {
        {"{ name = 'a', class_name = 'WindowVisual', z_order = 1 }, { name = 'b', class_name = "
         "'WindowVisual',"
         " z_order = 5 }, { name = 'c', class_name = 'WindowVisual', z_order = 3 }",
         "bca"},
        {"{ name = 'a', class_name = 'WindowVisual', z_order = 9 }, { name = 'b', class_name = "
         "'WindowVisual' },"
         " { name = 'c', class_name = 'WindowVisual' }",
         "abc"},
        {"{ name = 'a', class_name = 'WindowVisual', z_order = 1 }, { name = 'n', class_name = 'Window' },"
         " { name = 'c', class_name = 'WindowVisual', z_order = 5 }",
         "anc"},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.mp_order);
        qortest::CWorld world(100, 100);
        CWindowVisual *p_root =
            world.place(&world.desktop(), new CWindowVisual(&world.desktop(), "root"), 0, 0, 10, 10);
        qortest::load_state(p_root, std::string("{ name = 'root', class_name = 'WindowVisual', ") +
                                        row.mp_children + " }");
        std::string order;
        for (unsigned i = 0; i < p_root->get_children_count(); ++i)
            order += p_root->get_child(i)->get_name();
        EXPECT_EQ(row.mp_order, order);
        EXPECT_TRUE(qortest::saved_state(p_root).GetByName("z_order").IsNil());
    }
}
