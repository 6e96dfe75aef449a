// The window that can be seen: named materials and fonts (fonts inherited from visual ancestors),
// margins that make a client area, the states highlighted, pushed and checked, a canvas, a z order
// among siblings, fades, movement, auto hide and sounds on events, all clocked by the tick count.
#pragma once
#include "ui_canvas.h"
#include "ui_window.h"

class ISoundSource;

namespace qorui {

class CFont;
class CMaterial;
class CStaticText;
class CString;
class CText;

// A window that can be seen: materials and fonts by name, margins, states, a canvas, fades and sounds.
class CWindowVisual : public CWindow, public ICanvasOwner {
public:
    CWindowVisual(CDesktop *_p_desktop, char const *_name);
    virtual ~CWindowVisual();

    QOR_CLASS_ID(CWindowVisual, CWindow, "WindowVisual")

    // Resources. The window owns what it is given; null is a valid value. The subtree looks its
    // resources up again.
    virtual void add_material(HUID const &_id, CMaterial *_p_material);
    virtual void add_font(HUID const &_id, CFont *_p_font);
    // The window's own material only.
    virtual CMaterial *get_material(HUID const &_id);
    // The window's own font, else the nearest visual ancestor's, kept here as a cache.
    virtual CFont *get_font(HUID const &_id);
    // An entry of the material and font maps.
    template <class TResource>
    struct SResource {
        HUID m_id;
        TResource *mp_resource;
        bool m_owned; // destroyed with the entry and saved; false for a font cached from an ancestor
    };

    // States under the pointer
    bool is_highlighted() const { return m_is_highlighted; }
    bool is_pushed() const { return m_is_pushed; }
    bool is_checked() const { return m_is_checked; }
    void set_checked(bool _checked) { m_is_checked = _checked; }

    // Client area and children: margins (each setter aligns the children anew), the z order
    // among siblings
    virtual int get_client_w() const override;
    virtual int get_client_h() const override;
    virtual point_t get_client_pos() const override;
    int get_top_margin() const { return m_top_margin; }
    int get_bottom_margin() const { return m_bottom_margin; }
    int get_left_margin() const { return m_left_margin; }
    int get_right_margin() const { return m_right_margin; }
    void set_top_margin(int _margin);
    void set_bottom_margin(int _margin);
    void set_left_margin(int _margin);
    void set_right_margin(int _margin);
    void set_uniform_margins(int _margin);
    unsigned get_z_order() const { return m_z_order; }
    virtual void on_child_attached() override;
    // A new static text child named _name, placed on _area, showing _text.
    CStaticText *make_static_text(CString const &_text, CRectArea const &_area, char const *_name);
    // A border child (CBorder) for each edge flag of EBorderType set in _flags, _size pixels thick:
    // "border left", "border right", "border top" and "border bottom", in this order.
    void make_borders(int _size, unsigned int _flags);

    // Drawing: the canvas and what it needs of its window
    CCanvas &get_canvas() { return m_canvas; }
    CCanvas const &get_canvas() const { return m_canvas; }
    float get_transparency() const override { return m_transparency; }
    point_t const &get_canvas_origin() const override { return m_global_pos; }
    int get_canvas_w() const override { return get_w(); }
    int get_canvas_h() const override { return get_h(); }
    IRender *get_canvas_render() const override;

    // Effects: fades and auto hide
    void set_fade_in(float _ms) { m_fade_in = static_cast<int>(_ms); }
    void set_fade_out(float _ms) { m_fade_out = static_cast<int>(_ms); }
    float get_fade_in() const { return static_cast<float>(m_fade_in); }
    float get_fade_out() const { return static_cast<float>(m_fade_out); }
    void set_auto_hide(bool _auto_hide) { m_auto_hide = _auto_hide; }
    bool get_auto_hide() const { return m_auto_hide; }
    void set_auto_hide_time(unsigned int _ms) { m_auto_hide_time = _ms; }
    unsigned int get_auto_hide_time() const { return m_auto_hide_time; }

    // Sounds on events. stop_all_sounds stops the sources of every event of this window and its
    // visual subtree.
    virtual void stop_all_sounds();
    virtual void set_enable_events_sounds(bool _enable) { m_enable_events_sounds = _enable; }
    virtual void save_sounds(LuaPlus::LuaObject &_lo_table);
    virtual void load_sounds(LuaPlus::LuaObject &_lo_table);

    // Persistence. User-visible text in layouts is the key of a local string where there is one.
    virtual void save_state(LuaPlus::LuaObject &_lo_table) override;
    virtual void load_state(LuaPlus::LuaObject &_lo_table) override;
    virtual void save_string(LuaPlus::LuaObject &_lo_table, char const *_key, CString const &_string);
    virtual void load_string(LuaPlus::LuaObject &_lo_table, char const *_key, CString &_string);
    virtual void load_text(LuaPlus::LuaObject &_lo_table, char const *_key, CText &_text);

protected:
    // Routing and handlers
    virtual void on_event(CWndEvent const *_p_event) override;
    virtual bool filter_event(CWndEvent const *_p_event) override;
    virtual bool is_hit_test_needed(point_t const &_global) override;
    virtual void on_event_update(CWndEvent const *_p_event) override;
    virtual void on_event_draw(CWndEvent const *_p_event) override;
    virtual void on_event_show(CWndEvent const *_p_event) override;
    virtual void on_event_hide(CWndEvent const *_p_event) override;
    virtual void on_event_resized(CWndEvent const *_p_event) override;
    virtual void on_event_pointer_enter(CWndEvent const *_p_event) override;
    virtual void on_event_pointer_exit(CWndEvent const *_p_event) override;
    virtual void on_event_pointer_up(CWndEvent const *_p_event) override;
    virtual void on_event_pointer_down(CWndEvent const *_p_event) override;
    virtual void on_event_drag_begin(CWndEvent const *_p_event) override;
    virtual void on_event_drag(CWndEvent const *_p_event) override;
    virtual void on_event_drag_end(CWndEvent const *_p_event) override;
    virtual void on_event_resource_invalidate(CWndEvent const *_p_event) override;
    // The opacity of this frame: the parent's, times the running fade.
    void calculate_transparency();
    // The narrow string of an EVENT_SET_STR, as the local string of that key or as it stands when
    // there is none, sent to the window itself as EVENT_SET_TEXT.
    void forward_set_str(CWndEvent const *_p_event);

    struct SSound {
        qor_vector<std::pair<string, ISoundSource *>> m_sources; // owned
        bool m_simultaneously = false;
        bool m_is_music = false;
        float m_fade_in = 0.0f;
        float m_fade_out = 500.0f;
    };
    struct SRect {
        int x, y, w, h;
    };

    // Resources
    qor_map<HUID, SResource<CMaterial>> m_materials;
    qor_map<HUID, SResource<CFont>> m_fonts;
    // States under the pointer
    bool m_is_highlighted;
    bool m_is_pushed;
    bool m_is_checked;
    // Client area, z order, and the picture's reach beyond the window
    int m_top_margin, m_bottom_margin, m_left_margin, m_right_margin;
    unsigned m_z_order;
    int m_visual_delta_left, m_visual_delta_top, m_visual_delta_right, m_visual_delta_bottom;
    // Drawing
    CCanvas m_canvas;
    // Effects: fades, auto hide and movement; times in ms, starts as tick counts
    int m_fade_in, m_fade_out;
    unsigned m_fade_start;
    float m_transparency;
    bool m_auto_hide;
    unsigned m_auto_hide_time;
    unsigned m_auto_hide_start;
    SRect m_movement_destination;
    SRect m_movement_origin;
    unsigned m_movement_time;
    unsigned m_movement_start;
    // Sounds
    qor_map<EEventType, SSound> m_sounds;
    bool m_enable_events_sounds;

private:
    void draw(int _x, int _y, int _w, int _h);
    void set_margin(int &_margin, int _value);
    void update_movement();
    void update_auto_hide();
    void play_sounds(CWndEvent const *_p_event);
    void remove_sound_file(string const &_file);
    void load_materials(LuaPlus::LuaObject const &_lo_materials);
    void load_fonts(LuaPlus::LuaObject const &_lo_fonts);
    void load_sound(LuaPlus::LuaObject const &_lo_key, LuaPlus::LuaObject const &_lo_entry);
    void load_movement(LuaPlus::LuaObject const &_lo_movement);
};

} // namespace qorui
