// The smallest owner a canvas needs: a place on the desktop, a transparency, a size and a bridge.
#pragma once
#include "ui_canvas.h"

namespace qortest {

class CCanvasOwner : public qorui::ICanvasOwner {
public:
    CCanvasOwner(qorui::IRender *_p_render, int _x, int _y, int _w, int _h)
        : m_origin{_x, _y}, m_w(_w), m_h(_h), mp_render(_p_render) {}

    qorui::point_t const &get_canvas_origin() const override { return m_origin; }
    float get_transparency() const override { return m_transparency; }
    int get_canvas_w() const override { return m_w; }
    int get_canvas_h() const override { return m_h; }
    qorui::IRender *get_canvas_render() const override { return mp_render; }

    qorui::point_t m_origin;
    int m_w, m_h;
    float m_transparency = 1.0f;
    qorui::IRender *mp_render;
};

} // namespace qortest
