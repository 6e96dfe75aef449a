// A passive line of text: the text, inline colour tags included, placed left, right or centred
// between the margins, at the top margin. It takes its text from EVENT_SET_TEXT (16-bit text) and
// EVENT_SET_STR (the key of a local string, or plain text), and from the layout's "text".
#pragma once
#include "ui_string.h"
#include "ui_window_visual.h"

namespace qorui {

// A passive line of text placed left, right or centred between the margins.
class CStaticText : public CWindowVisual {
public:
    // Passive, left aligned, empty; a slot for the normal material that holds none.
    CStaticText(CDesktop *_p_desktop, char const *_name);
    // Nothing of its own to release.
    virtual ~CStaticText();

    QOR_CLASS_ID(CStaticText, CWindowVisual, "StaticText")

    // Behind the visual window's keys: "text" (a local string key where there is one) and
    // "text_alignment" (an alignment's name; another value leaves the alignment as it is).
    // @{
    virtual void save_state(LuaPlus::LuaObject &_lo_table) override;
    virtual void load_state(LuaPlus::LuaObject &_lo_table) override;
    // @}

    // Left, right and centre place the text; every other value places it as left does. Setting it
    // lays out again.
    // @{
    virtual void set_text_alignment(EAlignment _alignment);
    EAlignment get_text_alignment() const { return m_text_alignment; }
    // @}

    // The text, inline colour tags included.
    CString const &get_text() const { return m_text; }
    // No layout follows a new text.
    void set_text(CString const &_text) { m_text = _text; }

protected:
    // Behind the visual window's: the text in the default font at the top margin, placed by the
    // alignment between the margins. A window without the default font breaks a contract.
    virtual void on_event_draw(CWndEvent const *_p_event) override;
    // Takes the wide string of the event as the text.
    virtual void on_event_set_text(CWndEvent const *_p_event) override;
    // The narrow string as a local string key, else as it stands, sent on as EVENT_SET_TEXT.
    virtual void on_event_set_str(CWndEvent const *_p_event) override;

    CString m_text;              // the text shown
    EAlignment m_text_alignment; // left, right or centre
};

} // namespace qorui
