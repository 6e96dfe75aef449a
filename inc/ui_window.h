// The window tree: links, position and size, behaviour flags, and the routing of events.
//
//   sending, routing        send_event, on_event, filter_event
//   tree                    attach_child, detach_child, bring_to_front, get_child, get_children
//   geometry                set_pos, set_size, alignment, maximising, calc_global_pos
//   persistence             save_state, load_state, import
//   handlers                on_event_*: the default behaviour, one callback each on the window
//
// A window draws nothing; drawing starts with the visual window.
#pragma once
#include "ui_class_id.h"
#include "ui_event.h"
#include "ui_geometry.h"
#include "ui_huid.h"

#include <new>

namespace LuaPlus {
class LuaObject;
}

namespace qorui {

class CWindow;
class CDesktop;
class CMaterial;
class IRender;

// A node of the window tree: links, position and size, behaviour flags and the routing of events.
class CWindow : public CEventDispatcher {
public:
    // Not attached, not hidden, 0 by 0; _name (119 bytes at most) names it in the tree and in
    // layouts. Registers one callback per handler on itself.
    CWindow(CDesktop *_p_desktop, char const *_name);
    // Deletes the children, then tells the desktop, which drops every reference to the window.
    // Delete only windows that no event is passing through; CDesktop::delete_window defers it.
    virtual ~CWindow();

    // Windows live on the library's heap whichever module makes them with new, since the tree
    // deletes them from inside the library.
    // @{
    static void *operator new(size_t _size);
    static void *operator new(size_t _size, std::nothrow_t const &) noexcept;
    static void operator delete(void *_p) noexcept;
    static void operator delete(void *_p, std::nothrow_t const &) noexcept;
    // @}

    virtual void send_event(CWindow *_p_receiver, CWndEvent const *_p_event,
                            CWndEvent::EDispatchType _type) override;
    // A new event of that type with an empty stream, sent by the virtual form.
    void send_event(CWindow *_p_receiver, EEventType _id, CWndEvent::EDispatchType _type);

    QOR_CLASS_ID_ROOT(CWindow, "Window")

    // Tree and identity: links, order, lookup, the name

    // Makes the window the parent of _p_child (passive when this one is), appends the child
    // unless it is there already, brings it to the front and has its subtree look its resources
    // up again. Detach from an old parent first. The parent owns its children.
    virtual void attach_child(CWindow *_p_child);
    // Runs on the child when attach_child has really added it; empty here.
    virtual void on_attached() {}
    // Runs on the parent from load_state, behind each child entry; empty here.
    virtual void on_child_attached() {}
    // Takes the child out of the list, keeping the order of the others; nothing if it isn't
    // there. The child's parent link stays, and the caller owns the child now.
    virtual void detach_child(CWindow *_p_child);
    // Runs on the child when detach_child has really removed it; empty here.
    virtual void on_detached() {}
    // The child goes last, then behind every always-on-top sibling.
    virtual void bring_to_front(CWindow *_p_child);
    // Null for the desktop and for a window not attached.
    CWindow *get_parent() { return mp_parent; }
    // The desktop of the tree, given at construction.
    CDesktop *get_desktop() { return mp_desktop; }
    // The number of direct children.
    unsigned int get_children_count() const { return static_cast<unsigned int>(m_children.size()); }
    // The child at _idx, from back (0) to front; null, with a report, when out of range.
    CWindow *get_child(unsigned int _idx);
    // A direct child first, then depth first through the children in order. A null class name
    // matches any class. Both comparisons are exact.
    CWindow *get_child(char const *_name, char const *_class_name, bool _direct_only);
    // The whole subtree, each window before its own children; the window itself isn't included.
    void get_children(qor_vector<CWindow *> &_children);

    // The window's name and its hash, as given to the constructor.
    // @{
    HUID const &get_id() const { return m_id; }
    char const *get_name() const { return m_id.GetName(); }
    // @}

    // Flags

    // Hidden: a hidden window takes only update, show, enable, disable, set text, resized and
    // resource invalidate events, and can't be pointed at.
    bool is_hidden() const { return m_is_hidden; }
    // Quietly: no event, no fade, no auto delete.
    void set_hidden(bool _hidden);
    // Disabled: a disabled window still draws and can be pointed at, but takes no input and no
    // update. Setting it sends no event; EVENT_ENABLE and EVENT_DISABLE set it too.
    // @{
    bool is_disabled() const { return m_is_disabled; }
    void set_disabled(bool _disabled) { m_is_disabled = _disabled; }
    // @}
    // Passive: the window can't become the active window; activation goes to its nearest
    // non-passive ancestor.
    bool is_passive() const { return m_is_passive; }
    // Passes a change down the subtree; no change visits nothing.
    void set_passive(bool _passive);
    // While the window is active, the desktop treats it as pointed at wherever the pointer is.
    // @{
    bool is_pointer_capture() const { return m_pointer_capture; }
    void set_pointer_capture(bool _capture) { m_pointer_capture = _capture; }
    // @}
    // Whether the window fills its parent.
    bool is_maximaized() const { return m_is_maximaized; }
    // Sends the window EVENT_SHOW_MAXIMIZED (true) or EVENT_SHOW_NORMAL (false), which also
    // show it; normal restores the position and size from before maximising.
    void set_maximaized(bool _maximaized);
    // The window stands in front of every plain sibling; the order changes at the next
    // bring_to_front, not here.
    // @{
    bool is_always_on_top() const { return m_always_on_top; }
    void set_always_on_top(bool _on_top) { m_always_on_top = _on_top; }
    // @}
    // While the window is active, pointer input outside its subtree is refused.
    bool is_modal() const { return m_is_modal; }
    // Setting it true also sets always-on-top; clearing it leaves that flag.
    void set_is_modal(bool _modal);
    // The desktop starts drags on the window, and the default drag handler moves it.
    // @{
    bool is_can_drag() const { return m_can_drag; }
    void set_can_drag(bool _can_drag) { m_can_drag = _can_drag; }
    // @}
    // Whether set_size may change the size; true by default.
    // @{
    bool is_can_resize() const { return m_can_resize; }
    void set_can_resize(bool _can_resize) { m_can_resize = _can_resize; }
    // @}
    // The window is deleted, at a later update, when a hide event hides it.
    // @{
    bool get_auto_delete() const { return m_auto_delete; }
    void set_auto_delete(bool _auto_delete) { m_auto_delete = _auto_delete; }
    // @}

    // Geometry

    // Whether the point, on the desktop, lies in the window; the right and bottom edges are
    // outside.
    virtual bool is_point_inside(point_t const &_global) const;
    // The size of the client area, where children align: the whole window here.
    // @{
    virtual int get_client_w() const { return m_region.get_w(); }
    virtual int get_client_h() const { return m_region.get_h(); }
    // @}
    // Moves the window, relative to its parent, and lays out it and its subtree again.
    virtual void set_pos(int _x, int _y);
    // The position relative to the parent's top left corner, in pixels.
    virtual point_t get_pos() const { return m_pos; }
    // The client area's top left corner in the window's own coordinates: (0, 0) here.
    virtual point_t get_client_pos() const { return point_t{0, 0}; }
    // The size in pixels.
    // @{
    int get_w() const { return m_region.get_w(); }
    int get_h() const { return m_region.get_h(); }
    // @}
    // set_size with one side changed.
    // @{
    void set_w(int _w) { set_size(_w, m_region.get_h()); }
    void set_h(int _h) { set_size(m_region.get_w(), _h); }
    // @}
    // Resize event (handlers may correct the size in place), constraints, then resized.
    void set_size(int _w, int _h);
    // Limits on the size; new limits act on the size at once, with no event.
    // @{
    SConstraints const &get_constraints() const { return m_region.get_constraints(); }
    void set_constraints(SConstraints const &_constraints) { m_region.set_constraints(_constraints); }
    // @}
    // How the window places itself in its parent's client area; setting it lays out again.
    // @{
    EAlignment get_alignment() const { return m_alignment; }
    void set_alignment(EAlignment _alignment);
    // @}
    // The position on the desktop, brought up to date whenever the window takes an event.
    point_t const &get_global_pos() const { return m_global_pos; }
    // A desktop point relative to the window's top left corner.
    point_t convert_to_local(point_t const &_global) const;

    // Subscribes the window to every keyboard and wheel event, active or not (false ends it).
    void input_subscribe(bool _subscribe);

    // Persistence

    // Writes the window's keys (name, class_name, pos, size, can_resize, can_drag, alignment,
    // is_modal, is_passive, auto_delete) into the table, then a new table for each child at
    // the next integer key. Hidden, disabled and maximised state aren't saved.
    virtual void save_state(LuaPlus::LuaObject &_lo_table);
    // Applies a table of save_state to this window, whose name and class must match: keys of
    // the wrong type or absent leave the field as it is. Children are found by name and class,
    // missing ones made by the factory, attached, enabled and shown.
    virtual void load_state(LuaPlus::LuaObject &_lo_table);
    // Runs "ui_material_presets.lua" and the layout file (category 16), then loads the global
    // ui_windows_ini and lays out again. The first argument is unused. A missing presets file is
    // reported; a missing layout file ends the import quietly.
    virtual void import(int _unused, char const *_file);

protected:
    // Routing and the default handlers, one for each event

    // Asks filter_event, refreshes the global position, runs the callbacks of the event's type
    // (the virtual handler first), then passes the event to the children, back to front, or to
    // the parent, as its dispatch type then says. The hit test goes only to the children for
    // which is_hit_test_needed says so.
    virtual void on_event(CWndEvent const *_p_event) override;
    // Whether the window takes the event: a hidden window takes only update, set text, enable,
    // disable, show, resized and resource invalidate; a disabled one only draw, activate,
    // changed, show, hide, enable, resized, resource invalidate and report point inside.
    virtual bool filter_event(CWndEvent const *_p_event);
    // Whether the hit test has to reach the window: false only when neither the window nor a child
    // could report the point and nothing else listens. A class whose on_event or
    // on_event_report_point_inside does more than the default answers true.
    virtual bool is_hit_test_needed(point_t const &_global);

    // EVENT_UPDATE: passes it on to the children.
    virtual void on_event_update(CWndEvent const *_p_event);
    // EVENT_DRAW: passes it on to the children; the visual window draws.
    virtual void on_event_draw(CWndEvent const *_p_event);
    // EVENT_SHOW: clears the hidden flag.
    virtual void on_event_show(CWndEvent const *_p_event);
    // EVENT_SHOW_MAXIMIZED: keeps the position and size for later, shows the window and makes
    // it fill its parent.
    virtual void on_event_show_maximized(CWndEvent const *_p_event);
    // EVENT_SHOW_NORMAL: shows the window at the position and size kept when it was maximised
    // (at (0, 0), 0 by 0 if it never was).
    virtual void on_event_show_normal(CWndEvent const *_p_event);
    // EVENT_HIDE: tells the desktop, sets the hidden flag and, with auto delete, queues the
    // window's deletion.
    virtual void on_event_hide(CWndEvent const *_p_event);
    // EVENT_ENABLE and EVENT_DISABLE: clear or set the disabled flag.
    // @{
    virtual void on_event_enable(CWndEvent const *_p_event);
    virtual void on_event_disable(CWndEvent const *_p_event);
    // @}
    // EVENT_ACTIVATE and EVENT_DEACTIVATE: the window became or stopped being the active one;
    // empty here.
    // @{
    virtual void on_event_activate(CWndEvent const *) {}
    virtual void on_event_deactivate(CWndEvent const *) {}
    // @}
    // EVENT_LOST_FOCUS: passes it on to the children.
    virtual void on_event_lost_focus(CWndEvent const *_p_event);
    // EVENT_RESIZE: without can-resize, overwrites the new size in the event with the current
    // one. Never reaches the children.
    virtual void on_event_resize(CWndEvent const *_p_event);
    // EVENT_RESIZED: follows the parent when maximised, places and sizes the window by its
    // alignment, and passes the event on, so that the children align in turn.
    virtual void on_event_resized(CWndEvent const *_p_event);
    // EVENT_CHANGED: empty here.
    virtual void on_event_changed(CWndEvent const *) {}
    // EVENT_REPORT_POINT_INSIDE: reports the window to the desktop when the point lies in it.
    virtual void on_event_report_point_inside(CWndEvent const *_p_event);
    // Pointer events (move, position, enter, exit, up, down, wheel), click and double click:
    // empty here; controls override them.
    // @{
    virtual void on_event_pointer_move(CWndEvent const *) {}
    virtual void on_event_pointer_pos(CWndEvent const *) {}
    virtual void on_event_pointer_enter(CWndEvent const *) {}
    virtual void on_event_pointer_exit(CWndEvent const *) {}
    virtual void on_event_pointer_up(CWndEvent const *) {}
    virtual void on_event_pointer_down(CWndEvent const *) {}
    virtual void on_event_wheel_rotated(CWndEvent const *) {}
    virtual void on_event_click(CWndEvent const *) {}
    virtual void on_event_double_click(CWndEvent const *) {}
    // @}
    // EVENT_DRAG_BEGIN: empty here.
    virtual void on_event_drag_begin(CWndEvent const *) {}
    // EVENT_DRAG: with can-drag, moves the window by the movement in the event.
    virtual void on_event_drag(CWndEvent const *_p_event);
    // EVENT_DRAG_END: empty here.
    virtual void on_event_drag_end(CWndEvent const *) {}
    // EVENT_SET_TEXT and EVENT_SET_STR: empty here; text controls take the new text.
    // @{
    virtual void on_event_set_text(CWndEvent const *) {}
    virtual void on_event_set_str(CWndEvent const *) {}
    // @}
    // Keyboard events (key down, key up, character): empty here.
    // @{
    virtual void on_event_key_down(CWndEvent const *) {}
    virtual void on_event_key_up(CWndEvent const *) {}
    virtual void on_event_char(CWndEvent const *) {}
    // @}
    // EVENT_RESOURCE_INVALIDATE: passes it on to the children.
    virtual void on_event_resource_invalidate(CWndEvent const *_p_event);

    // The position on the desktop, from the parent's.
    void calc_global_pos();

    // Identity and tree (m_children, below, is the tree's too)

    // A debugging guard the show handlers check; nothing in the library sets it.
    bool m_dbg_lock_hide;
    // The name and its hash.
    HUID m_id;
    // The parent, null when not attached; the desktop of the tree.
    // @{
    CWindow *mp_parent;
    CDesktop *mp_desktop;
    // @}
    // Flags, each behind the accessors of the same name above.
    // @{
    bool m_is_hidden;
    bool m_is_disabled;
    bool m_is_passive;
    bool m_auto_delete;
    bool m_pointer_capture;
    bool m_is_maximaized;
    bool m_always_on_top;
    bool m_is_modal;
    bool m_can_drag;
    bool m_can_resize;
    // @}
    // Geometry

    // How the window places itself in its parent.
    EAlignment m_alignment;
    // Relative to the parent; on the desktop, refreshed at each event the window takes.
    // @{
    point_t m_pos;
    point_t m_global_pos;
    // @}
    qor_vector<CWindow *> m_children; // back to front; owned
    // Width, height and constraints.
    CRegion m_region;
    // The region and position from before the window was last maximised.
    // @{
    CRegion m_normal_region;
    point_t m_normal_pos;
    // @}

private:
    CWindow(CWindow const &) = delete;
    CWindow &operator=(CWindow const &) = delete;

    typedef void (CWindow::*handler_t)(CWndEvent const *);
    static handler_t handler_of(EEventType _id);
    void pass_hit_test(CWndEvent const *_p_event);
    void align_in_parent();
    void load_children(LuaPlus::LuaObject &_lo_table);
    void load_child(LuaPlus::LuaObject &_lo_child);
};

// ---------------------------------------------------------------------------------------------
// The factory
// ---------------------------------------------------------------------------------------------

// Makes a window of one class, not attached; the caller owns it.
typedef CWindow *(*window_creator_t)(CDesktop *_p_desktop, char const *_name);

// Class names to creators, keyed by the hash of the name.
class CWindowsFactory {
public:
    // A second registration of a name replaces the first.
    void Register(HUID const &_class_name, window_creator_t _creator);
    // A new window, not attached to anything; null for a name never registered.
    CWindow *Create(HUID const &_class_name, CDesktop *_p_desktop, char const *_name);

private:
    qor_map<HUID, window_creator_t> m_creators;
};

// Built at the first call, so that it exists whenever a registrar runs during static
// initialisation.
CWindowsFactory &get_windows_factory();

// One static object in the source file of each registered class: registers the class at the
// library's load and logs it.
//     static CWindowRegistrar<CButton> s_registrar("Button");
class CWindowRegistrarBase {
protected:
    // Registers the creator under the class name with the factory and logs "Window registered".
    CWindowRegistrarBase(char const *_class_name, window_creator_t _creator);
};

// The registrar of one window class, TWindow, made by new with the desktop and the name.
template <class TWindow>
class CWindowRegistrar : private CWindowRegistrarBase {
public:
    // Registers TWindow under _class_name.
    explicit CWindowRegistrar(char const *_class_name) : CWindowRegistrarBase(_class_name, &create) {}

private:
    static CWindow *create(CDesktop *_p_desktop, char const *_name) {
        return new (std::nothrow) TWindow(_p_desktop, _name);
    }
};

} // namespace qorui
