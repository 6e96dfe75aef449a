// Windows that stand for a position rather than a rectangle. A pointer's position is its hot spot;
// a cursor's is its lower left corner. The const get_pos of the window keeps giving the top left
// corner, for saving and dragging; the reference point comes from the non-const get_pos.
#pragma once
#include "ui_window_visual.h"

namespace qorui {

class CDesktop;

class CPointer : public CWindowVisual {
public:
    // Appears and vanishes at once: no fades.
    CPointer(IWindowDesktop *_p_desktop, char const *_name);
    virtual ~CPointer() {}

    QOR_CLASS_ID(CPointer, CWindowVisual, "Pointer")

    virtual void set_pos(int _x, int _y) override;
    using CWindow::get_pos;
    virtual point_t get_pos();

    // The window stays; the reference point moves by the difference.
    void set_hotspot(point_t const &_hotspot) { m_hotspot = _hotspot; }

private:
    friend class CDesktop;
    point_t m_hotspot;
};

class CCursor : public CWindowVisual {
public:
    CCursor(IWindowDesktop *_p_desktop, char const *_name);
    virtual ~CCursor() {}

    QOR_CLASS_ID(CCursor, CWindowVisual, "Cursor")

    virtual void set_pos(int _x, int _y) override;
    using CWindow::get_pos;
    virtual point_t get_pos();
};

} // namespace qorui
