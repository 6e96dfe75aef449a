// The test world, its golden pictures, the names of events and tables from text.
#include "test_world.h"

#include "engine_interfaces.h"
#include "image_io.h"
#include "qorbase.h"
#include "test_host.h"
#include "test_support.h"
#include "ui_font.h"
#include "ui_event.h"
#include "ui_material.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstdlib>

using namespace qorui;

namespace qortest {

CWorld::CWorld(int _w, int _h) : m_renderer(_w, _h), m_x(_w / 2.0f), m_y(_h / 2.0f) {
    // The host first: its servers, made before the library's cache of interfaces, outlive it.
    IInterfaceServer &server = host().server();
    engine_interfaces().set_server(&server);
    qorplatform::set_clock(&m_clock);
    std::string const data = source_dir() + "/data";
    m_renderer.set_texture_folders({data + "/textures", data});
    {
        CReportCapture quiet; // no engine screen size in the test process
        m_render.init(&m_recorder);
    }
    m_render.set_resolution(_w, _h);
    qorbase::set_category_root(qorbase::FILE_CATEGORY_FONTS, (data + "/fonts").c_str());
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, (data + "/ui").c_str());
    get_fonts_factory().init();
    mp_desktop = new CDesktop(&m_render, _w, _h, "desktop");
    mp_desktop->send_event(mp_desktop, EVENT_SHOW, CWndEvent::DISPATCH_NONE);
    mp_desktop->add_font(FNT_NAME_DEFAULT, get_fonts_factory().create("arial_white", mp_desktop));
    mp_desktop->add_font(FNT_NAME_FIXED, get_fonts_factory().create("courier", mp_desktop));
}

// The clock goes back to the host's, which holds it between tests.
CWorld::~CWorld() {
    delete mp_desktop;
    qorplatform::set_clock(&host().clock());
}

qorhost::CHost &CWorld::host() {
    return shared_host();
}

CMaterial *CWorld::colour(unsigned char _r, unsigned char _g, unsigned char _b, unsigned char _a) {
    CMaterial *p_material = mp_desktop->create_material();
    p_material->init("ui_color", nullptr, nullptr, nullptr, nullptr, nullptr, true, false);
    p_material->set_color(rgba_t(_r, _g, _b, _a));
    return p_material;
}

void CWorld::move_to(int _x, int _y) {
    float const x = static_cast<float>(_x), y = static_cast<float>(_y);
    mp_desktop->on_pointer_move(vec2_t{x - m_x, y - m_y});
    m_x = x, m_y = y;
}

void CWorld::press(unsigned _button) {
    mp_desktop->on_pointer_down(_button);
}

void CWorld::release(unsigned _button) {
    mp_desktop->on_pointer_up(_button);
}

void CWorld::click_at(int _x, int _y) {
    move_to(_x, _y);
    press();
    release();
}

void CWorld::key(unsigned _vk) {
    mp_desktop->on_key_down(_vk, 0);
    mp_desktop->on_key_up(_vk);
}

void CWorld::type(char const *_ascii) {
    for (char const *p = _ascii; *p; ++p)
        mp_desktop->on_char(static_cast<unsigned char>(*p));
}

void CWorld::frame() {
    mp_desktop->update(0);
    m_renderer.begin_frame(rgba_t(24, 28, 36, 255));
    m_recorder.clear();
    mp_desktop->draw();
}

// Device coordinates back to pixels: x from -1 at the left, y from 1 at the top.
std::vector<CWorld::SDrawn> CWorld::drawn() const {
    float const half_w = m_renderer.get_frame().m_w / 2.0f, half_h = m_renderer.get_frame().m_h / 2.0f;
    auto x_of = [half_w](float _x) { return static_cast<int>(std::lround((_x + 1.0f) * half_w)); };
    auto y_of = [half_h](float _y) { return static_cast<int>(std::lround((1.0f - _y) * half_h)); };
    std::vector<SDrawn> drawn;
    int handle = -1;
    for (qorhost::SRenderCall const &call : m_recorder.calls()) {
        if (call.m_op == "set_material") handle = call.m_handle;
        if (call.m_op == "draw_quad") {
            int const x = x_of(call.m_points[0].x), y = y_of(call.m_points[0].y);
            drawn.push_back(
                SDrawn{"quad", CRectArea(x, y, x_of(call.m_points[2].x) - x, y_of(call.m_points[2].y) - y),
                       handle, call.m_colours[0]});
        }
        if (call.m_op == "set_clip_rect") {
            // The clip's position is its lower left corner.
            int const w = static_cast<int>(std::lround(call.m_points[1].x * half_w));
            int const h = static_cast<int>(std::lround(call.m_points[1].y * half_h));
            drawn.push_back(SDrawn{"clip",
                                   CRectArea(x_of(call.m_points[0].x), y_of(call.m_points[0].y) - h, w, h),
                                   -1, rgba_t()});
        }
    }
    return drawn;
}

void CWorld::expect_golden(char const *_name) {
    qortest::expect_golden(m_renderer.get_frame(), _name);
}

std::vector<CWorld::SDrawn> CWorld::quads() const {
    std::vector<SDrawn> found;
    for (SDrawn const &drawn_call : drawn())
        if (drawn_call.m_op == "quad") found.push_back(drawn_call);
    return found;
}

std::string CWorld::clips() const {
    std::string text;
    for (SDrawn const &drawn_call : drawn())
        if (drawn_call.m_op == "clip") text += (text.empty() ? "" : "; ") + rect_text(drawn_call.m_rect);
    return text;
}

std::string rect_text(CRectArea const &_r) {
    return std::to_string(_r.x) + "," + std::to_string(_r.y) + " " + std::to_string(_r.w) + "x" +
           std::to_string(_r.h);
}

std::string place_text(CWindow const *_p_wnd) {
    return rect_text(CRectArea(_p_wnd->get_pos().x, _p_wnd->get_pos().y, _p_wnd->get_w(), _p_wnd->get_h()));
}

std::vector<CRectArea> CWorld::glyphs(CFont *_p_font) const {
    std::vector<CRectArea> found;
    CMaterial *p_material = _p_font ? _p_font->get_char_material('A') : nullptr;
    if (!p_material) return found;
    for (SDrawn const &drawn_call : drawn())
        if (drawn_call.m_op == "quad" && drawn_call.m_handle == p_material->get_material_handle())
            found.push_back(drawn_call.m_rect);
    return found;
}

std::string event_name(EEventType _id) {
    // clang-format off
    static char const *const names[] = {
        "EVENT_UPDATE", "EVENT_DRAW", "EVENT_HIDE", "EVENT_SHOW", "EVENT_SHOW_MAXIMIZED", "EVENT_SHOW_NORMAL",
        "EVENT_ACTIVATE", "EVENT_DEACTIVATE", "EVENT_LOST_FOCUS", "EVENT_ENABLE", "EVENT_DISABLE",
        "EVENT_RESIZE", "EVENT_RESIZED", "EVENT_DRAG_BEGIN", "EVENT_DRAG", "EVENT_DRAG_END",
        "EVENT_REPORT_POINT_INSIDE", "EVENT_POINTER_ENTER", "EVENT_POINTER_EXIT", "EVENT_POINTER_MOVE",
        "EVENT_POINTER_POS", "EVENT_POINTER_DOWN", "EVENT_POINTER_UP", "EVENT_WHEEL_ROTATED", "EVENT_CLICK",
        "EVENT_DOUBLE_CLICK", "EVENT_CHANGED", "EVENT_SET_TEXT", "EVENT_SET_STR", nullptr, nullptr,
        "EVENT_KEY_DOWN", "EVENT_KEY_UP", "EVENT_CHAR", "EVENT_LINE_UP", "EVENT_LINE_DOWN", "EVENT_PAGE_UP",
        "EVENT_PAGE_DOWN", "EVENT_SCROLL_SMALL_STEP", "EVENT_SCROLL_LARGE_STEP", "EVENT_CHECKED",
        "EVENT_UNCHECKED", "EVENT_HIGHLIGHTED", "EVENT_RESOURCE_INVALIDATE"};
    // clang-format on
    size_t const index = static_cast<size_t>(_id);
    if (index < sizeof(names) / sizeof(names[0]) && names[index]) return names[index];
    return std::to_string(index);
}

void log_events(CWindow *_p_wnd, std::initializer_list<EEventType> _ids, std::vector<std::string> &_log) {
    for (EEventType const id : _ids)
        _p_wnd->register_callback(
            id, CEventCallback([&_log, id](CWndEvent const *) { _log.push_back(event_name(id)); }));
}

void expect_golden(qorhost::SImage const &_actual, std::string const &_name) {
    std::string const golden_path = source_dir() + "/tests/golden/" + _name + ".png";
    if (std::getenv("QOR_UPDATE_GOLDEN")) {
        ASSERT_TRUE(qorhost::write_png(golden_path, _actual)) << golden_path;
    }
    qorhost::SImage golden;
    ASSERT_TRUE(qorhost::load_image(golden_path, golden)) << golden_path;
    if (qorhost::compare_images(_actual, golden, 2) == 0) return;
    std::string const dir =
        std::string("/tmp/qorui_golden_") + ::testing::UnitTest::GetInstance()->current_test_info()->name();
    std::string const actual_path = dir + "_" + _name + ".png", diff_path = dir + "_" + _name + "_diff.png";
    qorhost::write_png(actual_path, _actual);
    EXPECT_EQ(0, qorhost::compare_images(_actual, golden, 2, diff_path))
        << _name << ": actual " << actual_path << ", difference " << diff_path;
}

void CEventLog::watch(CWindow *_p_wnd, std::vector<EEventType> const &_ids) {
    std::string const name = _p_wnd->get_name();
    for (EEventType id : _ids)
        _p_wnd->register_callback(id, CEventCallback([this, name](CWndEvent const *p_event) {
                                      m_lines.push_back(name + ":" + event_name(p_event->get_id()));
                                  }));
}

std::vector<std::string> CEventLog::take() {
    std::vector<std::string> lines;
    lines.swap(m_lines);
    return lines;
}

LuaPlus::LuaObject lua_table(std::string const &_chunk) {
    lua_machine().DoString(("qortest_table = " + _chunk).c_str());
    return lua_machine().GetGlobals().GetByName("qortest_table");
}

LuaPlus::LuaObject new_table() {
    LuaPlus::LuaObject table;
    table.AssignNewTable(&lua_machine());
    return table;
}

void load_state(CWindow *_p_wnd, std::string const &_chunk) {
    LuaPlus::LuaObject table = lua_table(_chunk);
    _p_wnd->load_state(table);
}

LuaPlus::LuaObject saved_state(CWindow *_p_wnd) {
    LuaPlus::LuaObject table = new_table();
    _p_wnd->save_state(table);
    return table;
}

} // namespace qortest
