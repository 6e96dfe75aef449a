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
    CWindow(CDesktop *_p_desktop, char const *_name);
    virtual ~CWindow();

    // Windows live on the library's heap whichever module makes them with new, since the tree
    // deletes them from inside the library.
    static void *operator new(size_t _size);
    static void *operator new(size_t _size, std::nothrow_t const &) noexcept;
    static void operator delete(void *_p) noexcept;
    static void operator delete(void *_p, std::nothrow_t const &) noexcept;

    virtual void send_event(CWindow *_p_receiver, CWndEvent const *_p_event,
                            CWndEvent::EDispatchType _type) override;
    // A new event of that type with an empty stream, sent by the virtual form.
    void send_event(CWindow *_p_receiver, EEventType _id, CWndEvent::EDispatchType _type);

    QOR_CLASS_ID(CWindow, void, "Window")

    // Tree and identity: links, order, lookup, the name
    virtual void attach_child(CWindow *_p_child);
    virtual void on_attached() {}
    // From load_state, behind each child entry.
    virtual void on_child_attached() {}
    virtual void detach_child(CWindow *_p_child);
    virtual void on_detached() {}
    // The child goes last, then behind every always-on-top sibling.
    virtual void bring_to_front(CWindow *_p_child);
    CWindow *get_parent() { return mp_parent; }
    CDesktop *get_desktop() { return mp_desktop; }
    unsigned int get_children_count() const { return static_cast<unsigned int>(m_children.size()); }
    CWindow *get_child(unsigned int _idx);
    // A direct child first, then depth first through the children in order. A null class name
    // matches any class. Both comparisons are exact.
    CWindow *get_child(char const *_name, char const *_class_name, bool _direct_only);
    // The whole subtree, each window before its own children; the window itself isn't included.
    void get_children(qor_vector<CWindow *> &_children);

    HUID const &get_id() const { return m_id; }
    char const *get_name() const { return m_id.GetName(); }

    // Flags
    bool is_hidden() const { return m_is_hidden; }
    // Quietly: no event, no fade, no auto delete.
    void set_hidden(bool _hidden);
    bool is_disabled() const { return m_is_disabled; }
    void set_disabled(bool _disabled) { m_is_disabled = _disabled; }
    bool is_passive() const { return m_is_passive; }
    // Passes a change down the subtree; no change visits nothing.
    void set_passive(bool _passive);
    bool is_pointer_capture() const { return m_pointer_capture; }
    void set_pointer_capture(bool _capture) { m_pointer_capture = _capture; }
    bool is_maximaized() const { return m_is_maximaized; }
    void set_maximaized(bool _maximaized);
    bool is_always_on_top() const { return m_always_on_top; }
    void set_always_on_top(bool _on_top) { m_always_on_top = _on_top; }
    bool is_modal() const { return m_is_modal; }
    void set_is_modal(bool _modal);
    bool is_can_drag() const { return m_can_drag; }
    void set_can_drag(bool _can_drag) { m_can_drag = _can_drag; }
    bool is_can_resize() const { return m_can_resize; }
    void set_can_resize(bool _can_resize) { m_can_resize = _can_resize; }
    bool get_auto_delete() const { return m_auto_delete; }
    void set_auto_delete(bool _auto_delete) { m_auto_delete = _auto_delete; }

    // Geometry
    virtual bool is_point_inside(point_t const &_global) const;
    virtual int get_client_w() const { return m_region.get_w(); }
    virtual int get_client_h() const { return m_region.get_h(); }
    virtual void set_pos(int _x, int _y);
    virtual point_t get_pos() const { return m_pos; }
    virtual point_t get_client_pos() const { return point_t{0, 0}; }
    int get_w() const { return m_region.get_w(); }
    int get_h() const { return m_region.get_h(); }
    void set_w(int _w) { set_size(_w, m_region.get_h()); }
    void set_h(int _h) { set_size(m_region.get_w(), _h); }
    // Resize event (handlers may correct the size in place), constraints, then resized.
    void set_size(int _w, int _h);
    SConstraints const &get_constraints() const { return m_region.get_constraints(); }
    void set_constraints(SConstraints const &_constraints) { m_region.set_constraints(_constraints); }
    EAlignment get_alignment() const { return m_alignment; }
    void set_alignment(EAlignment _alignment);
    point_t const &get_global_pos() const { return m_global_pos; }
    point_t convert_to_local(point_t const &_global) const;

    // Input: keyboard and wheel events whether the window is active or not
    void input_subscribe(bool _subscribe);

    // Persistence
    virtual void save_state(LuaPlus::LuaObject &_lo_table);
    virtual void load_state(LuaPlus::LuaObject &_lo_table);
    // Runs "ui_material_presets.lua" and the layout file, then loads the global ui_windows_ini.
    virtual void import(int _unused, char const *_file);

protected:
    // Routing and the default handlers, one for each event
    virtual void on_event(CWndEvent const *_p_event) override;
    virtual bool filter_event(CWndEvent const *_p_event);
    // Whether the hit test has to reach the window: false only when neither the window nor a child
    // could report the point and nothing else listens. A class whose on_event or
    // on_event_report_point_inside does more than the default answers true.
    virtual bool is_hit_test_needed(point_t const &_global);

    virtual void on_event_update(CWndEvent const *_p_event);
    virtual void on_event_draw(CWndEvent const *_p_event);
    virtual void on_event_show(CWndEvent const *_p_event);
    virtual void on_event_show_maximized(CWndEvent const *_p_event);
    virtual void on_event_show_normal(CWndEvent const *_p_event);
    virtual void on_event_hide(CWndEvent const *_p_event);
    virtual void on_event_enable(CWndEvent const *_p_event);
    virtual void on_event_disable(CWndEvent const *_p_event);
    virtual void on_event_activate(CWndEvent const *) {}
    virtual void on_event_deactivate(CWndEvent const *) {}
    virtual void on_event_lost_focus(CWndEvent const *_p_event);
    virtual void on_event_resize(CWndEvent const *_p_event);
    virtual void on_event_resized(CWndEvent const *_p_event);
    virtual void on_event_changed(CWndEvent const *) {}
    virtual void on_event_report_point_inside(CWndEvent const *_p_event);
    virtual void on_event_pointer_move(CWndEvent const *) {}
    virtual void on_event_pointer_pos(CWndEvent const *) {}
    virtual void on_event_pointer_enter(CWndEvent const *) {}
    virtual void on_event_pointer_exit(CWndEvent const *) {}
    virtual void on_event_pointer_up(CWndEvent const *) {}
    virtual void on_event_pointer_down(CWndEvent const *) {}
    virtual void on_event_wheel_rotated(CWndEvent const *) {}
    virtual void on_event_click(CWndEvent const *) {}
    virtual void on_event_double_click(CWndEvent const *) {}
    virtual void on_event_drag_begin(CWndEvent const *) {}
    virtual void on_event_drag(CWndEvent const *_p_event);
    virtual void on_event_drag_end(CWndEvent const *) {}
    virtual void on_event_set_text(CWndEvent const *) {}
    virtual void on_event_set_str(CWndEvent const *) {}
    virtual void on_event_key_down(CWndEvent const *) {}
    virtual void on_event_key_up(CWndEvent const *) {}
    virtual void on_event_char(CWndEvent const *) {}
    virtual void on_event_resource_invalidate(CWndEvent const *_p_event);

    // The position on the desktop, from the parent's.
    void calc_global_pos();

    // Identity and tree (m_children, below, is the tree's too)
    bool m_dbg_lock_hide;
    HUID m_id;
    CWindow *mp_parent;
    CDesktop *mp_desktop;
    // Flags
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
    // Geometry
    EAlignment m_alignment;
    point_t m_pos;
    point_t m_global_pos;
    qor_vector<CWindow *> m_children; // back to front; owned
    CRegion m_region;
    CRegion m_normal_region;
    point_t m_normal_pos;

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
    CWindowRegistrarBase(char const *_class_name, window_creator_t _creator);
};

template <class TWindow>
class CWindowRegistrar : private CWindowRegistrarBase {
public:
    explicit CWindowRegistrar(char const *_class_name) : CWindowRegistrarBase(_class_name, &create) {}

private:
    static CWindow *create(CDesktop *_p_desktop, char const *_name) {
        return new (std::nothrow) TWindow(_p_desktop, _name);
    }
};

} // namespace qorui
