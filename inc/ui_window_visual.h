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
    // No materials, fonts or margins; fades of 150 ms; event sounds enabled.
    CWindowVisual(CDesktop *_p_desktop, char const *_name);
    // Destroys the sound sources, the canvas and the owned materials and fonts; the children go
    // with the window tree.
    virtual ~CWindowVisual();

    QOR_CLASS_ID(CWindowVisual, CWindow, "WindowVisual")

    // Resources

    // Stores the material or font under _id, destroying an owned one stored there before. The
    // window owns what it is given; null is a valid value. The subtree looks its resources up
    // again (EVENT_RESOURCE_INVALIDATE).
    // @{
    virtual void add_material(HUID const &_id, CMaterial *_p_material);
    virtual void add_font(HUID const &_id, CFont *_p_font);
    // @}
    // The window's own material only; null when it has none of that name.
    virtual CMaterial *get_material(HUID const &_id);
    // The window's own font, else the nearest visual ancestor's, kept here as a cache (also a
    // null answer) until the resources are looked up again.
    virtual CFont *get_font(HUID const &_id);
    // An entry of the material and font maps.
    template <class TResource>
    struct SResource {
        HUID m_id;              // the key name, such as MAT_NAME_NORMAL
        TResource *mp_resource; // may be null
        bool m_owned; // destroyed with the entry and saved; false for a font cached from an ancestor
    };

    // States under the pointer

    // The pointer is over the window (from pointer enter to pointer exit).
    bool is_highlighted() const { return m_is_highlighted; }
    // A pointer button went down on the window and hasn't come up.
    bool is_pushed() const { return m_is_pushed; }
    // Checked: drawn with the checked material. Setting it sends no event.
    // @{
    bool is_checked() const { return m_is_checked; }
    void set_checked(bool _checked) { m_is_checked = _checked; }
    // @}

    // Client area and children: margins (each setter aligns the children anew), the z order
    // among siblings

    // The size within the margins; children align to it but aren't clipped to it.
    // @{
    virtual int get_client_w() const override;
    virtual int get_client_h() const override;
    // @}
    // (left margin, top margin).
    virtual point_t get_client_pos() const override;
    // The width of each margin in pixels.
    // @{
    int get_top_margin() const { return m_top_margin; }
    int get_bottom_margin() const { return m_bottom_margin; }
    int get_left_margin() const { return m_left_margin; }
    int get_right_margin() const { return m_right_margin; }
    // @}
    // Sets one margin and lays the children out again.
    // @{
    void set_top_margin(int _margin);
    void set_bottom_margin(int _margin);
    void set_left_margin(int _margin);
    void set_right_margin(int _margin);
    // @}
    // Sets all four margins, laying the children out once.
    void set_uniform_margins(int _margin);
    // Depth among siblings from the layout: higher is farther back. There is no setter.
    unsigned get_z_order() const { return m_z_order; }
    // Sorts the children by descending z order, keeping the order of equal ones; runs from
    // load_state behind each child entry.
    virtual void on_child_attached() override;
    // A new static text child named _name, placed on _area, showing _text.
    CStaticText *make_static_text(CString const &_text, CRectArea const &_area, char const *_name);
    // A border child (CBorder) for each edge flag of EBorderType set in _flags, _size pixels thick:
    // "border left", "border right", "border top" and "border bottom", in this order.
    void make_borders(int _size, unsigned int _flags);

    // Drawing: the canvas and what it needs of its window

    // The window's drawing surface.
    // @{
    CCanvas &get_canvas() { return m_canvas; }
    CCanvas const &get_canvas() const { return m_canvas; }
    // @}
    float get_transparency() const override { return m_transparency; }
    point_t const &get_canvas_origin() const override { return m_global_pos; }
    int get_canvas_w() const override { return get_w(); }
    int get_canvas_h() const override { return get_h(); }
    IRender *get_canvas_render() const override;

    // Effects: fades and auto hide

    // How long showing and hiding fade, in ms, truncated to whole ms; 0 for none.
    // @{
    void set_fade_in(float _ms) { m_fade_in = static_cast<int>(_ms); }
    void set_fade_out(float _ms) { m_fade_out = static_cast<int>(_ms); }
    float get_fade_in() const { return static_cast<float>(m_fade_in); }
    float get_fade_out() const { return static_cast<float>(m_fade_out); }
    // @}
    // With auto hide, the window hides itself auto_hide_time ms after each show (counted from
    // the next show).
    // @{
    void set_auto_hide(bool _auto_hide) { m_auto_hide = _auto_hide; }
    bool get_auto_hide() const { return m_auto_hide; }
    void set_auto_hide_time(unsigned int _ms) { m_auto_hide_time = _ms; }
    unsigned int get_auto_hide_time() const { return m_auto_hide_time; }
    // @}

    // Sounds on events

    // Stops the sources of every event of this window and its visual subtree, each with its
    // fade-out time. Hiding a window does this.
    virtual void stop_all_sounds();
    // Whether events play their sounds; true by default.
    virtual void set_enable_events_sounds(bool _enable) { m_enable_events_sounds = _enable; }
    // Writes the sounds under "events_sounds": per event name its file names, volume, looping,
    // simultaneously, is_music, fade_in and fade_out. Nothing without sounds.
    virtual void save_sounds(LuaPlus::LuaObject &_lo_table);
    // Reads "events_sounds" and makes a source for each file; an unregistered event name or a
    // file that gives no source is logged and passed over. A file already used by the window
    // moves to the new event.
    virtual void load_sounds(LuaPlus::LuaObject &_lo_table);

    // Persistence. User-visible text in layouts is the key of a local string where there is one.

    // Behind the window's keys: "materials" and "fonts" (owned entries only), the sounds,
    // "z_order" (if not 0), "auto_hide" with "auto_hide_time" (if set), the margins, the visual
    // deltas and the fades.
    virtual void save_state(LuaPlus::LuaObject &_lo_table) override;
    // Behind the window's keys and children: the same keys, and "movement". Materials named
    // there are loaded into existing ones or made; fonts come from the fonts factory.
    virtual void load_state(LuaPlus::LuaObject &_lo_table) override;
    // Writes _string under _key: the key of the local string with that text if there is one,
    // else the narrow text.
    virtual void save_string(LuaPlus::LuaObject &_lo_table, char const *_key, CString const &_string);
    // Reads a string under _key: the local string of that key, else the key's own text. Another
    // type leaves _string as it is.
    virtual void load_string(LuaPlus::LuaObject &_lo_table, char const *_key, CString &_string);
    // Adds a line to _text for each entry of the table under _key that has a "string" (read as
    // load_string); an entry's "font" gives those lines the window's "STRING_FONT".
    virtual void load_text(LuaPlus::LuaObject &_lo_table, char const *_key, CText &_text);

protected:
    // Routing and handlers

    // The window's routing, then the event's sounds (whether the filter let it through or not);
    // EVENT_HIDE stops every sound of the subtree instead.
    virtual void on_event(CWndEvent const *_p_event) override;
    // As the window's, but a hidden window still draws while it fades out.
    virtual bool filter_event(CWndEvent const *_p_event) override;
    // A window with sounds takes the hit test: a sound may hang on it.
    virtual bool is_hit_test_needed(point_t const &_global) override;
    // Behind the window's: the movement, then auto hide.
    virtual void on_event_update(CWndEvent const *_p_event) override;
    // Behind the window's: the transparency of this frame, the clip area of the window's picture
    // (the region grown by the visual deltas) and its material by state: disabled, else checked
    // over pushed over highlighted, else normal. Controls draw their content behind this.
    virtual void on_event_draw(CWndEvent const *_p_event) override;
    // Behind the window's: starts the fade in, initialises deferred materials, and starts the
    // movement and the auto-hide count.
    virtual void on_event_show(CWndEvent const *_p_event) override;
    // Behind the window's: starts the fade out.
    virtual void on_event_hide(CWndEvent const *_p_event) override;
    // The window's behaviour only; here so that controls can call the base of their base.
    // @{
    virtual void on_event_resized(CWndEvent const *_p_event) override;
    // @}
    // Set and clear the highlighted state.
    // @{
    virtual void on_event_pointer_enter(CWndEvent const *_p_event) override;
    virtual void on_event_pointer_exit(CWndEvent const *_p_event) override;
    // @}
    // Clear and set the pushed state.
    // @{
    virtual void on_event_pointer_up(CWndEvent const *_p_event) override;
    virtual void on_event_pointer_down(CWndEvent const *_p_event) override;
    // @}
    // The window's behaviour only; here so that controls can call the base of their base.
    // @{
    virtual void on_event_drag_begin(CWndEvent const *_p_event) override;
    virtual void on_event_drag(CWndEvent const *_p_event) override;
    virtual void on_event_drag_end(CWndEvent const *_p_event) override;
    // @}
    // Behind the window's: drops the fonts cached from ancestors and looks them up again.
    virtual void on_event_resource_invalidate(CWndEvent const *_p_event) override;
    // The opacity of this frame: the parent's, times the running fade.
    void calculate_transparency();
    // The narrow string of an EVENT_SET_STR, as the local string of that key or as it stands when
    // there is none, sent to the window itself as EVENT_SET_TEXT.
    void forward_set_str(CWndEvent const *_p_event);

    // The sounds of one event type.
    struct SSound {
        qor_vector<std::pair<string, ISoundSource *>> m_sources; // file name and source; owned
        bool m_simultaneously = false; // play all sources at once, else one at random
        bool m_is_music = false;       // made in the "ui_music" group, else "ui"
        float m_fade_in = 0.0f;        // ms, handed to the source at each start
        float m_fade_out = 500.0f;     // ms, handed to the source at each stop
    };
    // A position and a size, in pixels.
    struct SRect {
        // Left, top, width, height.
        // @{
        int x, y, w, h;
        // @}
    };

    // Resources

    // The materials and fonts by name, ordered by hash.
    // @{
    qor_map<HUID, SResource<CMaterial>> m_materials;
    qor_map<HUID, SResource<CFont>> m_fonts;
    // @}
    // States under the pointer, behind the accessors of the same names.
    // @{
    bool m_is_highlighted;
    bool m_is_pushed;
    bool m_is_checked;
    // @}
    // Client area, z order, and the picture's reach beyond the window

    // Margins in pixels.
    // @{
    int m_top_margin, m_bottom_margin, m_left_margin, m_right_margin;
    // @}
    unsigned m_z_order; // higher is farther back
    // How far the picture reaches beyond the region on each side, in pixels; drawing only, hit
    // tests and layout ignore them.
    // @{
    int m_visual_delta_left, m_visual_delta_top, m_visual_delta_right, m_visual_delta_bottom;
    // @}
    // Drawing

    // The window's drawing surface.
    CCanvas m_canvas;
    // Effects: fades, auto hide and movement; times in ms, starts as tick counts

    // Fade durations.
    // @{
    int m_fade_in, m_fade_out;
    // @}
    unsigned m_fade_start;      // the last show or hide
    float m_transparency;       // this frame's opacity, 0 to 1: the parent's times the fade
    bool m_auto_hide;           // hide by itself after m_auto_hide_time
    unsigned m_auto_hide_time;  // ms
    unsigned m_auto_hide_start; // 0 when no count runs
    // Where a show slides the window to, and from where.
    // @{
    SRect m_movement_destination;
    SRect m_movement_origin;
    // @}
    unsigned m_movement_time;  // 0 for no movement
    unsigned m_movement_start; // 0xFFFFFFFF when no movement runs
    // Sounds

    // The sounds of each event type.
    qor_map<EEventType, SSound> m_sounds;
    bool m_enable_events_sounds; // whether events play their sounds

private:
    void draw(int _x, int _y, int _w, int _h);
    CFont *get_inherited_font(HUID const &_id);
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
