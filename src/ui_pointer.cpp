// The pointer and the text cursor: windows placed by a reference point.
#include "ui_pointer.h"

namespace qorui {

void CReferencePointWindow::set_pos(int _x, int _y) {
    point_t const offset = reference_offset();
    CWindow::set_pos(_x - offset.x, _y - offset.y);
}

point_t CReferencePointWindow::get_pos() {
    point_t const pos = CWindow::get_pos(), offset = reference_offset();
    return point_t{pos.x + offset.x, pos.y + offset.y};
}

CPointer::CPointer(CDesktop *_p_desktop, char const *_name)
    : CReferencePointWindow(_p_desktop, _name), m_hotspot{0, 0} {
    m_fade_in = 0;
    m_fade_out = 0;
}

} // namespace qorui
