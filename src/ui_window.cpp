// The window tree.
//
//   construction and destruction   the default handlers; a subtree goes with its window
//   sending, routing, filtering    dispatch types, the filters of hidden and disabled windows
//   handlers                       the default behaviour of each event
//   tree, flags, geometry          attaching, the front, lookup; alignment and maximising
//   persistence                    layout tables, children by their numbers, import
//   the factory                    class names to creators
#include "ui_window.h"
#include "LuaTableIterator.h"
#include "engine_interfaces.h"
#include "qorbase.h"
#include "qordebug.h"
#include "qorscriptsystem.h"
#include "ui_debug.h"
#include "ui_desktop.h"

#include <algorithm>
#include <cstring>
#include <vector>

namespace qorui {

namespace {

CWindowRegistrar<CWindow> const s_registrar("Window");

// Stored into the event that a handler holds as const.
void set_dispatch(CWndEvent const *_p_event, CWndEvent::EDispatchType _type) {
    _p_event->set_dispatch_type(_type);
}

bool is_one_of(EEventType _id, std::initializer_list<EEventType> _ids) {
    return std::find(_ids.begin(), _ids.end(), _id) != _ids.end();
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Construction and destruction
// ---------------------------------------------------------------------------------------------

void *CWindow::operator new(size_t _size) {
    return qor_malloc(_size);
}

void *CWindow::operator new(size_t _size, std::nothrow_t const &) noexcept {
    return qor_malloc(_size);
}

void CWindow::operator delete(void *_p) noexcept {
    qor_free(_p);
}

void CWindow::operator delete(void *_p, std::nothrow_t const &) noexcept {
    qor_free(_p);
}

CWindow::CWindow(CDesktop *_p_desktop, char const *_name)
    : m_dbg_lock_hide(false), m_id(_name), mp_parent(nullptr), mp_desktop(_p_desktop), m_is_hidden(false),
      m_is_disabled(false), m_is_passive(false), m_auto_delete(false), m_pointer_capture(false),
      m_is_maximaized(false), m_always_on_top(false), m_is_modal(false), m_can_drag(false),
      m_can_resize(true), m_alignment(ALIGNMENT_NONE), m_pos{0, 0}, m_global_pos{0, 0}, m_normal_pos{0, 0} {}

// The default handler of each event type, or null: every window runs it before the callbacks
// that anything registers on the window, and since it calls the virtual handler, an override takes
// effect without registering anything.
CWindow::handler_t CWindow::handler_of(EEventType _id) {
    static struct SHandlers {
        handler_t m_by_id[EVENT_RESOURCE_INVALIDATE + 1];
        SHandlers() : m_by_id{} {
            static struct {
                EEventType m_id;
                handler_t m_handler;
            } const handlers[] = {
                {EVENT_UPDATE, &CWindow::on_event_update},
                {EVENT_DRAW, &CWindow::on_event_draw},
                {EVENT_HIDE, &CWindow::on_event_hide},
                {EVENT_SHOW, &CWindow::on_event_show},
                {EVENT_SHOW_MAXIMIZED, &CWindow::on_event_show_maximized},
                {EVENT_SHOW_NORMAL, &CWindow::on_event_show_normal},
                {EVENT_ACTIVATE, &CWindow::on_event_activate},
                {EVENT_DEACTIVATE, &CWindow::on_event_deactivate},
                {EVENT_LOST_FOCUS, &CWindow::on_event_lost_focus},
                {EVENT_ENABLE, &CWindow::on_event_enable},
                {EVENT_DISABLE, &CWindow::on_event_disable},
                {EVENT_RESIZE, &CWindow::on_event_resize},
                {EVENT_RESIZED, &CWindow::on_event_resized},
                {EVENT_DRAG_BEGIN, &CWindow::on_event_drag_begin},
                {EVENT_DRAG, &CWindow::on_event_drag},
                {EVENT_DRAG_END, &CWindow::on_event_drag_end},
                {EVENT_REPORT_POINT_INSIDE, &CWindow::on_event_report_point_inside},
                {EVENT_POINTER_ENTER, &CWindow::on_event_pointer_enter},
                {EVENT_POINTER_EXIT, &CWindow::on_event_pointer_exit},
                {EVENT_POINTER_MOVE, &CWindow::on_event_pointer_move},
                {EVENT_POINTER_POS, &CWindow::on_event_pointer_pos},
                {EVENT_POINTER_DOWN, &CWindow::on_event_pointer_down},
                {EVENT_POINTER_UP, &CWindow::on_event_pointer_up},
                {EVENT_WHEEL_ROTATED, &CWindow::on_event_wheel_rotated},
                {EVENT_CLICK, &CWindow::on_event_click},
                {EVENT_DOUBLE_CLICK, &CWindow::on_event_double_click},
                {EVENT_CHANGED, &CWindow::on_event_changed},
                {EVENT_SET_TEXT, &CWindow::on_event_set_text},
                {EVENT_SET_STR, &CWindow::on_event_set_str},
                {EVENT_KEY_DOWN, &CWindow::on_event_key_down},
                {EVENT_KEY_UP, &CWindow::on_event_key_up},
                {EVENT_CHAR, &CWindow::on_event_char},
                {EVENT_RESOURCE_INVALIDATE, &CWindow::on_event_resource_invalidate},
            };
            for (auto const &entry : handlers)
                m_by_id[entry.m_id] = entry.m_handler;
        }
    } const s_handlers;
    unsigned const id = static_cast<unsigned>(_id);
    return id <= EVENT_RESOURCE_INVALIDATE ? s_handlers.m_by_id[id] : nullptr;
}

CWindow::~CWindow() {
    if (mp_desktop) mp_desktop->input_subscribe(this, false);
    if (mp_parent) mp_parent->detach_child(this);
    // A child's destructor must not detach it from the vector being walked.
    qor_vector<CWindow *> children;
    children.swap(m_children);
    for (CWindow *p_child : children) {
        p_child->mp_parent = nullptr;
        delete p_child;
    }
    if (mp_desktop) mp_desktop->on_delete(this);
}

// ---------------------------------------------------------------------------------------------
// Sending, routing, filtering
// ---------------------------------------------------------------------------------------------

void CWindow::send_event(CWindow *_p_receiver, CWndEvent const *_p_event, CWndEvent::EDispatchType _type) {
    if (!QOR_CHECK(_p_receiver && _p_event)) return;
    _p_event->set_activator(this);
    // Type 0 keeps what the event has: a fresh event stops at its receiver, and one that comes
    // back into a sender keeps what it was given.
    if (_type != CWndEvent::DISPATCH_NONE) _p_event->set_dispatch_type(_type);
    _p_receiver->on_event(_p_event);
}

void CWindow::send_event(CWindow *_p_receiver, EEventType _id, CWndEvent::EDispatchType _type) {
    CWndEvent event(_id);
    send_event(_p_receiver, &event, _type);
}

void CWindow::on_event(CWndEvent const *_p_event) {
    if (!filter_event(_p_event)) return;
    if (mp_parent) calc_global_pos();
    if (handler_t const handler = handler_of(_p_event->get_id())) {
        begin_callback(_p_event);
        (this->*handler)(_p_event);
    }
    dispatch_event(_p_event);
    switch (_p_event->get_dispatch_type()) {
    case CWndEvent::DISPATCH_CHILDREN:
        if (_p_event->get_id() == EVENT_REPORT_POINT_INSIDE) {
            pass_hit_test(_p_event);
            break;
        }
        // The end is read anew behind each child.
        for (size_t i = 0; i < m_children.size(); ++i)
            m_children[i]->on_event(_p_event);
        break;
    case CWndEvent::DISPATCH_PARENT:
        if (mp_parent) mp_parent->send_event(mp_parent, _p_event, CWndEvent::DISPATCH_PARENT);
        break;
    default:
        break;
    }
}

bool CWindow::filter_event(CWndEvent const *_p_event) {
    EEventType const id = _p_event->get_id();
    if (m_is_hidden && !is_one_of(id, {EVENT_UPDATE, EVENT_SET_TEXT, EVENT_ENABLE, EVENT_DISABLE, EVENT_SHOW,
                                       EVENT_RESOURCE_INVALIDATE, EVENT_RESIZED}))
        return false;
    if (m_is_disabled &&
        !is_one_of(id, {EVENT_DRAW, EVENT_ACTIVATE, EVENT_CHANGED, EVENT_SHOW, EVENT_HIDE, EVENT_ENABLE,
                        EVENT_RESOURCE_INVALIDATE, EVENT_RESIZED, EVENT_REPORT_POINT_INSIDE}))
        return false;
    return true;
}

// ---------------------------------------------------------------------------------------------
// Handlers
// ---------------------------------------------------------------------------------------------

void CWindow::on_event_update(CWndEvent const *_p_event) {
    set_dispatch(_p_event, CWndEvent::DISPATCH_CHILDREN);
}
void CWindow::on_event_draw(CWndEvent const *_p_event) {
    set_dispatch(_p_event, CWndEvent::DISPATCH_CHILDREN);
}

void CWindow::on_event_lost_focus(CWndEvent const *_p_event) {
    set_dispatch(_p_event, CWndEvent::DISPATCH_CHILDREN);
}

void CWindow::on_event_resource_invalidate(CWndEvent const *_p_event) {
    set_dispatch(_p_event, CWndEvent::DISPATCH_CHILDREN);
}

void CWindow::on_event_hide(CWndEvent const *) {
    if (mp_desktop) mp_desktop->on_hide(this);
    m_is_hidden = true;
    if (m_auto_delete && mp_desktop) mp_desktop->delete_window(this);
}

void CWindow::on_event_show(CWndEvent const *) {
    QOR_CHECK(!m_dbg_lock_hide);
    m_is_hidden = false;
}

void CWindow::on_event_enable(CWndEvent const *) {
    m_is_disabled = false;
}
void CWindow::on_event_disable(CWndEvent const *) {
    m_is_disabled = true;
}

void CWindow::on_event_show_maximized(CWndEvent const *) {
    QOR_CHECK(!m_dbg_lock_hide);
    m_normal_pos = m_pos;
    m_normal_region = m_region;
    m_is_hidden = false;
    m_is_maximaized = true;
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
}

// A window that was never maximised goes to (0, 0) at 0 by 0.
void CWindow::on_event_show_normal(CWndEvent const *) {
    QOR_CHECK(!m_dbg_lock_hide);
    m_is_hidden = false;
    m_is_maximaized = false;
    set_pos(m_normal_pos.x, m_normal_pos.y);
    set_size(m_normal_region.get_w(), m_normal_region.get_h());
}

// A window that can't resize writes its present size over the wish in the stream.
void CWindow::on_event_resize(CWndEvent const *_p_event) {
    _p_event->rewind();
    if (!m_can_resize) {
        _p_event->get<int>() = m_region.get_w();
        _p_event->get<int>() = m_region.get_h();
    }
    set_dispatch(_p_event, CWndEvent::DISPATCH_NONE);
}

void CWindow::on_event_resized(CWndEvent const *_p_event) {
    if (m_is_maximaized && mp_parent) {
        m_pos = point_t{0, 0};
        m_region.set_w(mp_parent->m_region.get_w());
        m_region.set_h(mp_parent->m_region.get_h());
    }
    if (mp_parent) align_in_parent();
    set_dispatch(_p_event, CWndEvent::DISPATCH_CHILDREN);
}

// Sizes go straight to the region; a centred window centres on the client size measured from the
// parent's corner, halving by truncation.
void CWindow::align_in_parent() {
    point_t const p = mp_parent->get_client_pos();
    int const cw = mp_parent->get_client_w();
    int const ch = mp_parent->get_client_h();
    switch (m_alignment) {
    case ALIGNMENT_TOP:
        m_region.set_w(cw);
        m_pos = p;
        break;
    case ALIGNMENT_LEFT:
        m_region.set_h(ch);
        m_pos = p;
        break;
    case ALIGNMENT_RIGHT:
        m_region.set_h(ch);
        m_pos = point_t{p.x - m_region.get_w() + cw, p.y};
        break;
    case ALIGNMENT_BOTTOM:
        m_region.set_w(cw);
        m_pos = point_t{p.x, p.y - m_region.get_h() + ch};
        break;
    case ALIGNMENT_CENTER:
        m_pos = point_t{cw / 2 - m_region.get_w() / 2, ch / 2 - m_region.get_h() / 2};
        break;
    case ALIGNMENT_CLIENT:
        m_region.set_rectangle(cw, ch);
        m_pos = p;
        break;
    default:
        break;
    }
}

void CWindow::on_event_drag(CWndEvent const *_p_event) {
    if (!m_can_drag) return;
    _p_event->rewind();
    point_t const movement = _p_event->get<point_t>();
    point_t const pos = get_pos();
    set_pos(pos.x + movement.x, pos.y + movement.y);
}

// The hit test goes on only to the children that could report its point or that listen to it. The
// point is read again behind each child that took the test: its callbacks may overwrite it.
void CWindow::pass_hit_test(CWndEvent const *_p_event) {
    auto point = [_p_event] {
        _p_event->rewind();
        return _p_event->get<point_t>();
    };
    point_t global = point();
    for (size_t i = 0; i < m_children.size(); ++i) {
        if (!m_children[i]->is_hit_test_needed(global)) continue;
        m_children[i]->on_event(_p_event);
        global = point();
    }
}

// Children may stand outside the window, and anything that listens to the test must hear it.
bool CWindow::is_hit_test_needed(point_t const &_global) {
    if (!m_children.empty() || has_callbacks(EVENT_REPORT_POINT_INSIDE)) return true;
    calc_global_pos();
    return is_point_inside(_global);
}

void CWindow::on_event_report_point_inside(CWndEvent const *_p_event) {
    point_t const global = _p_event->get<point_t>();
    if (is_point_inside(global) && mp_desktop) mp_desktop->report_pointer_inside(this);
}

// ---------------------------------------------------------------------------------------------
// Tree
// ---------------------------------------------------------------------------------------------

void CWindow::attach_child(CWindow *_p_child) {
    if (!QOR_CHECK(_p_child)) return;
    _p_child->mp_parent = this;
    if (m_is_passive) _p_child->set_passive(true);
    QOR_CHECK(_p_child->mp_desktop && mp_desktop);
    if (std::find(m_children.begin(), m_children.end(), _p_child) == m_children.end()) {
        m_children.push_back(_p_child);
        _p_child->on_attached();
    }
    bring_to_front(_p_child);
    send_event(_p_child, EVENT_RESOURCE_INVALIDATE, CWndEvent::DISPATCH_NONE);
}

void CWindow::detach_child(CWindow *_p_child) {
    auto const it = std::find(m_children.begin(), m_children.end(), _p_child);
    if (it == m_children.end()) return;
    m_children.erase(it);
    _p_child->on_detached();
}

void CWindow::bring_to_front(CWindow *_p_child) {
    auto const it = std::find(m_children.begin(), m_children.end(), _p_child);
    if (!QOR_CHECK(it != m_children.end())) return;
    m_children.erase(it);
    m_children.push_back(_p_child);
    std::stable_partition(m_children.begin(), m_children.end(),
                          [](CWindow const *p_wnd) { return !p_wnd->m_always_on_top; });
}

CWindow *CWindow::get_child(unsigned int _idx) {
    if (!QOR_CHECK(_idx < m_children.size())) return nullptr;
    return m_children[_idx];
}

CWindow *CWindow::get_child(char const *_name, char const *_class_name, bool _direct_only) {
    if (!_name) return nullptr;
    for (CWindow *p_wnd : m_children) {
        if (!QOR_CHECK(p_wnd)) continue;
        if (std::strcmp(p_wnd->get_name(), _name) != 0) continue;
        if (!_class_name || std::strcmp(p_wnd->get_class_id().GetName(), _class_name) == 0) return p_wnd;
    }
    if (_direct_only) return nullptr;
    for (CWindow *p_wnd : m_children) {
        if (!p_wnd) continue;
        if (CWindow *p_found = p_wnd->get_child(_name, _class_name, false)) return p_found;
    }
    return nullptr;
}

void CWindow::get_children(qor_vector<CWindow *> &_children) {
    for (CWindow *p_child : m_children) {
        _children.push_back(p_child);
        p_child->get_children(_children);
    }
}

// ---------------------------------------------------------------------------------------------
// Flags
// ---------------------------------------------------------------------------------------------

void CWindow::set_hidden(bool _hidden) {
    if (_hidden && mp_desktop) mp_desktop->on_hide(this);
    m_is_hidden = _hidden;
}

void CWindow::set_passive(bool _passive) {
    if (m_is_passive == _passive) return;
    m_is_passive = _passive;
    for (CWindow *p_child : m_children)
        p_child->set_passive(_passive);
}

void CWindow::set_maximaized(bool _maximaized) {
    send_event(this, _maximaized ? EVENT_SHOW_MAXIMIZED : EVENT_SHOW_NORMAL, CWndEvent::DISPATCH_NONE);
}

void CWindow::set_is_modal(bool _modal) {
    m_is_modal = _modal;
    if (_modal) m_always_on_top = true;
}

void CWindow::input_subscribe(bool _subscribe) {
    if (QOR_CHECK(mp_desktop)) mp_desktop->input_subscribe(this, _subscribe);
}

// ---------------------------------------------------------------------------------------------
// Geometry
// ---------------------------------------------------------------------------------------------

void CWindow::set_pos(int _x, int _y) {
    m_pos = point_t{_x, _y};
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_CHILDREN);
}

void CWindow::set_size(int _w, int _h) {
    CWndEvent resize(EVENT_RESIZE);
    resize << _w << _h;
    send_event(this, &resize, CWndEvent::DISPATCH_NONE);
    resize.rewind();
    resize >> _w >> _h;
    m_region.set_rectangle(_w, _h);
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_CHILDREN);
}

void CWindow::set_alignment(EAlignment _alignment) {
    m_alignment = _alignment;
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_CHILDREN);
}

void CWindow::calc_global_pos() {
    if (mp_parent)
        m_global_pos = point_t{mp_parent->m_global_pos.x + m_pos.x, mp_parent->m_global_pos.y + m_pos.y};
}

point_t CWindow::convert_to_local(point_t const &_global) const {
    return point_t{_global.x - m_global_pos.x, _global.y - m_global_pos.y};
}

bool CWindow::is_point_inside(point_t const &_global) const {
    return m_region.is_point_inside(convert_to_local(_global));
}

// ---------------------------------------------------------------------------------------------
// Persistence
// ---------------------------------------------------------------------------------------------

namespace {

char const *string_or_empty(LuaPlus::LuaObject const &_lo_value) {
    return _lo_value.IsString() ? _lo_value.GetString() : "";
}

// The walk of one layout through the tree. A layout that contains itself, or one whose shared
// tables multiply the work, ends at these limits with one report; what was loaded stays.
int const k_max_layout_depth = 64;
unsigned const k_max_layout_entries = 65536;

struct SLayoutWalk {
    int m_depth;
    unsigned m_entries;
    bool m_stopped;
};
SLayoutWalk s_walk = {0, 0, false}; // the tree has one thread

} // namespace

void CWindow::save_state(LuaPlus::LuaObject &_lo_table) {
    LuaPlus::LuaState *p_state = _lo_table.GetState();
    _lo_table.SetString("name", get_name());
    _lo_table.SetString("class_name", get_class_id().GetName());
    point_t const pos = get_pos();
    write_pair(_lo_table, "pos", pos.x, pos.y);
    write_pair(_lo_table, "size", m_region.get_w(), m_region.get_h());
    _lo_table.SetBoolean("can_resize", m_can_resize);
    _lo_table.SetBoolean("can_drag", m_can_drag);
    _lo_table.SetString("alignment", g_alignment_names[m_alignment]);
    _lo_table.SetBoolean("is_modal", m_is_modal);
    _lo_table.SetBoolean("is_passive", m_is_passive);
    _lo_table.SetBoolean("auto_delete", m_auto_delete);
    for (CWindow *p_child : m_children) {
        LuaPlus::LuaObject child;
        child.AssignNewTable(p_state);
        p_child->save_state(child);
        _lo_table.SetObject(_lo_table.GetTableCount() + 1, child);
    }
}

void CWindow::load_state(LuaPlus::LuaObject &_lo_table) {
    QOR_CHECK_AS(strcmp(string_or_empty(_lo_table.GetByName("name")), get_name()) == 0,
                 "strcmp(_lo_table.GetByName(\"name\").GetString(), get_name()) == 0");
    QOR_CHECK_AS(strcmp(string_or_empty(_lo_table.GetByName("class_name")), get_class_id().GetName()) == 0,
                 "strcmp(_lo_table.GetByName(\"class_name\").GetString(), get_class_id().GetName()) == 0");
    point_t pos = get_pos();
    if (read_pair(_lo_table, "pos", pos.x, pos.y)) set_pos(pos.x, pos.y);
    int w = m_region.get_w(), h = m_region.get_h();
    if (read_pair(_lo_table, "size", w, h)) set_size(w, h);
    read_bool(_lo_table, "can_resize", m_can_resize);
    read_bool(_lo_table, "can_drag", m_can_drag);
    if (read_alignment(_lo_table, "alignment", m_alignment))
        send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_CHILDREN);
    LuaPlus::LuaObject const modal = _lo_table.GetByName("is_modal");
    if (modal.IsBoolean()) set_is_modal(modal.GetBoolean());
    LuaPlus::LuaObject const passive = _lo_table.GetByName("is_passive");
    if (passive.IsBoolean()) set_passive(passive.GetBoolean());
    read_bool(_lo_table, "auto_delete", m_auto_delete);
    load_children(_lo_table);
}

// Every entry without a string key is a child's table. They are taken in the order of their
// numbers, the order in which save_state wrote them (a Lua table walks its hash part in no
// particular order), so that a layout loaded and saved again keeps its children's order.
void CWindow::load_children(LuaPlus::LuaObject &_lo_table) {
    if (s_walk.m_depth == 0) s_walk = SLayoutWalk{0, 0, false};
    std::vector<std::pair<double, LuaPlus::LuaObject>> entries;
    for_each_entry(_lo_table, [&entries](LuaPlus::LuaObject const &key, LuaPlus::LuaObject const &value) {
        if (!key.IsString()) entries.emplace_back(key.IsNumber() ? key.GetNumber() : 0.0, value);
    });
    std::stable_sort(entries.begin(), entries.end(),
                     [](auto const &_a, auto const &_b) { return _a.first < _b.first; });
    for (auto &entry : entries) {
        if (entry.second.IsTable()) load_child(entry.second);
        on_child_attached();
    }
}

// A table without a name or a class makes nothing.
void CWindow::load_child(LuaPlus::LuaObject &_lo_child) {
    if (s_walk.m_stopped) return;
    if (s_walk.m_depth >= k_max_layout_depth || ++s_walk.m_entries > k_max_layout_entries) {
        s_walk.m_stopped = true;
        qordebug::warning("UI: Layout too deep or too large at window '%s'; the rest is skipped", get_name());
        return;
    }
    char const *p_name = nullptr, *p_class_name = nullptr;
    if (!read_name(_lo_child.GetByName("name"), p_name) ||
        !read_name(_lo_child.GetByName("class_name"), p_class_name))
        return;
    CWindow *p_child = get_child(p_name, p_class_name, true);
    if (!p_child) {
        p_child = get_windows_factory().Create(HUID(p_class_name), mp_desktop, p_name);
        if (!p_child) { // an unknown class: the entry and its subtree are left out, and the log says so
            if (IFileSystem *p_file_system = GetFileSystem())
                p_file_system->log("Window class not registered: %s ('%s' left out)\n", p_class_name, p_name);
            return;
        }
        attach_child(p_child);
        send_event(p_child, EVENT_ENABLE, CWndEvent::DISPATCH_NONE);
        send_event(p_child, EVENT_SHOW, CWndEvent::DISPATCH_NONE);
    }
    ++s_walk.m_depth;
    p_child->load_state(_lo_child);
    --s_walk.m_depth;
}

void CWindow::import(int, char const *_file) {
    LuaPlus::LuaState &lua = lua_machine();
    lua.DoString("ui_material_presets = nil", true);
    if (lua.DoFile(qorbase::FILE_CATEGORY_UI, "ui_material_presets.lua", true) != 0)
        qordebug::error("UI: File '%s' not found", "ui_material_presets.lua");
    lua.DoString("ui_windows_ini = nil", true);
    if (_file) lua.DoFile(qorbase::FILE_CATEGORY_UI, _file, true);
    LuaPlus::LuaObject layout = lua.GetGlobals().GetByName("ui_windows_ini");
    if (!layout.IsTable()) return;
    load_state(layout);
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_CHILDREN);
}

// ---------------------------------------------------------------------------------------------
// The factory
// ---------------------------------------------------------------------------------------------

CWindowsFactory &get_windows_factory() {
    static CWindowsFactory s_factory;
    return s_factory;
}

void CWindowsFactory::Register(HUID const &_class_name, window_creator_t _creator) {
    m_creators[_class_name] = _creator;
}

CWindow *CWindowsFactory::Create(HUID const &_class_name, CDesktop *_p_desktop, char const *_name) {
    auto const found = m_creators.find(_class_name);
    return found == m_creators.end() ? nullptr : found->second(_p_desktop, _name);
}

CWindowRegistrarBase::CWindowRegistrarBase(char const *_class_name, window_creator_t _creator) {
    get_windows_factory().Register(HUID(_class_name), _creator);
    if (IFileSystem *p_file_system = GetFileSystem())
        p_file_system->log("Window registered: %s\n", _class_name);
}

} // namespace qorui
