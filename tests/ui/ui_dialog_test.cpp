// Dialogs in the test world, driven by the pointer: borders that resize their parent by each edge
// and corner, the corner rule, the buttons' layout in a row and a column, the caption's place,
// the list dialog's list box, a modal message box, contract checks, and the layout keys.
#include "ui_dialog.h"

#include "test_common.h"
#include "test_world.h"
#include "ui_button.h"
#include "ui_font.h"
#include "ui_list_box.h"
#include "ui_material.h"

#include <gtest/gtest.h>

#include <functional>

using namespace qorui;

namespace {

struct SRect {
    int x, y, w, h;
    bool operator==(SRect const &_o) const { return x == _o.x && y == _o.y && w == _o.w && h == _o.h; }
};
std::ostream &operator<<(std::ostream &_out, SRect const &_r) {
    return _out << _r.x << "," << _r.y << " " << _r.w << "x" << _r.h;
}
SRect rect_of(CWindow *_p_wnd) {
    return SRect{_p_wnd->get_pos().x, _p_wnd->get_pos().y, _p_wnd->get_w(), _p_wnd->get_h()};
}

class DialogTest : public ::testing::Test {
protected:
    void SetUp() override { m_world.clock().advance_ms(150); } // the desktop has faded in

    CDesktop &desktop() { return m_world.desktop(); }
    CFont *font() { return desktop().get_font(FNT_NAME_DEFAULT); }
    template <class TDialog = CDialog>
    TDialog *make(int _x, int _y, int _w, int _h, char const *_name = "dialog") {
        return m_world.place(&desktop(), new TDialog(&desktop(), _name), _x, _y, _w, _h);
    }
    // A press at _from, a first movement that starts the drag, then the drag's own movement.
    void drag(int _x, int _y, int _dx, int _dy) {
        m_world.move_to(_x, _y);
        m_world.press();
        m_world.move_to(_x, _y);
        m_world.move_to(_x + _dx, _y + _dy);
        m_world.release();
    }

    qortest::CWorld m_world{400, 300};
};

} // namespace

// The block of buttons stands on the bottom margin, centred across the whole dialog, each half of
// the centring truncated by itself (300 / 2 - 259 / 2 is 21, not 20).
TEST_F(DialogTest, ButtonsAreLaidOutInARowOrAColumnAtTheFoot) {
    struct {
        char const *m_case;
        bool m_horizontal;
        int m_count, m_w;
        std::vector<SRect> m_buttons;
    } const rows[] = {
        {"no buttons", true, 0, 300, {}},
        {"one in a row", true, 1, 300, {{110, 163, 81, 30}}},
        {"three in a row", true, 3, 300, {{21, 163, 81, 30}, {110, 163, 81, 30}, {199, 163, 81, 30}}},
        {"three wider than the dialog",
         true,
         3,
         100,
         {{-79, 163, 81, 30}, {10, 163, 81, 30}, {99, 163, 81, 30}}},
        {"three in a column", false, 3, 300, {{110, 87, 81, 30}, {110, 125, 81, 30}, {110, 163, 81, 30}}},
        {"one in a column", false, 1, 301, {{110, 163, 81, 30}}},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_case);
        CDialog *p_dialog = make(10, 20, row.m_w, 200);
        p_dialog->set_bottom_margin(7);
        p_dialog->set_button_size(81, 30);
        p_dialog->set_buttons_horizontal(row.m_horizontal);
        for (int i = 0; i < row.m_count; ++i)
            p_dialog->add_button(CString("B"));
        ASSERT_EQ(row.m_buttons.size(), p_dialog->get_buttons_count());
        for (unsigned i = 0; i < p_dialog->get_buttons_count(); ++i) {
            EXPECT_EQ(row.m_buttons[i], rect_of(p_dialog->get_button(i))) << i;
            EXPECT_EQ(p_dialog, p_dialog->get_button(i)->get_parent());
        }
        delete p_dialog;
    }
}

// A dialog of 200 by 120 at (60, 40) between 150 and 215 wide and 100 and 132 high, grabbed by a
// border and dragged: the border's edge moves, and a second one when the grab is near an end of the
// border; the left and top edges keep the opposite edge where it was, and the borders follow.
TEST_F(DialogTest, DraggingABorderResizesTheDialogByItsEdgeOrCornerWithinItsLimits) {
    struct {
        char const *m_case;
        int m_x, m_y, m_dx, m_dy;
        SRect m_dialog;
    } const rows[] = {
        {"right", 255, 100, 20, 10, {60, 40, 215, 120}},
        {"left", 63, 100, -10, 5, {50, 40, 210, 120}},
        {"top", 160, 43, 7, -10, {60, 30, 200, 130}},
        {"bottom", 160, 155, 0, 15, {60, 40, 200, 132}},
        {"left grabbed near its top end", 63, 52, -10, -10, {50, 30, 210, 130}},
        {"top grabbed near its left end", 75, 43, -5, -5, {55, 35, 205, 125}},
        {"bottom grabbed near its right end", 248, 155, 10, 10, {60, 40, 210, 130}},
        {"right grabbed near its bottom end", 255, 150, 4, 6, {60, 40, 204, 126}},
        // The corner reaches 2 * 8 pixels from each end, the limit included.
        {"top at 16 from its left end", 60 + 16, 43, -5, -5, {55, 35, 205, 125}},
        {"top at 17 from its left end", 60 + 17, 43, -5, -5, {60, 35, 200, 125}},
        {"top at 16 from its right end", 60 + 184, 43, 5, -5, {60, 35, 205, 125}},
        {"top at 17 from its right end", 60 + 183, 43, 5, -5, {60, 35, 200, 125}},
        {"left at 16 from its top end", 63, 40 + 16, -5, -5, {55, 35, 205, 125}},
        {"left at 17 from its top end", 63, 40 + 17, -5, -5, {55, 40, 205, 120}},
        {"left at 16 from its bottom end", 63, 40 + 104, -5, 5, {55, 40, 205, 125}},
        {"left at 17 from its bottom end", 63, 40 + 103, -5, 5, {55, 40, 205, 120}},
        {"left past the minimum width", 63, 100, 80, 0, {110, 40, 150, 120}},
        {"top past the minimum height", 160, 43, 0, 50, {60, 60, 200, 100}},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_case);
        CDialog *p_dialog = make(60, 40, 200, 120);
        p_dialog->set_constraints(SConstraints{150, 215, 100, 132});
        drag(row.m_x, row.m_y, row.m_dx, row.m_dy);
        EXPECT_EQ(row.m_dialog, rect_of(p_dialog));
        SRect const &d = row.m_dialog;
        EXPECT_EQ((SRect{d.w - 8, 0, 8, d.h}), rect_of(p_dialog->get_child("border right", "Border", true)));
        EXPECT_EQ((SRect{0, d.h - 8, d.w, 8}), rect_of(p_dialog->get_child("border bottom", "Border", true)));
        delete p_dialog;
    }
}

// Each border lies along its edge of the resized parent; one of all edges stays where it was.
TEST_F(DialogTest, ABorderFollowsItsEdgeOfTheParentExceptOneOfAllEdges) {
    struct {
        EBorderType m_type;
        SRect m_border;
    } const rows[] = {
        {BORDER_LEFT, {0, 0, 6, 90}},     {BORDER_RIGHT, {144, 0, 6, 90}}, {BORDER_TOP, {0, 0, 150, 6}},
        {BORDER_BOTTOM, {0, 84, 150, 6}}, {BORDERS_ALL, {5, 5, 10, 10}},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_type);
        CWindowVisual *p_parent = m_world.place(&desktop(), new CWindowVisual(&desktop(), "p"), 0, 0, 50, 50);
        CBorder *p_border = m_world.place(p_parent, new CBorder(&desktop(), "b"), 5, 5, 10, 10);
        p_border->set_border_type(row.m_type);
        p_border->set_border_size(6);
        EXPECT_TRUE(p_border->is_passive());
        p_parent->set_size(150, 90);
        EXPECT_EQ(row.m_border, rect_of(p_border));
        delete p_parent;
    }
}

// The caption's y halves the sum of the client top and the strip's height: (10 + 25) / 2, not
// 10 + 25 / 2.
TEST_F(DialogTest, TheCaptionStandsByItsAlignmentInTheClientArea) {
    CDialog *p_dialog = make(10, 20, 300, 200);
    p_dialog->set_caption(CString("Options"));
    p_dialog->set_left_margin(6);
    p_dialog->set_right_margin(4);
    p_dialog->set_top_margin(10);
    p_dialog->set_caption_h(25);
    CCanvas &canvas = p_dialog->get_canvas();
    int const text_w = canvas.get_text_width(p_dialog->get_caption(), font(), -1);
    struct {
        EAlignment m_alignment;
        int m_x;
    } const rows[] = {
        {ALIGNMENT_LEFT, 10 + 6},
        {ALIGNMENT_RIGHT, 10 + 6 - text_w + 290},
        {ALIGNMENT_CENTER, 10 + 290 / 2 - text_w / 2 + 6},
        {ALIGNMENT_TOP, 10 + 6},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_alignment);
        p_dialog->set_caption_alignment(row.m_alignment);
        m_world.frame();
        std::vector<CRectArea> const glyphs = m_world.glyphs(font());
        ASSERT_EQ(7u, glyphs.size());
        EXPECT_EQ(row.m_x, glyphs[0].x);
        EXPECT_EQ(20 + 17 - canvas.get_text_height(font()) / 2, glyphs[0].y);
    }
}

// The list box's room leaves one row of buttons below it, also when they stand in a column.
TEST_F(DialogTest, TheListBoxFillsTheRoomBetweenCaptionAndButtons) {
    for (bool horizontal : {true, false}) {
        SCOPED_TRACE(horizontal);
        CListDialog *p_dialog = make<CListDialog>(0, 0, 300, 200);
        p_dialog->set_uniform_margins(5);
        p_dialog->set_buttons_list_box_interval(10);
        p_dialog->set_buttons_horizontal(horizontal);
        p_dialog->add_button(CString("OK"));
        p_dialog->add_button(CString("Cancel"));
        CListBox *p_list = p_dialog->get_list_box();
        ASSERT_EQ(p_list, p_dialog->get_child("list box", "ListBox", true));
        EXPECT_EQ((SRect{5, 5 + 24, 290, 200 - 10 - 32 - 5 - 5 - 24}), rect_of(p_list));
        delete p_dialog;
    }
}

// The owner closes the box from its buttons' clicks; until then nothing outside it takes input.
TEST_F(DialogTest, AModalMessageBoxKeepsOutInputUntilOneOfItsButtonsClosesIt) {
    CButton *p_behind = m_world.place(&desktop(), new CButton(&desktop(), "behind"), 10, 10, 60, 30);
    std::vector<std::string> behind_events;
    qortest::log_events(p_behind, {EVENT_CLICK}, behind_events);
    CMessageBox *p_box = make<CMessageBox>(100, 80, 200, 120, "question");
    EXPECT_TRUE(p_box->is_modal());
    EXPECT_TRUE(p_box->is_always_on_top());
    p_box->set_message_text(CString("Quit?"));
    p_box->set_button_size(80, 24);
    std::string result;
    for (char const *p_caption : {"Yes", "No"})
        p_box->add_button(CString(p_caption))
            ->register_callback(EVENT_CLICK, CEventCallback([&result, p_caption, p_box](CWndEvent const *) {
                                    result = p_caption;
                                    p_box->send_event(p_box, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
                                }));
    desktop().set_active_window(p_box);

    m_world.click_at(20, 20);
    m_world.click_at(150, 120); // the box's background
    EXPECT_EQ(p_box, desktop().get_active_window());
    EXPECT_TRUE(behind_events.empty());
    EXPECT_EQ("", result);
    m_world.click_at(100 + 104 + 40, 80 + 96 + 12); // "No" at (104, 96) in the box
    EXPECT_EQ("No", result);
    EXPECT_TRUE(p_box->is_hidden());
    m_world.click_at(20, 20);
    EXPECT_EQ((std::vector<std::string>{"EVENT_CLICK"}), behind_events);
}

TEST_F(DialogTest, TheDefaultButtonIsClickedOnlyWhenThereIsOne) {
    CDialog *p_dialog = make(0, 0, 300, 200);
    CButton *p_ok = p_dialog->add_button(CString("OK"));
    std::vector<std::string> events;
    qortest::log_events(p_ok, {EVENT_CLICK}, events);
    p_dialog->on_default_button_click();
    EXPECT_TRUE(events.empty());
    p_dialog->set_default_button(p_ok);
    p_dialog->on_default_button_click();
    EXPECT_EQ((std::vector<std::string>{"EVENT_CLICK"}), events);
}

// Each broken contract is reported, and the code steps aside.
TEST_F(DialogTest, BrokenContractsAreReported) {
    CDialog *p_dialog = make(0, 0, 300, 200);
    CButton *p_ok = p_dialog->add_button(CString("OK"));
    p_dialog->set_default_button(p_ok);
    struct {
        char const *m_expression;
        std::function<void()> m_act;
    } const rows[] = {
        {"mp_parent",
         [this] {
             CBorder *p_border = new CBorder(&desktop(), "alone");
             p_border->on_attached();
             delete p_border;
         }},
        {"!\"CBorder::on_detached()\"",
         [p_dialog] {
             CWindow *p_border = p_dialog->get_child("border top", "Border", true);
             p_dialog->detach_child(p_border);
             p_dialog->attach_child(p_border);
         }},
        {"_p_button", [p_dialog] { p_dialog->set_default_button(nullptr); }},
        {"p_font",
         [this] {
             desktop().add_font(FNT_NAME_DEFAULT, nullptr);
             m_world.frame();
         }},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_expression);
        qortest::CReportCapture capture;
        row.m_act();
        ASSERT_EQ(1u, capture.asserts().size());
        EXPECT_NE(std::string::npos, capture.asserts()[0].find(row.m_expression)) << capture.asserts()[0];
    }
    EXPECT_EQ(p_ok, p_dialog->get_default_button());
}

namespace {

// A saved value as text: numbers as %g, booleans as true and false, "nil" for none.
std::string lua_text(LuaPlus::LuaObject const &_lo_value) {
    if (_lo_value.IsNumber()) return (testing::Message() << _lo_value.GetNumber()).GetString();
    if (_lo_value.IsBoolean()) return _lo_value.GetBoolean() ? "true" : "false";
    if (_lo_value.IsString()) return _lo_value.GetString();
    return _lo_value.IsNil() ? "nil" : "?";
}

} // namespace

// Each key loaded with a value of the wrong type or an unknown name, which leaves the default in
// place with no message, then with a good value, which the next save writes back.
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
        EXPECT_EQ(row.m_default, lua_text(qortest::saved_state(p_wnd).GetByName(row.m_key)));
        qortest::load_state(p_wnd, head + " = " + row.m_good + " }");
        EXPECT_EQ(row.m_saved, lua_text(qortest::saved_state(p_wnd).GetByName(row.m_key)));
        EXPECT_TRUE(capture.reports().empty());
        delete p_wnd;
    }
}

// A message keeps its first line only, and an empty one writes no key; a border of no single edge
// nor of all of them writes no type.
TEST_F(DialogTest, AMessageSavesItsFirstLineAndAnUnnamedBorderTypeNoKey) {
    CMessageBox *p_box = make<CMessageBox>(0, 0, 200, 100, "box");
    EXPECT_EQ("nil", lua_text(qortest::saved_state(p_box).GetByName("message_text")));
    p_box->set_message_text(CString("One\nTwo\nThree"));
    EXPECT_EQ("One", lua_text(qortest::saved_state(p_box).GetByName("message_text")));
    CBorder *p_border = m_world.place(p_box, new CBorder(&desktop(), "b"), 0, 0, 5, 5);
    p_border->set_border_type(static_cast<EBorderType>(BORDER_LEFT | BORDER_TOP));
    EXPECT_EQ("nil", lua_text(qortest::saved_state(p_border).GetByName("type")));
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
