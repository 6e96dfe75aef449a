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
#include "ui_string.h"
#include "ui_value_bar.h"

#include <gtest/gtest.h>

#include <string>

using namespace qorui;

namespace {

class ControlsGoldenTest : public ::testing::Test {
protected:
    void SetUp() override { lua_machine().DoFile(qorbase::FILE_CATEGORY_UI, "ui_material_presets.lua"); }

    CMaterial *preset(char const *_name) {
        CMaterial *p_material = desktop().create_material();
        LuaPlus::LuaObject table;
        table.AssignNewTable(&lua_machine());
        table.SetString("material_preset", _name);
        p_material->load_state(table);
        return p_material;
    }
    void dress(CWindowVisual *_p_wnd, std::initializer_list<std::pair<HUID, char const *>> _looks) {
        for (auto const &look : _looks)
            _p_wnd->add_material(look.first, preset(look.second));
    }
    CDesktop &desktop() { return m_world.desktop(); }
    void send(CWindow *_p_wnd, EEventType _id) { _p_wnd->send_event(_p_wnd, _id, CWndEvent::DISPATCH_NONE); }

    qortest::CWorld m_world{480, 300};
};

} // namespace

TEST_F(ControlsGoldenTest, EveryControlInEveryState) {
    dress(&desktop(), {{MAT_NAME_BUTTON_UP, "arrow_up"},
                       {MAT_NAME_BUTTON_UP_HIGHLIGHTED, "arrow_up_highlighted"},
                       {MAT_NAME_BUTTON_UP_PUSHED, "arrow_up_pushed"},
                       {MAT_NAME_BUTTON_DOWN, "arrow_down"},
                       {MAT_NAME_BUTTON_DOWN_HIGHLIGHTED, "arrow_down_highlighted"},
                       {MAT_NAME_BUTTON_DOWN_PUSHED, "arrow_down_pushed"},
                       {MAT_NAME_BUTTON_SCROLLER, "scroller"},
                       {MAT_NAME_BUTTON_SCROLLER_HIGHLIGHTED, "scroller_highlighted"},
                       {MAT_NAME_BUTTON_SCROLLER_PUSHED, "scroller_pushed"}});

    // Buttons: normal, highlighted, pushed under the pointer, checked, disabled.
    char const *const button_states[] = {"Normal", "Over", "Pushed", "Checked", "Disabled"};
    for (int i = 0; i < 5; ++i) {
        CButton *p_button =
            m_world.place(&desktop(), new CButton(&desktop(), button_states[i]), 8 + i * 94, 8, 86, 28);
        dress(p_button, {{MAT_NAME_NORMAL, "button_normal"},
                         {MAT_NAME_HIGHLIGHTED, "button_highlighted"},
                         {MAT_NAME_PUSHED, "button_pushed"},
                         {MAT_NAME_CHECKED, "button_checked"},
                         {MAT_NAME_DISABLED, "button_disabled"}});
        p_button->m_text = CString(button_states[i]);
        if (i == 1 || i == 2) send(p_button, EVENT_POINTER_ENTER);
        if (i == 2) send(p_button, EVENT_POINTER_DOWN);
        if (i == 3) p_button->set_checked(true);
        if (i == 4) send(p_button, EVENT_DISABLE);
    }

    // Check boxes and radio buttons: off, on, off disabled, on disabled, under the pointer.
    char const *const sets[] = {"checker", "radio"};
    for (int row = 0; row < 2; ++row) {
        for (int i = 0; i < 5; ++i) {
            std::string const name = std::string(sets[row]) + std::to_string(i);
            CCheckBox *p_box = row == 0 ? new CCheckBox(&desktop(), name.c_str())
                                        : new CRadioButton(&desktop(), name.c_str());
            m_world.place(&desktop(), p_box, 8 + i * 94, 44 + row * 24, 86, 20);
            std::string const set = sets[row];
            dress(p_box, {{MAT_NAME_CHECKER_ON, (set + "_on").c_str()},
                          {MAT_NAME_CHECKER_OFF, (set + "_off").c_str()},
                          {MAT_NAME_CHECKER_ON_DISABLED, (set + "_on_disabled").c_str()},
                          {MAT_NAME_CHECKER_OFF_DISABLED, (set + "_off_disabled").c_str()},
                          {MAT_NAME_HIGHLIGHTED, (set + "_highlighted").c_str()}});
            p_box->m_text = CString(i == 4 ? "Over" : i % 2 ? "On" : "Off");
            p_box->set_checked(i == 1 || i == 3);
            if (i == 2 || i == 3) send(p_box, EVENT_DISABLE);
            if (i == 4) send(p_box, EVENT_POINTER_ENTER);
        }
    }

    // Static texts on a text field: left, centre, right.
    EAlignment const alignments[] = {ALIGNMENT_LEFT, ALIGNMENT_CENTER, ALIGNMENT_RIGHT};
    for (int i = 0; i < 3; ++i) {
        CStaticText *p_text =
            desktop().make_static_text(CString("Aligned text"), CRectArea(8 + i * 156, 96, 148, 22),
                                       ("text " + std::to_string(i)).c_str());
        p_text->add_material(MAT_NAME_NORMAL, preset("text_field"));
        p_text->set_uniform_margins(3);
        p_text->set_text_alignment(alignments[i]);
    }

    // Progress bars at 0, 50 and 100.
    for (int i = 0; i < 3; ++i) {
        CProgressBar *p_bar =
            m_world.place(&desktop(), new CProgressBar(&desktop(), ("progress " + std::to_string(i)).c_str()),
                          8 + i * 156, 126, 148, 12);
        dress(p_bar, {{MAT_NAME_NORMAL, "bar_track"}, {MAT_NAME_PROGRESS, "progress"}});
        p_bar->set_position(50.0f * i);
    }

    // Horizontal scroll bars at the start, the middle and the end; a vertical one at a quarter.
    for (int i = 0; i < 3; ++i) {
        CScrollBar *p_bar =
            m_world.place(&desktop(), new CScrollBar(&desktop(), ("h bar " + std::to_string(i)).c_str()),
                          8 + i * 156, 146, 148, 16);
        p_bar->add_material(MAT_NAME_NORMAL, preset("bar_track"));
        for (CButton *p_button : {p_bar->get_button_min(), p_bar->get_button_max()})
            p_button->set_size(16, 16);
        p_bar->get_button_scroller()->set_size(30, 16);
        p_bar->set_scroller_for_position(); // the parts were sized after the bar's last layout
        p_bar->set_position(50.0f * i);
    }
    CScrollBar *p_vertical =
        m_world.place(&desktop(), new CScrollBar(&desktop(), "v bar"), 456, 170, 16, 120);
    p_vertical->set_horizontal(false);
    p_vertical->add_material(MAT_NAME_NORMAL, preset("bar_track"));
    for (CButton *p_button : {p_vertical->get_button_min(), p_vertical->get_button_max()})
        p_button->set_size(16, 16);
    p_vertical->get_button_scroller()->set_size(16, 30);
    p_vertical->set_position(25.0f);

    // An edit box, active, with more lines than it shows: its bar at the end, the caret blinking on.
    CEditBox *p_edit = m_world.place(&desktop(), new CEditBox(&desktop(), "edit"), 8, 170, 300, 120);
    p_edit->add_material(MAT_NAME_NORMAL, preset("text_field"));
    p_edit->set_uniform_margins(4);
    p_edit->set_scrollable_v(true);
    CScrollBar *p_edit_bar = p_edit->get_scroll_bar_vert();
    p_edit_bar->set_w(16);
    for (CButton *p_button : {p_edit_bar->get_button_min(), p_edit_bar->get_button_max()})
        p_button->set_size(16, 16);
    p_edit_bar->get_button_scroller()->set_size(16, 30);
    m_world.click_at(100, 200);
    m_world.type("First line of the box");
    for (int line = 2; line <= 8; ++line) {
        m_world.key(13);
        m_world.type(("Line " + std::to_string(line)).c_str());
    }
    m_world.move_to(470, 10); // off every control but the desktop

    m_world.clock().advance_ms(1000); // every fade has ended
    m_world.frame();
    m_world.expect_golden("controls_every_state");
}
