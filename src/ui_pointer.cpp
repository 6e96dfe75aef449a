#include "ui_pointer.h"

namespace qorui {

CPointer::CPointer(IWindowDesktop *_p_desktop, char const *_name)
    : CWindowVisual(_p_desktop, _name), m_hotspot{0, 0} {
    m_fade_in = 0;
    m_fade_out = 0;
}

void CPointer::set_pos(int _x, int _y) {
    CWindow::set_pos(_x - m_hotspot.x, _y - m_hotspot.y);
}

point_t CPointer::get_pos() {
    point_t const pos = CWindow::get_pos();
    return point_t{pos.x + m_hotspot.x, pos.y + m_hotspot.y};
}

CCursor::CCursor(IWindowDesktop *_p_desktop, char const *_name) : CWindowVisual(_p_desktop, _name) {}

void CCursor::set_pos(int _x, int _y) {
    CWindow::set_pos(_x, _y - get_h());
}

point_t CCursor::get_pos() {
    point_t const pos = CWindow::get_pos();
    return point_t{pos.x, pos.y + get_h()};
}

} // namespace qorui
