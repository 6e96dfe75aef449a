// The visual window.
//
//   construction and destruction
//   resources                      materials and fonts, fonts looked up from visual ancestors
//   margins and the client area
//   pointer state, drawing, filtering
//   effects                        fades, movement, auto hide
//   sounds                         sources by event, played and stopped, loaded and saved
//   layouts, texts in layouts      the visual keys; local strings and lines with fonts
#include "ui_window_visual.h"
#include "LuaTableIterator.h"
#include "engine_interfaces.h"
#include "qor_platform.h"
#include "qor_sound.h"
#include "qorscriptsystem.h"
#include "ui_debug.h"
#include "ui_dialog.h"
#include "ui_font.h"
#include "ui_interfaces.h"
#include "ui_local_strings.h"
#include "ui_logger.h"
#include "ui_material.h"
#include "ui_static_text.h"
#include "ui_string.h"
#include "ui_text.h"
#include "ui_desktop.h"

#include <algorithm>
#include <cstdlib>

namespace qorui {

namespace {

CWindowRegistrar<CWindowVisual> const s_registrar("WindowVisual");

unsigned const k_no_movement = 0xFFFFFFFFu;

uint32_t now() {
    return qorplatform::get_tick_count();
}

CWindowVisual *as_visual(CWindow *_p_wnd) {
    return class_cast<CWindowVisual>(_p_wnd);
}

template <class TResource>
void release_resource(CWindowVisual::SResource<TResource> &_entry) {
    if (_entry.m_owned) delete _entry.mp_resource;
    _entry.mp_resource = nullptr;
}

// Every entry of a table whose key is a string, in the table's order.
template <class TVisit>
void for_each_named(LuaPlus::LuaObject const &_lo_table, TVisit _visit) {
    for_each_entry(_lo_table, [&_visit](LuaPlus::LuaObject const &key, LuaPlus::LuaObject const &value) {
        char const *p_name;
        if (read_name(key, p_name)) _visit(p_name, value);
    });
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Construction and destruction
// ---------------------------------------------------------------------------------------------

CWindowVisual::CWindowVisual(CDesktop *_p_desktop, char const *_name)
    : CWindow(_p_desktop, _name), m_is_highlighted(false), m_is_pushed(false), m_is_checked(false),
      m_top_margin(0), m_bottom_margin(0), m_left_margin(0), m_right_margin(0), m_z_order(0),
      m_visual_delta_left(0), m_visual_delta_top(0), m_visual_delta_right(0), m_visual_delta_bottom(0),
      m_canvas(this), m_fade_in(150), m_fade_out(150), m_fade_start(0), m_transparency(1.0f),
      m_auto_hide(false), m_auto_hide_time(0),
      m_auto_hide_start(0), m_movement_destination{0, 0, 0, 0}, m_movement_origin{0, 0, 0, 0},
      m_movement_time(0), m_movement_start(k_no_movement), m_enable_events_sounds(true) {}

CWindowVisual::~CWindowVisual() {
    for (auto &sound : m_sounds)
        for (auto &source : sound.second.m_sources)
            delete source.second;
    for (auto &entry : m_materials)
        release_resource(entry.second);
    for (auto &entry : m_fonts)
        release_resource(entry.second);
}

IRender *CWindowVisual::get_canvas_render() const {
    return mp_desktop ? mp_desktop->get_render() : nullptr;
}

// ---------------------------------------------------------------------------------------------
// Resources
// ---------------------------------------------------------------------------------------------

void CWindowVisual::add_material(HUID const &_id, CMaterial *_p_material) {
    auto &entry = m_materials.emplace(_id, SResource<CMaterial>{_id, nullptr, false}).first->second;
    release_resource(entry);
    entry.mp_resource = _p_material;
    entry.m_owned = true;
    send_event(this, EVENT_RESOURCE_INVALIDATE, CWndEvent::DISPATCH_NONE);
}

void CWindowVisual::add_font(HUID const &_id, CFont *_p_font) {
    auto &entry = m_fonts.emplace(_id, SResource<CFont>{_id, nullptr, false}).first->second;
    release_resource(entry);
    entry.mp_resource = _p_font;
    entry.m_owned = true;
    send_event(this, EVENT_RESOURCE_INVALIDATE, CWndEvent::DISPATCH_NONE);
}

CMaterial *CWindowVisual::get_material(HUID const &_id) {
    auto const found = m_materials.find(_id);
    return found == m_materials.end() ? nullptr : found->second.mp_resource;
}

// An entry that isn't the window's own keeps the ancestor's answer, null included, so that a
// steady frame neither walks the tree nor adds a node.
CFont *CWindowVisual::get_font(HUID const &_id) {
    auto const found = m_fonts.find(_id);
    if (found != m_fonts.end() && (found->second.mp_resource || !found->second.m_owned))
        return found->second.mp_resource;
    CFont *p_font = get_inherited_font(_id);
    if (found == m_fonts.end() && mp_parent) m_fonts.emplace(_id, SResource<CFont>{_id, p_font, false});
    return p_font;
}

// The nearest visual ancestor's font of the name; null without one.
CFont *CWindowVisual::get_inherited_font(HUID const &_id) {
    for (CWindow *p_wnd = mp_parent; p_wnd; p_wnd = p_wnd->get_parent())
        if (CWindowVisual *p_ancestor = as_visual(p_wnd)) return p_ancestor->get_font(_id);
    return nullptr;
}

// Cached fonts are looked up again; parents go first, so a child finds the fresh entry.
void CWindowVisual::on_event_resource_invalidate(CWndEvent const *_p_event) {
    CWindow::on_event_resource_invalidate(_p_event);
    for (auto &entry : m_fonts)
        if (!entry.second.m_owned) entry.second.mp_resource = get_inherited_font(entry.first);
}

// ---------------------------------------------------------------------------------------------
// Margins and the client area
// ---------------------------------------------------------------------------------------------

void CWindowVisual::set_margin(int &_margin, int _value) {
    _margin = _value;
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
}

void CWindowVisual::set_top_margin(int _margin) {
    set_margin(m_top_margin, _margin);
}
void CWindowVisual::set_bottom_margin(int _margin) {
    set_margin(m_bottom_margin, _margin);
}
void CWindowVisual::set_left_margin(int _margin) {
    set_margin(m_left_margin, _margin);
}
void CWindowVisual::set_right_margin(int _margin) {
    set_margin(m_right_margin, _margin);
}

void CWindowVisual::set_uniform_margins(int _margin) {
    m_top_margin = m_bottom_margin = m_left_margin = _margin;
    set_margin(m_right_margin, _margin);
}

int CWindowVisual::get_client_w() const {
    return get_w() - m_left_margin - m_right_margin;
}
int CWindowVisual::get_client_h() const {
    return get_h() - m_top_margin - m_bottom_margin;
}
point_t CWindowVisual::get_client_pos() const {
    return point_t{m_left_margin, m_top_margin};
}

void CWindowVisual::on_event_resized(CWndEvent const *_p_event) {
    CWindow::on_event_resized(_p_event);
}
void CWindowVisual::on_event_drag_begin(CWndEvent const *_p_event) {
    CWindow::on_event_drag_begin(_p_event);
}
void CWindowVisual::on_event_drag(CWndEvent const *_p_event) {
    CWindow::on_event_drag(_p_event);
}
void CWindowVisual::on_event_drag_end(CWndEvent const *_p_event) {
    CWindow::on_event_drag_end(_p_event);
}

// Highest z order first, so drawn first and farthest back; equal values keep their order.
// Behind each child of a layout: children already in order, all of them visual, are left as they
// are without sorting them again, which is what the stable sort would do with them. (A window that
// isn't visual compares as neither before nor after, which the sort alone knows how to place.)
void CWindowVisual::on_child_attached() {
    bool in_order = true;
    for (size_t i = 0; in_order && i < m_children.size(); ++i) {
        CWindowVisual const *p_child = as_visual(m_children[i]);
        in_order = p_child && (i == 0 || as_visual(m_children[i - 1])->m_z_order >= p_child->m_z_order);
    }
    if (in_order) return;
    std::stable_sort(m_children.begin(), m_children.end(), [](CWindow *p_a, CWindow *p_b) {
        CWindowVisual const *p_va = as_visual(p_a), *p_vb = as_visual(p_b);
        return p_va && p_vb && p_va->m_z_order > p_vb->m_z_order;
    });
}

CStaticText *CWindowVisual::make_static_text(CString const &_text, CRectArea const &_area,
                                             char const *_name) {
    CStaticText *p_text = new CStaticText(mp_desktop, _name);
    attach_child(p_text);
    p_text->set_pos(_area.x, _area.y);
    p_text->set_size(_area.w, _area.h);
    p_text->set_text(_text);
    return p_text;
}

void CWindowVisual::make_borders(int _size, unsigned int _flags) {
    static struct {
        EBorderType m_type;
        char const *m_name;
    } const borders[] = {{BORDER_LEFT, "border left"},
                         {BORDER_RIGHT, "border right"},
                         {BORDER_TOP, "border top"},
                         {BORDER_BOTTOM, "border bottom"}};
    for (auto const &border : borders) {
        if (!(_flags & border.m_type)) continue;
        CBorder *p_border = new CBorder(mp_desktop, border.m_name);
        attach_child(p_border);
        p_border->set_border_type(border.m_type);
        p_border->set_border_size(_size);
    }
}

// ---------------------------------------------------------------------------------------------
// Pointer state, drawing, filtering
// ---------------------------------------------------------------------------------------------

void CWindowVisual::on_event_pointer_enter(CWndEvent const *_p_event) {
    CWindow::on_event_pointer_enter(_p_event);
    m_is_highlighted = true;
}

void CWindowVisual::on_event_pointer_exit(CWndEvent const *_p_event) {
    CWindow::on_event_pointer_exit(_p_event);
    m_is_highlighted = false;
}

void CWindowVisual::on_event_pointer_down(CWndEvent const *_p_event) {
    CWindow::on_event_pointer_down(_p_event);
    m_is_pushed = true;
}

void CWindowVisual::on_event_pointer_up(CWndEvent const *_p_event) {
    CWindow::on_event_pointer_up(_p_event);
    m_is_pushed = false;
}

// Each step overwrites the last, even with null; the normal material stands in for a missing one.
void CWindowVisual::draw(int _x, int _y, int _w, int _h) {
    CMaterial *p_material = nullptr;
    if (m_is_disabled) {
        p_material = get_material(MAT_NAME_DISABLED);
    } else {
        if (m_is_highlighted) p_material = get_material(MAT_NAME_HIGHLIGHTED);
        if (m_is_pushed && m_is_highlighted) p_material = get_material(MAT_NAME_PUSHED);
        if (m_is_checked) p_material = get_material(MAT_NAME_CHECKED);
    }
    if (!p_material) p_material = get_material(MAT_NAME_NORMAL);
    if (p_material) m_canvas.draw_rect(_x, _y, _w, _h, p_material);
}

// The children draw behind this handler, over the window; the clip isn't restored afterwards.
void CWindowVisual::on_event_draw(CWndEvent const *_p_event) {
    CWindow::on_event_draw(_p_event);
    calculate_transparency();
    int const x = -m_visual_delta_left, y = -m_visual_delta_top;
    int const w = get_w() + m_visual_delta_right + m_visual_delta_left;
    int const h = get_h() + m_visual_delta_bottom + m_visual_delta_top;
    m_canvas.set_clip_area(x, y, w, h);
    draw(x, y, w, h);
}

// A hidden window goes on drawing while it fades out.
bool CWindowVisual::filter_event(CWndEvent const *_p_event) {
    if (m_is_hidden && _p_event->get_id() == EVENT_DRAW && m_transparency > 0.0f) return true;
    return CWindow::filter_event(_p_event);
}

// A sound may hang on the test itself.
bool CWindowVisual::is_hit_test_needed(point_t const &_global) {
    return !m_sounds.empty() || CWindow::is_hit_test_needed(_global);
}

void CWindowVisual::on_event(CWndEvent const *_p_event) {
    CWindow::on_event(_p_event);
    play_sounds(_p_event);
}

// ---------------------------------------------------------------------------------------------
// Effects
// ---------------------------------------------------------------------------------------------

void CWindowVisual::calculate_transparency() {
    CWindowVisual const *p_parent = as_visual(mp_parent);
    float const parent = p_parent ? p_parent->m_transparency : 1.0f;
    m_transparency = parent;
    uint32_t const tick = now();
    if (m_is_hidden) {
        if (m_fade_out > 0 && tick < m_fade_start + static_cast<unsigned>(m_fade_out))
            m_transparency = (1.0f - static_cast<float>(tick - m_fade_start) / m_fade_out) * parent;
        else
            m_transparency = 0.0f;
    } else if (m_fade_in > 0 && tick < m_fade_start + static_cast<unsigned>(m_fade_in)) {
        m_transparency = parent * static_cast<float>(tick - m_fade_start) / m_fade_in;
    }
    m_transparency = std::min(1.0f, std::max(0.0f, m_transparency));
}

void CWindowVisual::on_event_show(CWndEvent const *_p_event) {
    CWindow::on_event_show(_p_event);
    uint32_t const tick = now();
    m_fade_start = tick;
    for (auto &entry : m_materials)
        if (entry.second.mp_resource && entry.second.mp_resource->get_defered_init())
            entry.second.mp_resource->init();
    if (m_movement_time != 0) {
        m_movement_start = tick;
        m_movement_origin = SRect{get_pos().x, get_pos().y, get_w(), get_h()};
    }
    if (m_auto_hide && m_auto_hide_time != 0) m_auto_hide_start = tick;
}

void CWindowVisual::on_event_hide(CWndEvent const *_p_event) {
    CWindow::on_event_hide(_p_event);
    m_fade_start = now();
}

void CWindowVisual::on_event_update(CWndEvent const *_p_event) {
    CWindow::on_event_update(_p_event);
    update_movement();
    update_auto_hide();
}

// No final step snaps the window: it stays where the last update within the time put it.
void CWindowVisual::update_movement() {
    if (m_movement_start == k_no_movement) return;
    uint32_t const t = now() - m_movement_start;
    if (t > m_movement_time) {
        m_movement_start = k_no_movement;
        return;
    }
    // In floats, the product before the division: t / T first lands a pixel short at some steps.
    float const elapsed = static_cast<float>(t), total = static_cast<float>(m_movement_time);
    SRect const &o = m_movement_origin, &d = m_movement_destination;
    auto step = [elapsed, total](int _from, int _to) {
        return trunc_to_int(static_cast<float>(_from) +
                            elapsed * (static_cast<float>(_to) - static_cast<float>(_from)) / total);
    };
    set_pos(step(o.x, d.x), step(o.y, d.y));
    set_size(step(o.w, d.w), step(o.h, d.h));
}

void CWindowVisual::update_auto_hide() {
    if (!m_auto_hide || m_auto_hide_start == 0 || m_auto_hide_start + m_auto_hide_time >= now()) return;
    send_event(this, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
    m_auto_hide_start = 0;
}

// ---------------------------------------------------------------------------------------------
// Sounds
// ---------------------------------------------------------------------------------------------

// For every window an event passes, whether or not the filter let it through.
void CWindowVisual::play_sounds(CWndEvent const *_p_event) {
    if (_p_event->get_id() == EVENT_HIDE) {
        stop_all_sounds();
        return;
    }
    if (!m_enable_events_sounds || m_sounds.empty() || m_is_disabled) return;
    auto const found = m_sounds.find(_p_event->get_id());
    if (found == m_sounds.end() || found->second.m_sources.empty()) return;
    SSound const &sound = found->second;
    auto start = [&sound](ISoundSource *p_source) {
        p_source->set_state(SOUND_STATE_RESET, 0.0f);
        p_source->set_state(SOUND_STATE_START, sound.m_fade_in);
    };
    if (sound.m_simultaneously)
        for (auto const &source : sound.m_sources)
            start(source.second);
    else
        start(sound.m_sources[static_cast<size_t>(std::rand()) % sound.m_sources.size()].second);
}

void CWindowVisual::stop_all_sounds() {
    for (auto const &sound : m_sounds)
        for (auto const &source : sound.second.m_sources)
            source.second->set_state(SOUND_STATE_STOP, sound.second.m_fade_out);
    for (CWindow *p_child : m_children)
        if (CWindowVisual *p_visual = as_visual(p_child)) p_visual->stop_all_sounds();
}

// A file belongs to one event of a window at most.
void CWindowVisual::remove_sound_file(string const &_file) {
    for (auto &sound : m_sounds) {
        auto &sources = sound.second.m_sources;
        for (auto it = sources.begin(); it != sources.end();) {
            if (it->first == _file) {
                delete it->second;
                it = sources.erase(it);
            } else {
                ++it;
            }
        }
    }
}

void CWindowVisual::load_sounds(LuaPlus::LuaObject &_lo_table) {
    LuaPlus::LuaObject const sounds = _lo_table.GetByName("events_sounds");
    if (!sounds.IsTable()) return;
    for_each_entry(sounds, [this](LuaPlus::LuaObject const &key, LuaPlus::LuaObject const &value) {
        if (value.IsTable()) load_sound(key, value);
    });
}

void CWindowVisual::load_sound(LuaPlus::LuaObject const &_lo_key, LuaPlus::LuaObject const &_lo_entry) {
    LuaPlus::LuaObject const files = _lo_entry.GetByName("file_names");
    float volume;
    if (!files.IsTable() || files.GetTableCount() < 1 || !read_float(_lo_entry, "volume", volume)) return;
    SSound sound; // its defaults stand for the keys that are missing
    bool looping = false;
    read_bool(_lo_entry, "looping", looping);
    read_bool(_lo_entry, "simultaneously", sound.m_simultaneously);
    read_bool(_lo_entry, "is_music", sound.m_is_music);
    read_float(_lo_entry, "fade_in", sound.m_fade_in);
    read_float(_lo_entry, "fade_out", sound.m_fade_out);
    char const *p_event_name = _lo_key.IsString() ? _lo_key.GetString() : "";
    EEventType id;
    if (!CWndEvent::get_id_by_name(p_event_name, id)) {
        ui_logger().log_message("Window '%s': event '%s' is not registered.", get_name(), p_event_name);
        return;
    }
    ISoundSystem *p_sound_system = engine_interfaces().get_sound_system(false);
    for_each_entry(files, [&](LuaPlus::LuaObject const &, LuaPlus::LuaObject const &file) {
        if (!file.IsString()) return;
        remove_sound_file(file.GetString());
        ISoundSource *p_source =
            p_sound_system
                ? p_sound_system->create_sound(file.GetString(),
                                               sound.m_is_music ? SOUND_GROUP_UI_MUSIC : SOUND_GROUP_UI,
                                               SOUND_FLAGS_INTERFACE)
                : nullptr;
        if (!p_source) {
            ui_logger().log_message("Cannot create sound source from file '%s'", file.GetString());
            return;
        }
        p_source->set_volume(volume + 1.0f);
        p_source->set_option(SOUND_OPTION_INTERFACE);
        p_source->set_looping(looping);
        sound.m_sources.emplace_back(file.GetString(), p_source);
    });
    if (sound.m_sources.empty()) return;
    auto const old = m_sounds.find(id);
    if (old != m_sounds.end())
        for (auto &source : old->second.m_sources)
            delete source.second;
    m_sounds[id] = sound;
}

void CWindowVisual::save_sounds(LuaPlus::LuaObject &_lo_table) {
    if (m_sounds.empty()) return;
    LuaPlus::LuaState *p_state = _lo_table.GetState();
    LuaPlus::LuaObject sounds;
    sounds.AssignNewTable(p_state);
    _lo_table.SetObject("events_sounds", sounds);
    for (auto const &entry : m_sounds) {
        SSound const &sound = entry.second;
        string name;
        if (sound.m_sources.empty() || !CWndEvent::get_name_by_id(entry.first, name)) continue;
        LuaPlus::LuaObject files, saved;
        files.AssignNewTable(p_state);
        for (auto const &source : sound.m_sources)
            files.Insert(LuaPlus::LuaObject().AssignString(p_state, source.first.c_str()));
        saved.AssignNewTable(p_state);
        saved.SetObject("file_names", files);
        ISoundSource *p_first = sound.m_sources.front().second;
        saved.SetNumber("volume", p_first->get_volume(SOUND_VOLUME_OWN) - 1.0f);
        if (p_first->is_looping()) saved.SetBoolean("looping", true);
        if (sound.m_simultaneously) saved.SetBoolean("simultaneously", true);
        if (sound.m_is_music) saved.SetBoolean("is_music", true);
        if (sound.m_fade_in != 0.0f) saved.SetNumber("fade_in", sound.m_fade_in);
        if (sound.m_fade_out != 0.0f) saved.SetNumber("fade_out", sound.m_fade_out);
        sounds.SetObject(name.c_str(), saved);
    }
}

// ---------------------------------------------------------------------------------------------
// Layouts
// ---------------------------------------------------------------------------------------------

void CWindowVisual::save_state(LuaPlus::LuaObject &_lo_table) {
    CWindow::save_state(_lo_table);
    LuaPlus::LuaState *p_state = _lo_table.GetState();
    if (!m_materials.empty()) {
        LuaPlus::LuaObject materials;
        materials.AssignNewTable(p_state);
        _lo_table.SetObject("materials", materials);
        for (auto const &entry : m_materials) {
            if (!entry.second.m_owned) continue;
            LuaPlus::LuaObject material;
            material.AssignNewTable(p_state);
            materials.SetObject(entry.second.m_id.GetName(), material);
            if (entry.second.mp_resource) entry.second.mp_resource->save_state(material);
        }
    }
    if (!m_fonts.empty()) {
        LuaPlus::LuaObject fonts;
        fonts.AssignNewTable(p_state);
        _lo_table.SetObject("fonts", fonts);
        for (auto const &entry : m_fonts)
            if (entry.second.m_owned && entry.second.mp_resource)
                fonts.SetString(entry.second.m_id.GetName(), entry.second.mp_resource->get_name());
    }
    save_sounds(_lo_table);
    if (m_z_order != 0) _lo_table.SetNumber("z_order", m_z_order);
    if (m_auto_hide) {
        _lo_table.SetBoolean("auto_hide", true);
        _lo_table.SetInteger("auto_hide_time", static_cast<int>(m_auto_hide_time));
    }
    struct {
        char const *mp_key;
        int m_value;
    } const numbers[] = {
        {"top_margin", m_top_margin},
        {"bottom_margin", m_bottom_margin},
        {"left_margin", m_left_margin},
        {"right_margin", m_right_margin},
        {"visual_delta_left", m_visual_delta_left},
        {"visual_delta_right", m_visual_delta_right},
        {"visual_delta_top", m_visual_delta_top},
        {"visual_delta_bottom", m_visual_delta_bottom},
        {"fade_in", m_fade_in},
        {"fade_out", m_fade_out},
    };
    for (auto const &number : numbers)
        _lo_table.SetNumber(number.mp_key, number.m_value);
}

void CWindowVisual::load_state(LuaPlus::LuaObject &_lo_table) {
    CWindow::load_state(_lo_table);
    LuaPlus::LuaObject const materials = _lo_table.GetByName("materials");
    if (materials.IsTable()) load_materials(materials);
    LuaPlus::LuaObject const fonts = _lo_table.GetByName("fonts");
    if (fonts.IsTable()) load_fonts(fonts);
    load_sounds(_lo_table);
    int z_order;
    if (read_int(_lo_table, "z_order", z_order)) m_z_order = static_cast<unsigned>(z_order);
    LuaPlus::LuaObject const auto_hide = _lo_table.GetByName("auto_hide");
    if (auto_hide.IsBoolean()) {
        m_auto_hide = auto_hide.GetBoolean();
        int time;
        if (m_auto_hide && read_integer(_lo_table, "auto_hide_time", time))
            m_auto_hide_time = static_cast<unsigned>(time);
    }
    read_int(_lo_table, "top_margin", m_top_margin);
    read_int(_lo_table, "bottom_margin", m_bottom_margin);
    read_int(_lo_table, "left_margin", m_left_margin);
    read_int(_lo_table, "right_margin", m_right_margin);
    read_int(_lo_table, "fade_in", m_fade_in);
    read_int(_lo_table, "fade_out", m_fade_out);
    read_int(_lo_table, "visual_delta_left", m_visual_delta_left);
    read_int(_lo_table, "visual_delta_top", m_visual_delta_top);
    read_int(_lo_table, "visual_delta_right", m_visual_delta_right);
    read_int(_lo_table, "visual_delta_bottom", m_visual_delta_bottom);
    LuaPlus::LuaObject const movement = _lo_table.GetByName("movement");
    if (movement.IsTable()) load_movement(movement);
}

// An existing material takes the table; a new one is made only for a table with content.
void CWindowVisual::load_materials(LuaPlus::LuaObject const &_lo_materials) {
    for_each_named(_lo_materials, [this](char const *p_key, LuaPlus::LuaObject const &value) {
        HUID const id(p_key);
        CMaterial *p_material = get_material(id);
        if (!p_material && value.IsTable() && value.GetTableCount() > 0) {
            if (!QOR_CHECK(mp_desktop)) return;
            p_material = mp_desktop->create_material();
            if (!QOR_CHECK(p_material)) return;
            add_material(id, p_material);
        }
        if (p_material) p_material->load_state(value);
    });
}

void CWindowVisual::load_fonts(LuaPlus::LuaObject const &_lo_fonts) {
    for_each_named(_lo_fonts, [this](char const *p_key, LuaPlus::LuaObject const &value) {
        add_font(HUID(p_key),
                 value.IsString() ? get_fonts_factory().create(value.GetString(), mp_desktop) : nullptr);
    });
}

// { pos = { x, y }, size = { w, h }, time = milliseconds }: where a show slides the window to.
void CWindowVisual::load_movement(LuaPlus::LuaObject const &_lo_movement) {
    SRect &d = m_movement_destination;
    read_pair(_lo_movement, "pos", d.x, d.y);
    read_pair(_lo_movement, "size", d.w, d.h);
    int time = static_cast<int>(m_movement_time);
    read_int(_lo_movement, "time", time);
    m_movement_time = static_cast<unsigned>(time);
}

// ---------------------------------------------------------------------------------------------
// Texts in layouts
// ---------------------------------------------------------------------------------------------

void CWindowVisual::load_string(LuaPlus::LuaObject &_lo_table, char const *_key, CString &_string) {
    LuaPlus::LuaObject const value = _lo_table.GetByName(_key);
    if (value.IsString()) _string = local_string_or_key(value.GetString(), false);
}

void CWindowVisual::save_string(LuaPlus::LuaObject &_lo_table, char const *_key, CString const &_string) {
    IUserInterface *p_ui = engine_interfaces().get_user_interface(false);
    char const *p_local_key = p_ui ? p_ui->get_local_key(_string.c_str()) : nullptr;
    _lo_table.SetString(_key, p_local_key ? p_local_key : _string.get_narrow().c_str());
}

void CWindowVisual::load_text(LuaPlus::LuaObject &_lo_table, char const *_key, CText &_text) {
    LuaPlus::LuaObject const lines = _lo_table.GetByName(_key);
    if (!lines.IsTable()) return;
    for_each_entry(lines, [&](LuaPlus::LuaObject const &, LuaPlus::LuaObject const &entry) {
        if (!entry.IsTable() || !entry.GetByName("string").IsString()) return;
        int const before = static_cast<int>(_text.get_num_strings());
        _text.insert_str(local_string_or_key(entry.GetByName("string").GetString(), false).c_str(), false);
        LuaPlus::LuaObject const font = entry.GetByName("font");
        if (!font.IsString()) return;
        static HUID const string_font("STRING_FONT");
        CFont *p_font = get_font(string_font);
        if (!p_font) {
            p_font = get_fonts_factory().create(font.GetString(), mp_desktop);
            add_font(string_font, p_font);
        }
        if (!p_font) return;
        int const after = static_cast<int>(_text.get_num_strings());
        for (int line = std::max(before - 1, 0); line <= after - 2; ++line)
            _text.set_string_font(static_cast<unsigned>(line), p_font);
    });
}

// ---------------------------------------------------------------------------------------------
// Text events
// ---------------------------------------------------------------------------------------------

// EVENT_SET_TEXT does the work, also a derived class's.
void CWindowVisual::forward_set_str(CWndEvent const *_p_event) {
    _p_event->rewind();
    string key;
    *_p_event >> key;
    CWndEvent set_text(EVENT_SET_TEXT);
    set_text << static_cast<wstring const &>(local_string_or_key(key.c_str(), true));
    send_event(this, &set_text, CWndEvent::DISPATCH_NONE);
}

} // namespace qorui
