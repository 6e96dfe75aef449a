// Positions, sizes and size constraints in whole desktop pixels: origin top left, y downward,
// right and bottom edges outside a rectangle, floats cut toward zero.
#pragma once
#include "qor_math.h"
#include "qor_memory.h"

namespace qorui {

struct point_t {
    int x;
    int y;
};

// A position in whole desktop pixels.
class CPoint {
public:
    CPoint() : x(0), y(0) {}
    CPoint(int _x, int _y) : x(_x), y(_y) {}
    void set(int _x, int _y) {
        x = _x;
        y = _y;
    }
    int get_x() const { return x; }
    int get_y() const { return y; }

    int x;
    int y;
};

// Position and size in one, as layout-building helpers take them.
class CRectArea {
public:
    CRectArea() : x(0), y(0), w(0), h(0) {}
    CRectArea(int _x, int _y, int _w, int _h) : x(_x), y(_y), w(_w), h(_h) {}
    void set(int _w, int _h) { // the size only; the position stays
        w = _w;
        h = _h;
    }
    int get_w() const { return w; }
    int get_h() const { return h; }

    int x;
    int y;
    int w;
    int h;
};

// 0 or less means no limit in that direction.
struct SConstraints {
    int min_w;
    int max_w;
    int min_h;
    int max_h;
};

// A size that keeps to its constraints. Where a minimum exceeds the maximum, the maximum wins.
class CRegion {
public:
    CRegion() : m_w(0), m_h(0), m_constraints() {}
    CRegion(int _w, int _h);

    void set_rectangle(int _w, int _h);
    void set_w(int _w) { set_rectangle(_w, m_h); }
    void set_h(int _h) { set_rectangle(m_w, _h); }
    int get_w() const { return m_w; }
    int get_h() const { return m_h; }

    // _point in the region's own coordinates.
    bool is_point_inside(point_t const &_point) const;

    SConstraints const &get_constraints() const { return m_constraints; }
    void set_constraints(SConstraints const &_constraints);

private:
    int m_w;
    int m_h;
    SConstraints m_constraints;
};

enum EAlignment {
    ALIGNMENT_NONE = 0,
    ALIGNMENT_TOP = 1,
    ALIGNMENT_LEFT = 2,
    ALIGNMENT_RIGHT = 3,
    ALIGNMENT_BOTTOM = 4,
    ALIGNMENT_CENTER = 5,
    ALIGNMENT_CLIENT = 6
};

// The names of layouts, indexed by value, ended by a null entry.
extern char const *const g_alignment_names[];

// Exact, case-sensitive lookup of a layout name; false for a name that isn't one.
bool find_alignment(char const *_p_name, EAlignment &_alignment);

} // namespace qorui
