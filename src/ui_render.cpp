// The render bridge: desktop pixels to the engine's device coordinates, clip areas, 2D frames
// with 3D views inside them, and the figures of each frame.
#include "ui_render.h"
#include "engine_interfaces.h"
#include "qor_commands.h"
#include "ui_debug.h"

#include <algorithm>
#include <climits>

namespace qorui {

namespace {

int screen_var(IVarManagerBase *_p_vars, char const *_name) {
    SVariable const *p_var = _p_vars ? _p_vars->find_var(_name) : nullptr;
    return p_var ? p_var->m_int_value : 0;
}

SPixelRect intersection(SPixelRect const &_a, SPixelRect const &_b) {
    return SPixelRect{std::max(_a.m_l, _b.m_l), std::max(_a.m_t, _b.m_t), std::min(_a.m_r, _b.m_r),
                      std::min(_a.m_b, _b.m_b)};
}

SPixelRect bounds(SPixelRect const &_a, SPixelRect const &_b) {
    return SPixelRect{std::min(_a.m_l, _b.m_l), std::min(_a.m_t, _b.m_t), std::max(_a.m_r, _b.m_r),
                      std::max(_a.m_b, _b.m_b)};
}

// No half-pixel offset: the desktop's corners are exactly (-1, 1) and (1, -1). In double, a
// product by the step 2 / size gives the float of (p / size - 0.5) * 2 to the last bit.
float device_x(int _x, double _step_x) {
    return static_cast<float>(_x * _step_x - 1.0);
}

float device_y(int _y, double _step_y) {
    return static_cast<float>(1.0 - _y * _step_y);
}

} // namespace

CRender::CRender()
    : mp_render(nullptr), m_in_draw_2d(0), m_in_draw_3d(0), m_res_w(0), m_res_h(0), m_scale_x(0.0f),
      m_scale_y(0.0f), m_step_x(0.0), m_step_y(0.0), m_scr_w(0), m_scr_h(0), m_frame{0, 0, 0},
      m_last_frame{0, 0, 0}, m_visible{0, 0, 0, 0}, m_visible_before{0, 0, 0, 0}, m_saved{}, m_pushes(0) {}

void CRender::init(IRenderQOR *_p_render) {
    QOR_CHECK(_p_render);
    mp_render = _p_render;
    IVarManagerBase *p_vars = engine_interfaces().get_var_manager(true);
    m_scr_w = screen_var(p_vars, "scr_resx");
    m_scr_h = screen_var(p_vars, "scr_resy");
}

void CRender::set_resolution(int _w, int _h) {
    m_res_w = _w;
    m_res_h = _h;
    m_scale_x = 2.0f / static_cast<float>(_w);
    m_scale_y = 2.0f / static_cast<float>(_h);
    m_step_x = 2.0 / _w;
    m_step_y = 2.0 / _h;
    m_visible = m_visible_before = desktop_area();
}

bool CRender::has_render() const {
    return QOR_CHECK(mp_render);
}

vec2_t CRender::to_device(point_t const &_p) const {
    return vec2_t{device_x(_p.x, m_step_x), device_y(_p.y, m_step_y)};
}

// The outermost begin starts the frame's figures, and its end keeps them.
void CRender::begin_draw() {
    if (!has_render()) return;
    if (m_in_draw_2d == 0) {
        m_frame = SRenderFigures{0, 0, 0};
        m_visible = m_visible_before = desktop_area(); // the engine's clip isn't known yet
        m_pushes = 0;
    }
    mp_render->begin_2d();
    ++m_in_draw_2d;
}

void CRender::end_draw() {
    if (!QOR_CHECK(mp_render && m_in_draw_2d > 0)) return;
    mp_render->end_2d();
    if (--m_in_draw_2d == 0) m_last_frame = m_frame;
}

int CRender::create_material(char const *_material_template, char const *_diffuse, char const *_bump,
                             char const *_specular, char const *_luminosity, char const *_reflection,
                             bool _precache_enable, bool _load_textures_from_game_save) {
    if (!has_render()) return -1;
    return mp_render->create_material(_material_template, _diffuse, _bump, _specular, _luminosity,
                                      _reflection, _precache_enable, _load_textures_from_game_save);
}

void CRender::destroy_material(int _handle) {
    if (has_render()) mp_render->destroy_material(_handle);
}

void CRender::set_material(int _handle) {
    if (!has_render()) return;
    mp_render->set_material(_handle);
    ++m_frame.m_materials_set;
}

// The engine takes the lower left corner of the area.
void CRender::set_clip_area(int _x, int _y, int _w, int _h) {
    if (!has_render()) return;
    vec2_t const position = to_device(point_t{_x, _y + _h});
    vec2_t const size{_w * m_scale_x, _h * m_scale_y};
    mp_render->set_clip_rect(position, size);
    m_visible_before = m_visible;
    long long const r = static_cast<long long>(_x) + std::max(_w, 0);
    long long const b = static_cast<long long>(_y) + std::max(_h, 0);
    m_visible = intersection(SPixelRect{_x, _y, static_cast<int>(std::min<long long>(r, INT_MAX)),
                                        static_cast<int>(std::min<long long>(b, INT_MAX))},
                             desktop_area());
}

void CRender::push_clip_area() {
    if (!has_render()) return;
    mp_render->push_clip_rect();
    if (m_pushes < k_saved_clips) m_saved[m_pushes] = SSavedClip{m_visible, m_visible_before};
    ++m_pushes;
}

void CRender::pop_clip_area() {
    if (!has_render()) return;
    mp_render->pop_clip_rect();
    bool const known = m_pushes > 0 && m_pushes <= k_saved_clips;
    m_visible =
        known ? bounds(m_saved[m_pushes - 1].m_visible, m_saved[m_pushes - 1].m_before) : desktop_area();
    m_visible_before = m_visible;
    if (m_pushes > 0) --m_pushes;
}

void CRender::draw_quad(point_t const &_p0, point_t const &_p1, point_t const &_p2, point_t const &_p3,
                        vec2_t const &_t0, vec2_t const &_t1, vec2_t const &_t2, vec2_t const &_t3,
                        rgba_t const &_c0, rgba_t const &_c1, rgba_t const &_c2, rgba_t const &_c3) {
    if (!has_render()) return;
    // The corners share their coordinates with their neighbours, as an upright rectangle's do: a
    // coordinate equal to one converted before is taken from there.
    auto beside = [this](point_t const &_p, point_t const &_a, vec2_t const &_a_device, point_t const &_b,
                         vec2_t const &_b_device) {
        return vec2_t{_p.x == _a.x   ? _a_device.x
                      : _p.x == _b.x ? _b_device.x
                                     : device_x(_p.x, m_step_x),
                      _p.y == _a.y   ? _a_device.y
                      : _p.y == _b.y ? _b_device.y
                                     : device_y(_p.y, m_step_y)};
    };
    vec2_t const d0 = to_device(_p0);
    vec2_t const d1 = beside(_p1, _p0, d0, _p0, d0);
    vec2_t const d2 = beside(_p2, _p1, d1, _p0, d0);
    vec2_t const d3 = beside(_p3, _p2, d2, _p0, d0);
    mp_render->draw_quad(d0, _t0, _c0, d1, _t1, _c1, d2, _t2, _c2, d3, _t3, _c3);
    ++m_frame.m_quads;
}

void CRender::draw_line(point_t const &_from, point_t const &_to, rgba_t const &_c_from,
                        rgba_t const &_c_to) {
    if (!has_render()) return;
    mp_render->draw_line(to_device(_from), _c_from, to_device(_to), _c_to, 1.0f);
    ++m_frame.m_lines;
}

void CRender::render_view(int _x, int _y, int _w, int _h, IRenderCamera *_p_camera) {
    if (!has_render()) return;
    begin_draw_3d();
    if (_p_camera && m_res_w > 0 && m_res_h > 0)
        _p_camera->set_viewport(_x * m_scr_w / m_res_w, _y * m_scr_h / m_res_h, _w * m_scr_w / m_res_w,
                                _h * m_scr_h / m_res_h);
    mp_render->render_view(_p_camera);
    end_draw_3d();
    m_visible = m_visible_before = desktop_area(); // the view may leave the engine's clip as it likes
}

IAviTexture *CRender::get_avi_texture(int _id) {
    return mp_render ? mp_render->get_avi_texture(_id) : nullptr;
}

// The 2D batch is suspended round the view; its count stays.
void CRender::begin_draw_3d() {
    if (m_in_draw_2d > 0) mp_render->end_2d();
    ++m_in_draw_3d;
}

void CRender::end_draw_3d() {
    if (!QOR_CHECK(mp_render && m_in_draw_3d > 0)) return;
    mp_render->finish_view();
    if (m_in_draw_2d > 0) mp_render->begin_2d();
    --m_in_draw_3d;
}

} // namespace qorui
