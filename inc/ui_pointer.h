// Windows that stand for a point rather than a rectangle: the pointer, whose position is its hot
// spot, and the text cursor, whose position is its lower left corner. The const get_pos of the
// window keeps giving the top left corner, for saving and dragging; the reference point comes
// from the non-const get_pos.
#pragma once
#include "ui_window_visual.h"

namespace qorui {

class CDesktop;

// A visual window placed and read by a reference point at an offset from its top left corner.
class CReferencePointWindow : public CWindowVisual {
public:
    // The visual window's constructor.
    using CWindowVisual::CWindowVisual;

    // Places the window so that its reference point stands at (_x, _y).
    virtual void set_pos(int _x, int _y) override;
    using CWindow::get_pos;
    // The reference point's position relative to the parent.
    virtual point_t get_pos();

protected:
    // The reference point, from the top left corner.
    virtual point_t reference_offset() const = 0;
};

// The on-screen pointer; its position is its hot spot.
class CPointer : public CReferencePointWindow {
public:
    // Appears and vanishes at once: no fades.
    CPointer(CDesktop *_p_desktop, char const *_name);
    // Nothing of its own to release.
    virtual ~CPointer() {}

    QOR_CLASS_ID(CPointer, CWindowVisual, "Pointer")

    // The window stays; the reference point moves by the difference.
    void set_hotspot(point_t const &_hotspot) { m_hotspot = _hotspot; }

protected:
    // The hot spot.
    point_t reference_offset() const override { return m_hotspot; }

private:
    friend class CDesktop; // hangs the pointer from itself without making it a child
    point_t m_hotspot;
};

// The text cursor; its position is its lower left corner.
class CCursor : public CReferencePointWindow {
public:
    // The visual window's constructor.
    using CReferencePointWindow::CReferencePointWindow;
    // Nothing of its own to release.
    virtual ~CCursor() {}

    QOR_CLASS_ID(CCursor, CWindowVisual, "Cursor")

protected:
    // The lower left corner.
    point_t reference_offset() const override { return point_t{0, get_h()}; }
};

} // namespace qorui
