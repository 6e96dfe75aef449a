// Regions under size constraints, their point test, and the names of alignments.
#include "ui_geometry.h"
#include <cstring>

namespace qorui {

char const *const g_alignment_names[] = {
    "ALIGNMENT_NONE",   "ALIGNMENT_TOP",    "ALIGNMENT_LEFT",   "ALIGNMENT_RIGHT",
    "ALIGNMENT_BOTTOM", "ALIGNMENT_CENTER", "ALIGNMENT_CLIENT", nullptr};

bool find_alignment(char const *_p_name, EAlignment &_alignment) {
    if (!_p_name) return false;
    for (int i = 0; g_alignment_names[i]; ++i) {
        if (std::strcmp(g_alignment_names[i], _p_name) == 0) {
            _alignment = static_cast<EAlignment>(i);
            return true;
        }
    }
    return false;
}

CRegion::CRegion(int _w, int _h) : m_w(0), m_h(0), m_constraints() {
    set_rectangle(_w, _h);
}

// Minimum before maximum, so the maximum wins; then nothing negative.
void CRegion::set_rectangle(int _w, int _h) {
    SConstraints const &c = m_constraints;
    if (c.min_w > 0 && _w < c.min_w) _w = c.min_w;
    if (c.max_w > 0 && _w > c.max_w) _w = c.max_w;
    if (c.min_h > 0 && _h < c.min_h) _h = c.min_h;
    if (c.max_h > 0 && _h > c.max_h) _h = c.max_h;
    m_w = _w < 0 ? 0 : _w;
    m_h = _h < 0 ? 0 : _h;
}

bool CRegion::is_point_inside(point_t const &_point) const {
    return _point.x >= 0 && _point.x < m_w && _point.y >= 0 && _point.y < m_h;
}

void CRegion::set_constraints(SConstraints const &_constraints) {
    m_constraints = _constraints;
    set_rectangle(m_w, m_h);
}

} // namespace qorui
