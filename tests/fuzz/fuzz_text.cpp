// Tagged text on a canvas: one line and a text of many lines, with tags and without, measured.
#include "fuzz_world.h"
#include "ui_font.h"
#include "ui_string.h"
#include "ui_text.h"
#include "ui_window_visual.h"

#include <algorithm>
#include <string>

extern "C" int LLVMFuzzerTestOneInput(uint8_t const *_p_data, size_t _size) {
    qorfuzz::init();
    static qorui::CDesktop *sp_desktop = qorfuzz::new_desktop(); // kept: text leaves no state
    static qorui::CWindowVisual *sp_wnd = [] {
        qorui::CWindowVisual *p_wnd = new qorui::CWindowVisual(sp_desktop, "w");
        sp_desktop->attach_child(p_wnd);
        p_wnd->set_size(150, 100);
        return p_wnd;
    }();
    // Narrow text becomes a string through a buffer of n_max_len units: longer text is the caller's
    // to cut, as the data paths do.
    std::string const bytes(reinterpret_cast<char const *>(_p_data), _size);
    int const size = static_cast<int>(std::min<size_t>(bytes.size(), qorui::CString::n_max_len - 1));
    qorui::CString const line(bytes.c_str(), size);
    qorui::CText text(line);
    text.set_alignment(_size % 2 ? qorui::ALIGNMENT_CENTER : qorui::ALIGNMENT_NONE);
    qorui::CCanvas &canvas = sp_wnd->get_canvas();
    for (qorui::HUID const &id : {qorui::FNT_NAME_DEFAULT, qorui::FNT_NAME_FIXED}) {
        qorui::CFont *p_font = sp_desktop->get_font(id);
        for (bool const tags : {true, false}) {
            canvas.set_tags_enable(tags);
            canvas.text_out(-7, 3, line, p_font);
            canvas.text_out(2, -20, 1, text, p_font);
        }
        canvas.get_text_width(line, p_font, static_cast<int>(_size % 7) - 1);
    }
    qorui::CString bare(line);
    bare.remove_tags();
    return 0;
}
