// The recording renderer: every call with its arguments, handed on to a target renderer.
#include "recording_renderer.h"

namespace qorhost {

SRenderCall &CRecordingRenderer::record(char const *_op) {
    m_calls.push_back(SRenderCall());
    m_calls.back().m_op = _op;
    return m_calls.back();
}

std::string CRecordingRenderer::sequence() const {
    std::string text;
    for (SRenderCall const &call : m_calls) text += (text.empty() ? "" : " ") + call.m_op;
    return text;
}

void CRecordingRenderer::render_view(IRenderCamera *_p_camera) {
    record("render_view");
    if (mp_target) mp_target->render_view(_p_camera);
}

void CRecordingRenderer::finish_view() {
    record("finish_view");
    if (mp_target) mp_target->finish_view();
}

void CRecordingRenderer::present() {
    record("present");
    if (mp_target) mp_target->present();
}

int CRecordingRenderer::create_material(char const *_material_template, char const *_diffuse, char const *_bump,
                                        char const *_specular, char const *_luminosity, char const *_reflection,
                                        bool _precache_enable, bool _load_textures_from_game_save) {
    SRenderCall &call = record("create_material");
    for (char const *name : {_material_template, _diffuse, _bump, _specular, _luminosity, _reflection})
        call.m_names.push_back(name ? name : "");
    call.m_handle = mp_target ? mp_target->create_material(_material_template, _diffuse, _bump, _specular,
                                                           _luminosity, _reflection, _precache_enable,
                                                           _load_textures_from_game_save)
                              : m_next_handle++;
    return call.m_handle;
}

void CRecordingRenderer::destroy_material(int _handle) {
    record("destroy_material").m_handle = _handle;
    if (mp_target) mp_target->destroy_material(_handle);
}

IAviTexture *CRecordingRenderer::get_avi_texture(int _id) {
    record("get_avi_texture").m_handle = _id;
    return mp_target ? mp_target->get_avi_texture(_id) : nullptr;
}

void CRecordingRenderer::begin_2d() {
    record("begin_2d");
    if (mp_target) mp_target->begin_2d();
}

void CRecordingRenderer::end_2d() {
    record("end_2d");
    if (mp_target) mp_target->end_2d();
}

void CRecordingRenderer::set_material(int _handle) {
    record("set_material").m_handle = _handle;
    if (mp_target) mp_target->set_material(_handle);
}

void CRecordingRenderer::draw_quad(vec2_t const &_p0, vec2_t const &_t0, rgba_t const &_c0, vec2_t const &_p1,
                                   vec2_t const &_t1, rgba_t const &_c1, vec2_t const &_p2, vec2_t const &_t2,
                                   rgba_t const &_c2, vec2_t const &_p3, vec2_t const &_t3, rgba_t const &_c3) {
    SRenderCall &call = record("draw_quad");
    call.m_points = {_p0, _p1, _p2, _p3};
    call.m_uvs = {_t0, _t1, _t2, _t3};
    call.m_colours = {_c0, _c1, _c2, _c3};
    if (mp_target) mp_target->draw_quad(_p0, _t0, _c0, _p1, _t1, _c1, _p2, _t2, _c2, _p3, _t3, _c3);
}

void CRecordingRenderer::set_clip_rect(vec2_t const &_position, vec2_t const &_size) {
    record("set_clip_rect").m_points = {_position, _size};
    if (mp_target) mp_target->set_clip_rect(_position, _size);
}

void CRecordingRenderer::push_clip_rect() {
    record("push_clip_rect");
    if (mp_target) mp_target->push_clip_rect();
}

void CRecordingRenderer::pop_clip_rect() {
    record("pop_clip_rect");
    if (mp_target) mp_target->pop_clip_rect();
}

void CRecordingRenderer::draw_line(vec2_t const &_from, rgba_t const &_c_from, vec2_t const &_to, rgba_t const &_c_to,
                                   float _width) {
    SRenderCall &call = record("draw_line");
    call.m_points = {_from, _to};
    call.m_colours = {_c_from, _c_to};
    call.m_uvs = {vec2_t{_width, 0.0f}};
    if (mp_target) mp_target->draw_line(_from, _c_from, _to, _c_to, _width);
}

} // namespace qorhost
