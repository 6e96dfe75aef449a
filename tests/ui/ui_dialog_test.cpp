// Dialogs driven by the pointer: borders, the buttons' and the caption's places, the list dialog,
// contract checks, the layout keys and the picture.
#include "ui_dialog.h"

#include "test_common.h"
#include "test_world.h"
#include "ui_button.h"
#include "ui_font.h"
#include "ui_list_box.h"
#include "ui_material.h"

#include <gtest/gtest.h>

using namespace qorui;
using qortest::place_text;

namespace {

class DialogTest : public ::testing::Test {
protected:
    void SetUp() override { m_world.clock().advance_ms(150); } // the desktop has faded in

    CDesktop &desktop() { return m_world.desktop(); }
    template <class TDialog = CDialog>
    TDialog *make(int _x, int _y, int _w, int _h, char const *_name = "dialog") {
        return m_world.place(&desktop(), new TDialog(&desktop(), _name), _x, _y, _w, _h);
    }

    qortest::CWorld m_world{400, 300};
};

} // namespace

// The block stands on the bottom margin, centred across the dialog with each half truncated by
// itself (300 / 2 - 259 / 2 is 21, not 20).
TEST_F(DialogTest, ButtonsAreLaidOutInARowOrAColumnAtTheFoot) {
    struct {
        bool m_horizontal;
        int m_w;
        std::vector<std::string> m_buttons;
    } const rows[] = {
        {true, 300, {}},
        {true, 300, {"21,163 81x30", "110,163 81x30", "199,163 81x30"}},
        {true, 100, {"-79,163 81x30", "10,163 81x30", "99,163 81x30"}},
        {false, 300, {"110,87 81x30", "110,125 81x30", "110,163 81x30"}},
        {false, 301, {"110,163 81x30"}},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(testing::Message() << row.m_horizontal << " " << row.m_w << " " << row.m_buttons.size());
        CDialog *p_dialog = make(10, 20, row.m_w, 200);
        p_dialog->set_bottom_margin(7);
        p_dialog->set_button_size(81, 30);
        p_dialog->set_buttons_horizontal(row.m_horizontal);
        for (size_t i = 0; i < row.m_buttons.size(); ++i)
            p_dialog->add_button(CString("B"));
        std::vector<std::string> places;
        for (unsigned i = 0; i < p_dialog->get_buttons_count(); ++i)
            places.push_back(place_text(p_dialog->get_button(i)));
        EXPECT_EQ(row.m_buttons, places);
        delete p_dialog;
    }
}

// A dialog of 200 by 120 at (60, 40), limited to 150..215 by 100..132, dragged by a border: its edge
// moves, and a second one within 2 * 8 pixels of an end; the left and top edges keep the opposite
// edge in place.
TEST_F(DialogTest, DraggingABorderResizesTheDialogByItsEdgeOrCornerWithinItsLimits) {
    struct {
        char const *m_case;
        int m_x, m_y, m_dx, m_dy;
        char const *m_dialog;
    } const rows[] = {
        {"right", 255, 100, 20, 10, "60,40 215x120"},
        {"left", 63, 100, -10, 5, "50,40 210x120"},
        {"top", 160, 43, 7, -10, "60,30 200x130"},
        {"bottom", 160, 155, 0, 15, "60,40 200x132"},
        {"left near its top end", 63, 52, -10, -10, "50,30 210x130"},
        {"bottom near its right end", 248, 155, 10, 10, "60,40 210x130"},
        {"right near its bottom end", 255, 150, 4, 6, "60,40 204x126"},
        {"top at 16 from its left end", 76, 43, -5, -5, "55,35 205x125"},
        {"top at 17 from its left end", 77, 43, -5, -5, "60,35 200x125"},
        {"left at 16 from its bottom end", 63, 144, -5, 5, "55,40 205x125"},
        {"left at 17 from its bottom end", 63, 143, -5, 5, "55,40 205x120"},
        {"left past the minimum width", 63, 100, 80, 0, "110,40 150x120"},
        {"top past the minimum height", 160, 43, 0, 50, "60,60 200x100"},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_case);
        CDialog *p_dialog = make(60, 40, 200, 120);
        p_dialog->set_constraints(SConstraints{150, 215, 100, 132});
        m_world.move_to(row.m_x, row.m_y);
        m_world.press();
        m_world.move_to(row.m_x, row.m_y); // starts the drag
        m_world.move_to(row.m_x + row.m_dx, row.m_y + row.m_dy);
        m_world.release();
        EXPECT_EQ(row.m_dialog, place_text(p_dialog));
        delete p_dialog;
    }
}

// Right-aligned, the caption ends at the client area's right edge; its y halves the sum of the
// client top and the strip's height: (10 + 25) / 2, not 10 + 25 / 2.
TEST_F(DialogTest, TheCaptionStandsByItsAlignmentInTheClientArea) {
    CFont *p_font = desktop().get_font(FNT_NAME_DEFAULT);
    CDialog *p_dialog = make(10, 20, 300, 200);
    p_dialog->set_caption(CString("Options"));
    p_dialog->set_left_margin(6);
    p_dialog->set_right_margin(4);
    p_dialog->set_top_margin(10);
    p_dialog->set_caption_h(25);
    p_dialog->set_caption_alignment(ALIGNMENT_RIGHT);
    m_world.frame();
    CCanvas &canvas = p_dialog->get_canvas();
    std::vector<CRectArea> const glyphs = m_world.glyphs(p_font);
    ASSERT_EQ(7u, glyphs.size());
    EXPECT_EQ(16 - canvas.get_text_width(p_dialog->get_caption(), p_font, -1) + 290, glyphs[0].x);
    EXPECT_EQ(20 + 17 - canvas.get_text_height(p_font) / 2, glyphs[0].y);
}

// The list box's room leaves one row of buttons below it.
TEST_F(DialogTest, TheListBoxFillsTheRoomBetweenCaptionAndButtons) {
    CListDialog *p_dialog = make<CListDialog>(0, 0, 300, 200);
    p_dialog->set_uniform_margins(5);
    p_dialog->set_buttons_list_box_interval(10);
    p_dialog->add_button(CString("OK"));
    ASSERT_EQ(p_dialog->get_list_box(), p_dialog->get_child("list box", "ListBox", true));
    EXPECT_EQ("5,29 290x124", place_text(p_dialog->get_list_box())); // 200 - 10 - 32 - 5 - 5 - 24
}

// Each broken contract is reported and the code steps aside; the default button is clicked only
// once there is one.
TEST_F(DialogTest, BrokenContractsAreReportedAndTheDefaultButtonNeedsOne) {
    CDialog *p_dialog = make(0, 0, 300, 200);
    CButton *p_ok = p_dialog->add_button(CString("OK"));
    std::vector<std::string> events;
    qortest::log_events(p_ok, {EVENT_CLICK}, events);
    p_dialog->on_default_button_click();
    p_dialog->set_default_button(p_ok);
    p_dialog->on_default_button_click();
    EXPECT_EQ((std::vector<std::string>{"EVENT_CLICK"}), events);
    qortest::CReportCapture capture;
    CBorder *p_alone = new CBorder(&desktop(), "alone");
    p_alone->on_attached();
    delete p_alone;
    CWindow *p_border = p_dialog->get_child("border top", "Border", true);
    p_dialog->detach_child(p_border);
    p_dialog->attach_child(p_border);
    p_dialog->set_default_button(nullptr);
    desktop().add_font(FNT_NAME_DEFAULT, nullptr);
    m_world.frame();
    std::vector<std::string> expressions;
    for (std::string const &text : capture.asserts())
        expressions.push_back(text.substr(14, text.find(", \nFile: ") - 14));
    EXPECT_EQ((std::vector<std::string>{"mp_parent", "!\"CBorder::on_detached()\"", "_p_button", "p_font"}),
              expressions);
    EXPECT_EQ(p_ok, p_dialog->get_default_button());
}

namespace {

// A saved value as text: numbers as %g, booleans as true and false, "nil" for none.
std::string saved_text(CWindow *_p_wnd, char const *_key) {
    LuaPlus::LuaObject const value = qortest::saved_state(_p_wnd).GetByName(_key);
    if (value.IsNumber()) return (testing::Message() << value.GetNumber()).GetString();
    if (value.IsBoolean()) return value.GetBoolean() ? "true" : "false";
    return value.IsString() ? value.GetString() : "nil";
}

} // namespace

// Each key loaded with a value of the wrong type, which leaves the default quietly, then with a
// good one, which the next save writes back. A message box, modal, keeps its message's first line;
// a border of no single edge nor of all of them writes no type.
TEST_F(DialogTest, LayoutKeysLoadOnlyValuesOfTheirTypeAndSaveBack) {
    struct {
        char const *m_class, *m_key, *m_bad, *m_good, *m_default, *m_saved;
    } const rows[] = {
        {"Dialog", "caption_alignment", "'RIGHT'", "'ALIGNMENT_RIGHT'", "ALIGNMENT_LEFT", "ALIGNMENT_RIGHT"},
        {"Dialog", "caption_h", "'30'", "30.7", "24", "30"},
        {"Dialog", "buttons_horizontal", "0", "false", "true", "false"},
        {"Dialog", "button_w", "true", "90.9", "128", "90"},
        {"Dialog", "button_h", "{}", "20", "32", "20"},
        {"Dialog", "buttons_interval", "'x'", "-3.5", "8", "-3"},
        {"Dialog", "caption", "true", "'Hello'", "", "Hello"},
        {"Dialog", "can_drag", "'no'", "false", "true", "false"},
        {"Border", "border_size", "'5'", "5.9", "8", "5"},
        {"Border", "type", "'TOP'", "'BORDERS_ALL'", "BORDER_LEFT", "BORDERS_ALL"},
        {"MessageBox", "message_text", "true", "'First'", "nil", "First"},
        {"ListDialog", "caption_h", "false", "12", "24", "12"},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(testing::Message() << row.m_class << " " << row.m_key);
        CWindow *p_wnd = get_windows_factory().Create(HUID(row.m_class), &desktop(), "w");
        ASSERT_TRUE(p_wnd);
        desktop().attach_child(p_wnd);
        std::string const head =
            std::string("{ name = 'w', class_name = '") + row.m_class + "', " + row.m_key;
        qortest::CReportCapture capture;
        qortest::load_state(p_wnd, head + " = " + row.m_bad + " }");
        EXPECT_EQ(row.m_default, saved_text(p_wnd, row.m_key));
        qortest::load_state(p_wnd, head + " = " + row.m_good + " }");
        EXPECT_EQ(row.m_saved, saved_text(p_wnd, row.m_key));
        EXPECT_TRUE(capture.reports().empty());
        delete p_wnd;
    }
    CMessageBox *p_box = make<CMessageBox>(0, 0, 200, 100, "box");
    EXPECT_TRUE(p_box->is_modal());
    p_box->set_message_text(CString("One\nTwo\nThree"));
    EXPECT_EQ("One", saved_text(p_box, "message_text"));
    CBorder *p_border = m_world.place(p_box, new CBorder(&desktop(), "b"), 0, 0, 5, 5);
    p_border->set_border_type(static_cast<EBorderType>(BORDER_LEFT | BORDER_TOP));
    EXPECT_EQ("nil", saved_text(p_border, "type"));
}

// A dialog with its borders made visible and two buttons in a row, and a message box of two lines
// with its caption centred, as the software renderer draws them.
TEST(DialogGoldenTest, ADialogAndAMessageBox) {
    qortest::CWorld world(480, 220);
    world.clock().advance_ms(150);
    CDesktop &desktop = world.desktop();
    CDialog *p_dialog = world.place(&desktop, new CDialog(&desktop, "dialog"), 10, 10, 220, 200);
    p_dialog->add_material(MAT_NAME_NORMAL, world.colour(40, 48, 66));
    p_dialog->set_uniform_margins(8);
    p_dialog->set_caption(CString("Settings"));
    p_dialog->set_button_size(90, 26);
    for (char const *p_border : {"border left", "border right", "border top", "border bottom"})
        class_cast<CWindowVisual>(p_dialog->get_child(p_border, "Border", true))
            ->add_material(MAT_NAME_NORMAL, world.colour(90, 70, 150));
    p_dialog->add_button(CString("OK"));
    p_dialog->add_button(CString("Cancel"));

    CMessageBox *p_box = world.place(&desktop, new CMessageBox(&desktop, "box"), 250, 40, 220, 140);
    p_box->add_material(MAT_NAME_NORMAL, world.colour(60, 36, 40));
    p_box->set_uniform_margins(8);
    p_box->set_caption(CString("Question"));
    p_box->set_caption_alignment(ALIGNMENT_CENTER);
    p_box->set_message_text(CString("Save the changes?\nYour work is kept."));
    p_box->set_button_size(80, 24);
    p_box->add_button(CString("Yes"));
    p_box->add_button(CString("No"));
    world.frame();
    world.expect_golden("dialog_and_message_box");
}
