// A passive line of text: the text, inline colour tags included, placed left, right or centred
// between the margins, at the top margin. It takes its text from EVENT_SET_TEXT (16-bit text) and
// EVENT_SET_STR (the key of a local string, or plain text), and from the layout's "text".
#pragma once
#include "ui_string.h"
#include "ui_window_visual.h"

namespace qorui {

class CStaticText : public CWindowVisual {
public:
    // Passive, left aligned, empty; a slot for the normal material that holds none.
    CStaticText(CDesktop *_p_desktop, char const *_name);
    virtual ~CStaticText();

    QOR_CLASS_ID(CStaticText, CWindowVisual, "StaticText")

    virtual void save_state(LuaPlus::LuaObject &_lo_table) override;
    virtual void load_state(LuaPlus::LuaObject &_lo_table) override;

    // Left, right and centre place the text; every other value places it as left does.
    virtual void set_text_alignment(EAlignment _alignment);
    EAlignment get_text_alignment() const { return m_text_alignment; }

    CString const &get_text() const { return m_text; }
    // No layout follows a new text.
    void set_text(CString const &_text) { m_text = _text; }

protected:
    virtual void on_event_draw(CWndEvent const *_p_event) override;
    virtual void on_event_set_text(CWndEvent const *_p_event) override;
    virtual void on_event_set_str(CWndEvent const *_p_event) override;

    CString m_text;
    EAlignment m_text_alignment;
};

} // namespace qorui
