// The visual window on the test world: client area, material by state, visual deltas, inherited
// fonts, z order, fades, movement and auto hide on the test's clock, and sounds on events.
#include "ui_window_visual.h"

#include "qorbase.h"
#include "test_world.h"
#include "ui_font.h"
#include "ui_material.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

class VisualTest : public ::testing::Test {
protected:
    CWindowVisual *child(char const *_name, int _w = 100, int _h = 50, CWindow *_p_parent = nullptr) {
        CWindow *p_parent = _p_parent ? _p_parent : &m_world.desktop();
        return m_world.place(p_parent, new CWindowVisual(&m_world.desktop(), _name), 0, 0, _w, _h);
    }
    static void send(CWindow *_p_wnd, EEventType _id) {
        _p_wnd->send_event(_p_wnd, _id, CWndEvent::DISPATCH_NONE);
    }
    // The red byte of the last quad that the window draws, or -1.
    int drawn_red(CWindow *_p_wnd) {
        m_world.recorder().clear();
        send(_p_wnd, EVENT_DRAW);
        int red = -1;
        for (auto const &call : m_world.recorder().calls())
            if (call.m_op == "draw_quad") red = call.m_colours[0].r;
        return red;
    }

    qortest::CWorld m_world;
};

} // namespace

TEST_F(VisualTest, MarginsMakeTheClientAreaAndAlignChildrenOnce) {
    CWindowVisual *p_panel = child("panel");
    CWindow *p_fill = m_world.place(p_panel, new CWindow(&m_world.desktop(), "fill"), 0, 0, 1, 1);
    p_fill->set_alignment(ALIGNMENT_CLIENT);
    int resized = 0;
    p_panel->register_callback(EVENT_RESIZED, CEventCallback([&](CWndEvent const *) { ++resized; }));
    p_panel->set_uniform_margins(10);
    EXPECT_EQ(1, resized);
    EXPECT_EQ(80, p_fill->get_w());
    EXPECT_EQ(30, p_fill->get_h());
    EXPECT_EQ(10, p_fill->get_pos().y);
    p_panel->set_left_margin(20);
    EXPECT_EQ(70, p_fill->get_w());
    EXPECT_EQ(20, p_fill->get_pos().x);
}

TEST_F(VisualTest, TheMaterialFollowsThePointerAndTheState) {
    CWindowVisual *p_wnd = child("button");
    for (auto const &entry : {std::make_pair(&MAT_NAME_NORMAL, 1), std::make_pair(&MAT_NAME_HIGHLIGHTED, 2),
                              std::make_pair(&MAT_NAME_CHECKED, 4)})
        p_wnd->add_material(*entry.first, m_world.colour(static_cast<unsigned char>(entry.second), 0, 0));
    m_world.move_to(200, 200);
    EXPECT_EQ(1, drawn_red(p_wnd));
    m_world.move_to(10, 10);
    EXPECT_EQ(2, drawn_red(p_wnd));
    m_world.press();
    EXPECT_EQ(1, drawn_red(p_wnd)); // pushed without a pushed material: the normal one
    p_wnd->set_checked(true);
    EXPECT_EQ(4, drawn_red(p_wnd)); // checked wins over highlighted
    p_wnd->set_disabled(true);
    EXPECT_EQ(1, drawn_red(p_wnd)); // disabled without a disabled material: the normal one
    p_wnd->add_material(MAT_NAME_DISABLED, m_world.colour(8, 0, 0));
    EXPECT_EQ(8, drawn_red(p_wnd));
}

TEST_F(VisualTest, VisualDeltasGrowThePictureButNotTheHitArea) {
    CWindowVisual *p_wnd = child("w");
    p_wnd->set_pos(50, 40);
    p_wnd->add_material(MAT_NAME_NORMAL, m_world.colour(1, 0, 0));
    qortest::load_state(p_wnd, ("{ name = 'w', class_name = 'WindowVisual', visual_delta_left = 2,"
                                " visual_delta_top = 2, visual_delta_right = 2, visual_delta_bottom = 2 }"));
    m_world.recorder().clear();
    send(p_wnd, EVENT_DRAW);
    auto const &quad = m_world.recorder().calls().back();
    EXPECT_FLOAT_EQ(48.0f / 160 - 1, quad.m_points[0].x);  // 50 - 2 of 320
    EXPECT_FLOAT_EQ(152.0f / 160 - 1, quad.m_points[2].x); // 48 + 104
    EXPECT_FLOAT_EQ(1 - 92.0f / 120, quad.m_points[2].y);  // 38 + 54 of 240
    EXPECT_TRUE(p_wnd->is_point_inside(point_t{149, 89}));
    EXPECT_FALSE(p_wnd->is_point_inside(point_t{150, 89}));
}

TEST_F(VisualTest, FontsAreInheritedAndSavedOnlyWhereTheyAreOwn) {
    CWindowVisual *p_panel = child("panel");
    CWindowVisual *p_label = child("label", 10, 10, p_panel);
    p_panel->add_material(MAT_NAME_NORMAL, m_world.colour(1, 0, 0));
    EXPECT_EQ(m_world.desktop().get_font(FNT_NAME_DEFAULT), p_label->get_font(FNT_NAME_DEFAULT));
    EXPECT_EQ(nullptr, p_label->get_material(MAT_NAME_NORMAL)); // materials aren't inherited

    CFont *p_mono = get_fonts_factory().create("courier", &m_world.desktop());
    p_panel->add_font(FNT_NAME_DEFAULT, p_mono); // replaces the caches below it
    EXPECT_EQ(p_mono, p_label->get_font(FNT_NAME_DEFAULT));
    EXPECT_TRUE(qortest::saved_state(p_label).GetByName("fonts").GetByName("FNT_NAME_DEFAULT").IsNil());
    EXPECT_STREQ("courier",
                 qortest::saved_state(p_panel).GetByName("fonts").GetByName("FNT_NAME_DEFAULT").GetString());
}

TEST_F(VisualTest, ZOrderSortsChildrenFromTheLayout) {
    CWindowVisual *p_root = child("root");
    qortest::load_state(p_root, ("{ name = 'root', class_name = 'WindowVisual',"
                                 " { name = 'a', class_name = 'WindowVisual', z_order = 5 },"
                                 " { name = 'b', class_name = 'WindowVisual', z_order = 1 },"
                                 " { name = 'c', class_name = 'WindowVisual', z_order = 9 } }"));
    std::string order;
    for (unsigned i = 0; i < p_root->get_children_count(); ++i)
        order += p_root->get_child(i)->get_name();
    EXPECT_EQ("cab", order); // highest first: drawn first, farthest back
    LuaPlus::LuaObject const saved = qortest::saved_state(p_root);
    EXPECT_TRUE(saved.GetByName("z_order").IsNil());
    EXPECT_EQ(150, saved.GetByName("fade_in").GetInteger());
}

TEST_F(VisualTest, FadesFollowTheTickCountAndTheParent) {
    CWindowVisual *p_wnd = child("w");
    send(p_wnd, EVENT_SHOW);
    m_world.clock().advance_ms(75);
    send(p_wnd, EVENT_DRAW);
    EXPECT_FLOAT_EQ(0.5f, p_wnd->get_transparency());
    m_world.clock().advance_ms(100);
    send(p_wnd, EVENT_DRAW);
    EXPECT_FLOAT_EQ(1.0f, p_wnd->get_transparency());

    send(p_wnd, EVENT_HIDE);
    m_world.clock().advance_ms(75);
    send(p_wnd, EVENT_DRAW); // a hidden window draws while it fades out
    EXPECT_FLOAT_EQ(0.5f, p_wnd->get_transparency());
    CWindowVisual *p_inner = child("inner", 10, 10, p_wnd);
    p_inner->set_fade_in(0);
    send(p_inner, EVENT_SHOW);
    send(p_wnd, EVENT_DRAW);
    EXPECT_FLOAT_EQ(0.5f, p_inner->get_transparency()); // its own fade done: the parent's opacity

    m_world.clock().advance_ms(100);
    send(p_wnd, EVENT_DRAW);
    EXPECT_FLOAT_EQ(0.0f, p_wnd->get_transparency());
    int draws = 0;
    p_wnd->register_callback(EVENT_DRAW, CEventCallback([&](CWndEvent const *) { ++draws; }));
    send(p_wnd, EVENT_DRAW); // gone: the filter stops draw now
    EXPECT_EQ(0, draws);
}

TEST_F(VisualTest, AMovementSlidesFromWhereTheWindowIsAndStopsWithoutSnapping) {
    CWindowVisual *p_wnd = child("slider", 10, 10);
    qortest::load_state(p_wnd, ("{ name = 'slider', class_name = 'WindowVisual',"
                                " movement = { pos = { 100, 50 }, size = { 30, 20 }, time = 200 } }"));
    p_wnd->set_pos(0, 10);
    send(p_wnd, EVENT_SHOW);
    m_world.clock().advance_ms(50);
    send(p_wnd, EVENT_UPDATE);
    EXPECT_EQ(25, p_wnd->get_pos().x);
    EXPECT_EQ(20, p_wnd->get_pos().y);
    EXPECT_EQ(15, p_wnd->get_w());
    m_world.clock().advance_ms(149);
    send(p_wnd, EVENT_UPDATE);
    EXPECT_EQ(99, p_wnd->get_pos().x); // 199 of 200 ms
    m_world.clock().advance_ms(10);
    send(p_wnd, EVENT_UPDATE);
    EXPECT_EQ(99, p_wnd->get_pos().x); // over: the last step stands
}

TEST_F(VisualTest, AutoHideFiresOnlyAfterAShowAndItsTime) {
    CWindowVisual *p_wnd = child("toast");
    p_wnd->set_auto_hide(true);
    p_wnd->set_auto_hide_time(500);
    m_world.clock().advance_ms(1000);
    m_world.frame();
    EXPECT_FALSE(p_wnd->is_hidden()); // never shown by an event
    send(p_wnd, EVENT_SHOW);
    m_world.clock().advance_ms(500);
    m_world.frame();
    EXPECT_FALSE(p_wnd->is_hidden());
    m_world.clock().advance_ms(1);
    m_world.frame();
    EXPECT_TRUE(p_wnd->is_hidden());
}

TEST_F(VisualTest, SoundsPlayOnTheirEventsAndAreSavedBack) {
    std::string const dir = qortest::make_temp_dir();
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, dir.c_str());
    // The smallest PCM WAV: 8 bits, mono, one sample.
    qortest::write_file(
        dir + "/click.wav",
        std::string("RIFF\x25\0\0\0WAVEfmt "
                    "\x10\0\0\0\x01\0\x01\0\x40\x1f\0\0\x40\x1f\0\0\x01\0\x08\0data\x01\0\0\0\x80",
                    45));
    CWndEvent::register_event_name("EVENT_CLICK", EVENT_CLICK);
    qorhost::CSoundSystem &sounds = m_world.host().sound();
    unsigned const live = sounds.get_live_sources(), started = sounds.get_started();
    unsigned const first_line = m_world.host().log().get_next_index();
    CWindowVisual *p_wnd = child("button");
    qortest::load_state(p_wnd,
                        ("{ name = 'button', class_name = 'WindowVisual', events_sounds = {"
                         " EVENT_CLICK = { file_names = { 'click.wav', 'missing.wav' }, volume = -0.5 },"
                         " EVENT_NOT_REGISTERED = { file_names = { 'click.wav' }, volume = 0 },"
                         " EVENT_SHOW = { file_names = { 'click.wav' } } } }"));
    EXPECT_EQ(live + 1, sounds.get_live_sources()); // one file of two loaded; no volume: skipped
    m_world.click_at(10, 10);
    EXPECT_EQ(started + 1, sounds.get_started());
    p_wnd->set_disabled(true);
    send(p_wnd, EVENT_CLICK);
    EXPECT_EQ(started + 1, sounds.get_started()); // a disabled window plays nothing

    LuaPlus::LuaObject saved = qortest::new_table();
    p_wnd->save_sounds(saved);
    LuaPlus::LuaObject const click = saved.GetByName("events_sounds").GetByName("EVENT_CLICK");
    EXPECT_FLOAT_EQ(-0.5f, click.GetByName("volume").GetFloat());
    EXPECT_STREQ("click.wav", click.GetByName("file_names").GetByIndex(1).GetString());
    EXPECT_EQ(500, click.GetByName("fade_out").GetInteger());
    EXPECT_TRUE(click.GetByName("fade_in").IsNil());
    std::string messages;
    for (unsigned i = first_line; i < m_world.host().log().get_next_index(); ++i)
        messages += m_world.host().log().get_message_text(i) + "\n";
    EXPECT_NE(std::string::npos, messages.find("Cannot create sound source from file 'missing.wav'"));
    EXPECT_NE(std::string::npos,
              messages.find("Window 'button': event 'EVENT_NOT_REGISTERED' is not registered."));
}
