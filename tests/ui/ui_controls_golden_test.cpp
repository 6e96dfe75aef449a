// The picture of every control in every state, with the data's materials, drawn by the software
// renderer and compared with the checked-in golden: buttons, check boxes and radio buttons in
// each state, static texts in their three alignments, progress bars, scroll bars of both
// orientations at several positions, and an edit box with its caret and vertical bar.
#include "test_world.h"

#include "engine_interfaces.h"
#include "qorbase.h"
#include "qorscriptsystem.h"
#include "ui_button.h"
#include "ui_edit_box.h"
#include "ui_material.h"
#include "ui_static_text.h"
#include "ui_value_bar.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

typedef std::vector<std::pair<HUID const *, char const *>> looks_t;

// Each look of the window from the data's preset of its name, _prefix first.
void dress(CDesktop *_p_desktop, CWindowVisual *_p_wnd, std::string const &_prefix, looks_t const &_looks) {
    for (auto const &look : _looks) {
        LuaPlus::LuaObject preset =
            qortest::lua_table("{ material_preset = '" + _prefix + look.second + "' }");
        CMaterial *p_material = _p_desktop->create_material();
        p_material->load_state(preset);
        _p_wnd->add_material(*look.first, p_material);
    }
}

// End buttons of 16 by 16 and the scroller given; the bar is laid out for its parts.
void size_parts(CScrollBar *_p_bar, int _scroller_w, int _scroller_h) {
    _p_bar->get_button_min()->set_size(16, 16);
    _p_bar->get_button_max()->set_size(16, 16);
    _p_bar->get_button_scroller()->set_size(_scroller_w, _scroller_h);
    _p_bar->set_scroller_for_position();
}

void send(CWindow *_p_wnd, EEventType _id) {
    _p_wnd->send_event(_p_wnd, _id, CWndEvent::DISPATCH_NONE);
}

} // namespace

TEST(ControlsGolden, EveryControlInEveryState) {
    qortest::CWorld world{480, 300};
    lua_machine().DoFile(qorbase::FILE_CATEGORY_UI, "ui_material_presets.lua");
    CDesktop &desktop = world.desktop();
    struct {
        char const *m_preset;
        HUID const *m_normal, *m_highlighted, *m_pushed;
    } const arrows[] = {
        {"arrow_up", &MAT_NAME_BUTTON_UP, &MAT_NAME_BUTTON_UP_HIGHLIGHTED, &MAT_NAME_BUTTON_UP_PUSHED},
        {"arrow_down", &MAT_NAME_BUTTON_DOWN, &MAT_NAME_BUTTON_DOWN_HIGHLIGHTED,
         &MAT_NAME_BUTTON_DOWN_PUSHED},
        {"scroller", &MAT_NAME_BUTTON_SCROLLER, &MAT_NAME_BUTTON_SCROLLER_HIGHLIGHTED,
         &MAT_NAME_BUTTON_SCROLLER_PUSHED},
    };
    for (auto const &arrow : arrows)
        dress(&desktop, &desktop, arrow.m_preset,
              {{arrow.m_normal, ""}, {arrow.m_highlighted, "_highlighted"}, {arrow.m_pushed, "_pushed"}});
    // Buttons: normal, highlighted, pushed under the pointer, checked, disabled.
    char const *const button_states[] = {"Normal", "Over", "Pushed", "Checked", "Disabled"};
    for (int i = 0; i < 5; ++i) {
        CButton *p_button =
            world.place(&desktop, new CButton(&desktop, button_states[i]), 8 + i * 94, 8, 86, 28);
        dress(&desktop, p_button, "button_",
              {{&MAT_NAME_NORMAL, "normal"},
               {&MAT_NAME_HIGHLIGHTED, "highlighted"},
               {&MAT_NAME_PUSHED, "pushed"},
               {&MAT_NAME_CHECKED, "checked"},
               {&MAT_NAME_DISABLED, "disabled"}});
        p_button->m_text = CString(button_states[i]);
        if (i == 1 || i == 2) send(p_button, EVENT_POINTER_ENTER);
        if (i == 2) send(p_button, EVENT_POINTER_DOWN);
        p_button->set_checked(i == 3);
        if (i == 4) send(p_button, EVENT_DISABLE);
    }
    // Check boxes and radio buttons: off, on, off disabled, on disabled, under the pointer.
    for (int row = 0; row < 2; ++row) {
        for (int i = 0; i < 5; ++i) {
            CCheckBox *p_box =
                row == 0 ? new CCheckBox(&desktop, "box") : new CRadioButton(&desktop, "radio");
            world.place(&desktop, p_box, 8 + i * 94, 44 + row * 24, 86, 20);
            dress(&desktop, p_box, row == 0 ? "checker_" : "radio_",
                  {{&MAT_NAME_CHECKER_ON, "on"},
                   {&MAT_NAME_CHECKER_OFF, "off"},
                   {&MAT_NAME_CHECKER_ON_DISABLED, "on_disabled"},
                   {&MAT_NAME_CHECKER_OFF_DISABLED, "off_disabled"},
                   {&MAT_NAME_HIGHLIGHTED, "highlighted"}});
            p_box->m_text = CString(i == 4 ? "Over" : i % 2 ? "On" : "Off");
            p_box->set_checked(i == 1 || i == 3);
            if (i == 2 || i == 3) send(p_box, EVENT_DISABLE);
            if (i == 4) send(p_box, EVENT_POINTER_ENTER);
        }
    }
    // A row of static texts on a text field (left, centre, right), of progress bars (0, 50, 100) and
    // of horizontal scroll bars (start, middle, end).
    for (int i = 0; i < 3; ++i) {
        EAlignment const alignments[] = {ALIGNMENT_LEFT, ALIGNMENT_CENTER, ALIGNMENT_RIGHT};
        CStaticText *p_text =
            desktop.make_static_text(CString("Aligned text"), CRectArea(8 + i * 156, 96, 148, 22), "text");
        dress(&desktop, p_text, "", {{&MAT_NAME_NORMAL, "text_field"}});
        p_text->set_uniform_margins(3);
        p_text->set_text_alignment(alignments[i]);
    }
    for (int i = 0; i < 3; ++i) {
        CProgressBar *p_bar =
            world.place(&desktop, new CProgressBar(&desktop, "progress"), 8 + i * 156, 126, 148, 12);
        dress(&desktop, p_bar, "", {{&MAT_NAME_NORMAL, "bar_track"}, {&MAT_NAME_PROGRESS, "progress"}});
        p_bar->set_position(50.0f * i);
    }
    for (int i = 0; i < 3; ++i) {
        CScrollBar *p_bar =
            world.place(&desktop, new CScrollBar(&desktop, "h bar"), 8 + i * 156, 146, 148, 16);
        dress(&desktop, p_bar, "", {{&MAT_NAME_NORMAL, "bar_track"}});
        size_parts(p_bar, 30, 16);
        p_bar->set_position(50.0f * i);
    }
    // A vertical scroll bar at a quarter.
    CScrollBar *p_vertical = world.place(&desktop, new CScrollBar(&desktop, "v bar"), 456, 170, 16, 120);
    p_vertical->set_horizontal(false);
    dress(&desktop, p_vertical, "", {{&MAT_NAME_NORMAL, "bar_track"}});
    size_parts(p_vertical, 16, 30);
    p_vertical->set_position(25.0f);
    // An edit box, active, with more lines than it shows: its bar at the end, the caret blinking on.
    CEditBox *p_edit = world.place(&desktop, new CEditBox(&desktop, "edit"), 8, 170, 300, 120);
    dress(&desktop, p_edit, "", {{&MAT_NAME_NORMAL, "text_field"}});
    p_edit->set_uniform_margins(4);
    p_edit->set_scrollable_v(true);
    p_edit->get_scroll_bar_vert()->set_w(16);
    size_parts(p_edit->get_scroll_bar_vert(), 16, 30);
    world.click_at(100, 200);
    world.type("First line of the box");
    for (int line = 2; line <= 8; ++line) {
        world.key(13);
        world.type(("Line " + std::to_string(line)).c_str());
    }
    world.move_to(470, 10);         // off every control but the desktop
    world.clock().advance_ms(1000); // every fade has ended
    world.frame();
    world.expect_golden("controls_every_state");
}
