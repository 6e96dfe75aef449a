// The visual window on the test world: client area, material by state, visual deltas, inherited
// fonts, z order, fades, movement and auto hide on the test's clock, and sounds on events.
#include "ui_window_visual.h"

#include "qorbase.h"
#include "test_world.h"
#include "ui_font.h"
#include "ui_material.h"

#include <gtest/gtest.h>

#include <functional>

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

TEST_F(VisualTest, MarginsMakeTheClientAreaAndDeltasGrowThePictureButNotTheHitArea) {
    CWindowVisual *p_panel = child("panel");
    CWindow *p_fill = m_world.place(p_panel, new CWindow(&m_world.desktop(), "fill"), 0, 0, 1, 1);
    p_fill->set_alignment(ALIGNMENT_CLIENT);
    p_panel->set_uniform_margins(10);
    p_panel->set_left_margin(20);
    EXPECT_EQ("20,10 70x30", qortest::place_text(p_fill));

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

TEST_F(VisualTest, TheMaterialFollowsThePointerAndTheState) {
    CWindowVisual *p_wnd = child("button");
    p_wnd->add_material(MAT_NAME_NORMAL, m_world.colour(1, 0, 0));
    p_wnd->add_material(MAT_NAME_HIGHLIGHTED, m_world.colour(2, 0, 0));
    p_wnd->add_material(MAT_NAME_CHECKED, m_world.colour(4, 0, 0));
    struct {
        char const *mp_step;
        std::function<void()> m_do;
        int m_red;
    } const steps[] = {
        {"away", [&] { m_world.move_to(200, 200); }, 1},
        {"over", [&] { m_world.move_to(10, 10); }, 2},
        {"pushed without its material", [&] { m_world.press(); }, 1},
        {"checked wins over highlighted", [&] { p_wnd->set_checked(true); }, 4},
        {"disabled without its material", [&] { p_wnd->set_disabled(true); }, 1},
        {"disabled", [&] { p_wnd->add_material(MAT_NAME_DISABLED, m_world.colour(8, 0, 0)); }, 8},
    };
    for (auto const &step : steps) {
        SCOPED_TRACE(step.mp_step);
        step.m_do();
        EXPECT_EQ(step.m_red, drawn_red(p_wnd));
    }
}

// Fonts are inherited and saved only where they were set; materials aren't inherited.
TEST_F(VisualTest, FontsAreInheritedAndSavedWhereTheyWereSet) {
    CWindowVisual *p_root = child("root");
    CWindowVisual *p_label = child("label", 10, 10, p_root);
    p_root->add_material(MAT_NAME_NORMAL, m_world.colour(1, 0, 0));
    EXPECT_EQ(m_world.desktop().get_font(FNT_NAME_DEFAULT), p_label->get_font(FNT_NAME_DEFAULT));
    EXPECT_EQ(nullptr, p_label->get_material(MAT_NAME_NORMAL));
    CFont *p_mono = get_fonts_factory().create("courier", &m_world.desktop());
    p_root->add_font(FNT_NAME_DEFAULT, p_mono); // replaces the caches below it
    EXPECT_EQ(p_mono, p_label->get_font(FNT_NAME_DEFAULT));
    EXPECT_TRUE(qortest::saved_state(p_label).GetByName("fonts").GetByName("FNT_NAME_DEFAULT").IsNil());
    EXPECT_STREQ("courier",
                 qortest::saved_state(p_root).GetByName("fonts").GetByName("FNT_NAME_DEFAULT").GetString());
}

TEST_F(VisualTest, FadesMovementAndAutoHideFollowTheClock) {
    CWindowVisual *p_wnd = child("w");
    p_wnd->set_auto_hide(true);
    p_wnd->set_auto_hide_time(500);
    m_world.clock().advance_ms(1000);
    m_world.frame();
    EXPECT_FALSE(p_wnd->is_hidden()); // never shown by an event
    send(p_wnd, EVENT_SHOW);
    m_world.clock().advance_ms(75);
    send(p_wnd, EVENT_DRAW);
    EXPECT_FLOAT_EQ(0.5f, p_wnd->get_transparency());
    m_world.clock().advance_ms(425);
    m_world.frame();
    EXPECT_FLOAT_EQ(1.0f, p_wnd->get_transparency());
    EXPECT_FALSE(p_wnd->is_hidden());
    m_world.clock().advance_ms(1);
    m_world.frame();
    EXPECT_TRUE(p_wnd->is_hidden()); // after 500 ms

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

    CWindowVisual *p_slider = child("slider", 10, 10);
    qortest::load_state(p_slider, ("{ name = 'slider', class_name = 'WindowVisual',"
                                   " movement = { pos = { 100, 50 }, size = { 30, 20 }, time = 200 } }"));
    p_slider->set_pos(0, 10);
    send(p_slider, EVENT_SHOW); // slides from where it is
    m_world.clock().advance_ms(50);
    send(p_slider, EVENT_UPDATE);
    EXPECT_EQ("25,20 15x12", qortest::place_text(p_slider));
    m_world.clock().advance_ms(149);
    send(p_slider, EVENT_UPDATE);
    EXPECT_EQ(99, p_slider->get_pos().x); // 199 of 200 ms
    m_world.clock().advance_ms(10);
    send(p_slider, EVENT_UPDATE);
    EXPECT_EQ(99, p_slider->get_pos().x); // over: the last step stands, no snapping
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
    qortest::CReportCapture capture;
    CWindowVisual *p_wnd = child("button");
    qortest::load_state(p_wnd,
                        ("{ name = 'button', class_name = 'WindowVisual', events_sounds = {"
                         " EVENT_CLICK = { file_names = { 'click.wav', 'missing.wav' }, volume = -0.5 },"
                         " EVENT_NOT_REGISTERED = { file_names = { 'click.wav' }, volume = 0 },"
                         " EVENT_SHOW = { file_names = { 'click.wav' } } } }"));
    EXPECT_EQ(live + 1, sounds.get_live_sources()); // one file of two loaded; no volume: skipped
    m_world.click_at(10, 10);
    p_wnd->set_disabled(true);
    send(p_wnd, EVENT_CLICK); // a disabled window plays nothing
    EXPECT_EQ(started + 1, sounds.get_started());

    LuaPlus::LuaObject saved = qortest::new_table();
    p_wnd->save_sounds(saved);
    LuaPlus::LuaObject const click = saved.GetByName("events_sounds").GetByName("EVENT_CLICK");
    EXPECT_FLOAT_EQ(-0.5f, click.GetByName("volume").GetFloat());
    EXPECT_STREQ("click.wav", click.GetByName("file_names").GetByIndex(1).GetString());
    EXPECT_EQ(500, click.GetByName("fade_out").GetInteger());
    EXPECT_TRUE(click.GetByName("fade_in").IsNil());
}
