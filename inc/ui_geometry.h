// Positions, sizes and size constraints in whole desktop pixels: origin top left, y downward,
// right and bottom edges outside a rectangle, floats cut toward zero.
#pragma once
#include "qor_math.h"
#include "qor_memory.h"

namespace qorui {

// A position or a size in whole desktop pixels: the type of positions in interfaces and
// event data.
struct point_t {
    // Across and down.
    // @{
    int x;
    int y;
    // @}
};

// A position in whole desktop pixels.
class CPoint {
public:
    // The origin, or the point given.
    // @{
    CPoint() : x(0), y(0) {}
    CPoint(int _x, int _y) : x(_x), y(_y) {}
    // @}
    // Sets both coordinates.
    void set(int _x, int _y) {
        x = _x;
        y = _y;
    }
    // The coordinates.
    // @{
    int get_x() const { return x; }
    int get_y() const { return y; }

    int x;
    int y;
    // @}
};

// Position and size in one, as layout-building helpers take them.
class CRectArea {
public:
    // All 0, or the rectangle given.
    // @{
    CRectArea() : x(0), y(0), w(0), h(0) {}
    CRectArea(int _x, int _y, int _w, int _h) : x(_x), y(_y), w(_w), h(_h) {}
    // @}
    // Sets the size only; the position stays.
    void set(int _w, int _h) {
        w = _w;
        h = _h;
    }
    // The size.
    // @{
    int get_w() const { return w; }
    int get_h() const { return h; }
    // @}

    // Top left corner, then width and height.
    // @{
    int x;
    int y;
    int w;
    int h;
    // @}
};

// 0 or less means no limit in that direction.
struct SConstraints {
    int min_w; // smallest width
    int max_w; // largest width
    int min_h; // smallest height
    int max_h; // largest height
};

// A size that keeps to its constraints. Where a minimum exceeds the maximum, the maximum wins.
class CRegion {
public:
    // Size 0 with no constraints.
    CRegion() : m_w(0), m_h(0), m_constraints() {}
    // That size, with no constraints; a negative value becomes 0.
    CRegion(int _w, int _h);

    // Stores the size, or one side of it, and applies the constraints to both sides.
    // @{
    void set_rectangle(int _w, int _h);
    void set_w(int _w) { set_rectangle(_w, m_h); }
    void set_h(int _h) { set_rectangle(m_w, _h); }
    // @}
    // The size in pixels, never negative.
    // @{
    int get_w() const { return m_w; }
    int get_h() const { return m_h; }
    // @}

    // 0 <= x < width and 0 <= y < height, _point in the region's own coordinates. An empty
    // region contains no point.
    bool is_point_inside(point_t const &_point) const;

    // The limits on the size; setting them applies them to the stored size at once.
    // @{
    SConstraints const &get_constraints() const { return m_constraints; }
    void set_constraints(SConstraints const &_constraints);
    // @}

private:
    int m_w;
    int m_h;
    SConstraints m_constraints;
};

// How a window places itself in its parent's client area (CW by CH from the client corner P)
// whenever it or the parent is laid out. Some controls read the same values to place a text.
enum EAlignment {
    ALIGNMENT_NONE = 0,   // position and size as set
    ALIGNMENT_TOP = 1,    // at P, width CW
    ALIGNMENT_LEFT = 2,   // at P, height CH
    ALIGNMENT_RIGHT = 3,  // at the right edge, height CH
    ALIGNMENT_BOTTOM = 4, // at the bottom edge, width CW
    ALIGNMENT_CENTER = 5, // centred on the client size, measured from the parent's corner
    ALIGNMENT_CLIENT = 6  // at P, CW by CH
};

// The names of layouts, indexed by value, ended by a null entry.
extern char const *const g_alignment_names[];

// Exact, case-sensitive lookup of a layout name; false for a name that isn't one.
bool find_alignment(char const *_p_name, EAlignment &_alignment);

} // namespace qorui
