// The visual window: client area, material by state, visual deltas, inherited fonts, z order,
// fades, movement and auto hide on a clock the test holds, sounds on events, and layouts.
#include "ui_window_visual.h"

#include "engine_interfaces.h"
#include "interface_server.h"
#include "log_manager.h"
#include "qor_platform.h"
#include "qorbase.h"
#include "qorscriptsystem.h"
#include "recording_renderer.h"
#include "sound_system.h"
#include "test_desktop.h"
#include "test_support.h"
#include "ui_font.h"
#include "ui_material.h"
#include "ui_render.h"

#include <gtest/gtest.h>

#include <cmath>

using namespace qorui;

namespace {

// A desktop of 400 by 300 on the recorder; sounds from the host's silent sound system; the tick
// count is the test's.
class VisualTest : public ::testing::Test {
protected:
    void SetUp() override {
        qorplatform::set_clock(&m_clock);
        m_log.set_quiet(true);
        m_server.register_interface(&m_sounds);
        m_server.register_interface(&m_log);
        engine_interfaces().set_server(&m_server);
        {
            qortest::CReportCapture quiet; // no screen size here
            m_render.init(&m_recorder);
        }
        m_render.set_resolution(400, 300);
        m_desktop.mp_render = &m_render;
        mp_root = new CWindowVisual(&m_desktop, "root");
        mp_root->set_size(400, 300);
    }
    void TearDown() override {
        delete mp_root;
        engine_interfaces().set_server(nullptr);
        qorplatform::set_clock(nullptr);
    }

    CWindowVisual *child(char const *_name, int _w = 100, int _h = 50) {
        CWindowVisual *p_wnd = new CWindowVisual(&m_desktop, _name);
        mp_root->attach_child(p_wnd);
        p_wnd->set_size(_w, _h);
        return p_wnd;
    }
    // A "ui_color" material of one colour, owned by the window.
    CMaterial *add_colour(CWindowVisual *_p_wnd, HUID const &_id, unsigned char _r) {
        CMaterial *p_material = m_desktop.create_material();
        p_material->init("ui_color", nullptr, nullptr, nullptr, nullptr, nullptr, true, false);
        p_material->set_color(rgba_t(_r, 0, 0, 255));
        _p_wnd->add_material(_id, p_material);
        return p_material;
    }
    void load(CWindow *_p_wnd, LuaPlus::LuaObject _lo_table) { _p_wnd->load_state(_lo_table); }
    void send(CWindow *_p_wnd, EEventType _id) { _p_wnd->send_event(_p_wnd, _id, CWndEvent::DISPATCH_NONE); }
    // The red byte of the last quad drawn, or -1.
    int drawn_red() {
        int red = -1;
        for (auto const &call : m_recorder.calls())
            if (call.m_op == "draw_quad") red = call.m_colours[0].r;
        return red;
    }
    LuaPlus::LuaObject table(char const *_p_chunk) {
        lua_machine().DoString((std::string("visual_probe = ") + _p_chunk).c_str());
        return lua_machine().GetGlobals().GetByName("visual_probe");
    }

    qorplatform::CManualClock m_clock{10000};
    qorhost::CInterfaceServer m_server;
    qorhost::CSoundSystem m_sounds;
    qorhost::CLogManager m_log;
    qorhost::CRecordingRenderer m_recorder;
    CRender m_render;
    qortest::CTestDesktop m_desktop;
    CWindowVisual *mp_root = nullptr;
};

} // namespace

TEST_F(VisualTest, MarginsMakeTheClientAreaAndAlignChildrenOnce) {
    CWindowVisual *p_panel = child("panel");
    CWindow *p_fill = new CWindow(&m_desktop, "fill");
    p_panel->attach_child(p_fill);
    p_fill->set_alignment(ALIGNMENT_CLIENT);
    int resized = 0;
    p_panel->register_callback(EVENT_RESIZED, CEventCallback([&](CWndEvent const *) { ++resized; }));
    p_panel->set_uniform_margins(10);
    EXPECT_EQ(1, resized);
    EXPECT_EQ(80, p_panel->get_client_w());
    EXPECT_EQ(30, p_panel->get_client_h());
    EXPECT_EQ(10, p_panel->get_client_pos().x);
    EXPECT_EQ(80, p_fill->get_w());
    EXPECT_EQ(10, p_fill->get_pos().y);
    p_panel->set_left_margin(20);
    EXPECT_EQ(70, p_fill->get_w());
    EXPECT_EQ(2, resized);
}

TEST_F(VisualTest, TheMaterialFollowsTheState) {
    CWindowVisual *p_wnd = child("button");
    add_colour(p_wnd, MAT_NAME_NORMAL, 1);
    add_colour(p_wnd, MAT_NAME_HIGHLIGHTED, 2);
    add_colour(p_wnd, MAT_NAME_CHECKED, 4);
    auto drawn = [&] {
        m_recorder.clear();
        send(p_wnd, EVENT_DRAW);
        return drawn_red();
    };
    EXPECT_EQ(1, drawn());
    send(p_wnd, EVENT_POINTER_ENTER);
    EXPECT_EQ(2, drawn());
    send(p_wnd, EVENT_POINTER_DOWN);
    EXPECT_EQ(1, drawn()); // pushed without a pushed material: the normal one
    p_wnd->set_checked(true);
    EXPECT_EQ(4, drawn()); // checked wins over highlighted
    p_wnd->set_disabled(true);
    EXPECT_EQ(1, drawn()); // disabled without a disabled material: the normal one
    add_colour(p_wnd, MAT_NAME_DISABLED, 8);
    EXPECT_EQ(8, drawn());
}

TEST_F(VisualTest, VisualDeltasGrowThePictureButNotTheHitArea) {
    CWindowVisual *p_wnd = child("w");
    p_wnd->set_pos(50, 40);
    add_colour(p_wnd, MAT_NAME_NORMAL, 1);
    load(p_wnd,
         table("{ name = 'w', class_name = 'WindowVisual', visual_delta_left = 2, visual_delta_top = 2,"
               " visual_delta_right = 2, visual_delta_bottom = 2 }"));
    m_recorder.clear();
    send(p_wnd, EVENT_DRAW);
    auto const &quad = m_recorder.calls().back();
    EXPECT_FLOAT_EQ((48.0f / 400 - 0.5f) * 2, quad.m_points[0].x);
    EXPECT_FLOAT_EQ((152.0f / 400 - 0.5f) * 2, quad.m_points[2].x); // 48 + 104
    EXPECT_FLOAT_EQ((92.0f / 300 - 0.5f) * -2, quad.m_points[2].y); // 38 + 54
    EXPECT_TRUE(p_wnd->is_point_inside(point_t{149, 89}));
    EXPECT_FALSE(p_wnd->is_point_inside(point_t{150, 89}));
}

TEST_F(VisualTest, FontsAreInheritedAndCachedMaterialsAreNot) {
    qorbase::set_category_root(8, (qortest::source_dir() + "/data/fonts").c_str());
    qorbase::set_category_root(16, (qortest::source_dir() + "/data/ui").c_str());
    get_fonts_factory().init();
    CWindowVisual *p_panel = child("panel");
    CWindowVisual *p_label = new CWindowVisual(&m_desktop, "label");
    p_panel->attach_child(p_label);
    CFont *p_sans = get_fonts_factory().create("arial_white", &m_desktop);
    mp_root->add_font(FNT_NAME_DEFAULT, p_sans);
    add_colour(mp_root, MAT_NAME_NORMAL, 1);
    EXPECT_EQ(p_sans, p_label->get_font(FNT_NAME_DEFAULT));
    EXPECT_EQ(nullptr, p_label->get_material(MAT_NAME_NORMAL));

    // A new font on the panel replaces the caches below it.
    CFont *p_mono = get_fonts_factory().create("courier", &m_desktop);
    p_panel->add_font(FNT_NAME_DEFAULT, p_mono);
    EXPECT_EQ(p_mono, p_label->get_font(FNT_NAME_DEFAULT));

    // A cached font isn't saved; an own one is, by its name.
    LuaPlus::LuaObject saved_label, saved_panel;
    saved_label.AssignNewTable(&lua_machine());
    saved_panel.AssignNewTable(&lua_machine());
    p_label->save_state(saved_label);
    p_panel->save_state(saved_panel);
    EXPECT_TRUE(saved_label.GetByName("fonts").IsTable());
    EXPECT_TRUE(saved_label.GetByName("fonts").GetByName("FNT_NAME_DEFAULT").IsNil());
    EXPECT_STREQ("courier", saved_panel.GetByName("fonts").GetByName("FNT_NAME_DEFAULT").GetString());
}

TEST_F(VisualTest, ZOrderSortsChildrenFromTheLayout) {
    load(mp_root, table("{ name = 'root', class_name = 'WindowVisual',"
                        " { name = 'a', class_name = 'WindowVisual', z_order = 5 },"
                        " { name = 'b', class_name = 'WindowVisual', z_order = 1 },"
                        " { name = 'c', class_name = 'WindowVisual', z_order = 9 } }"));
    ASSERT_EQ(3u, mp_root->get_children_count());
    EXPECT_STREQ("c", mp_root->get_child(0u)->get_name());
    EXPECT_STREQ("a", mp_root->get_child(1u)->get_name());
    EXPECT_STREQ("b", mp_root->get_child(2u)->get_name());
    mp_root->bring_to_front(mp_root->get_child(0u));
    EXPECT_STREQ("c", mp_root->get_child(2u)->get_name());

    LuaPlus::LuaObject saved;
    saved.AssignNewTable(&lua_machine());
    mp_root->save_state(saved);
    EXPECT_TRUE(saved.GetByName("z_order").IsNil());
    EXPECT_EQ(150, saved.GetByName("fade_in").GetInteger());
}

TEST_F(VisualTest, FadesFollowTheTickCountAndTheParent) {
    CWindowVisual *p_wnd = child("w");
    send(p_wnd, EVENT_SHOW);
    m_clock.advance_ms(75);
    send(p_wnd, EVENT_DRAW);
    EXPECT_FLOAT_EQ(0.5f, p_wnd->get_transparency());
    m_clock.advance_ms(100);
    send(p_wnd, EVENT_DRAW);
    EXPECT_FLOAT_EQ(1.0f, p_wnd->get_transparency());

    send(p_wnd, EVENT_HIDE);
    m_clock.advance_ms(75);
    send(p_wnd, EVENT_DRAW); // a hidden window draws while it fades out
    EXPECT_FLOAT_EQ(0.5f, p_wnd->get_transparency());

    // A child with its own fade finished carries its parent's opacity.
    CWindowVisual *p_inner = new CWindowVisual(&m_desktop, "inner");
    p_wnd->attach_child(p_inner);
    p_inner->set_fade_in(0);
    send(p_inner, EVENT_SHOW);
    send(p_wnd, EVENT_DRAW);
    EXPECT_FLOAT_EQ(0.5f, p_inner->get_transparency());

    m_clock.advance_ms(100);
    send(p_wnd, EVENT_DRAW);
    EXPECT_FLOAT_EQ(0.0f, p_wnd->get_transparency());
    int draws = 0;
    p_wnd->register_callback(EVENT_DRAW, CEventCallback([&](CWndEvent const *) { ++draws; }));
    send(p_wnd, EVENT_DRAW); // gone: the filter stops draw now
    EXPECT_EQ(0, draws);
}

TEST_F(VisualTest, AMovementSlidesFromWhereTheWindowIsAndStopsWithoutSnapping) {
    CWindowVisual *p_wnd = child("slider", 10, 10);
    load(p_wnd, table("{ name = 'slider', class_name = 'WindowVisual',"
                      " movement = { pos = { 100, 50 }, size = { 30, 20 }, time = 200 } }"));
    p_wnd->set_pos(0, 10);
    send(p_wnd, EVENT_SHOW);
    m_clock.advance_ms(50);
    send(p_wnd, EVENT_UPDATE);
    EXPECT_EQ(25, p_wnd->get_pos().x);
    EXPECT_EQ(20, p_wnd->get_pos().y);
    EXPECT_EQ(15, p_wnd->get_w());
    m_clock.advance_ms(149);
    send(p_wnd, EVENT_UPDATE);
    EXPECT_EQ(99, p_wnd->get_pos().x); // 199 of 200 ms
    m_clock.advance_ms(10);
    send(p_wnd, EVENT_UPDATE);
    EXPECT_EQ(99, p_wnd->get_pos().x); // over: the last step stands
}

TEST_F(VisualTest, AutoHideFiresOnlyAfterAShowAndItsTime) {
    CWindowVisual *p_wnd = child("toast");
    p_wnd->set_auto_hide(true);
    p_wnd->set_auto_hide_time(500);
    m_clock.advance_ms(1000);
    send(p_wnd, EVENT_UPDATE);
    EXPECT_FALSE(p_wnd->is_hidden()); // never shown by an event
    send(p_wnd, EVENT_SHOW);
    m_clock.advance_ms(500);
    send(p_wnd, EVENT_UPDATE);
    EXPECT_FALSE(p_wnd->is_hidden());
    m_clock.advance_ms(1);
    send(p_wnd, EVENT_UPDATE);
    EXPECT_TRUE(p_wnd->is_hidden());
    EXPECT_EQ((std::vector<std::string>{"on_hide toast"}), m_desktop.m_calls);
}

TEST_F(VisualTest, SoundsPlayOnTheirEventsAndStopOnHide) {
    std::string const dir = qortest::make_temp_dir();
    qorbase::set_category_root(16, dir.c_str());
    // The smallest PCM WAV: 8 bits, mono, one sample.
    std::string wav(
        "RIFF\x25\0\0\0WAVEfmt \x10\0\0\0\x01\0\x01\0\x40\x1f\0\0\x40\x1f\0\0\x01\0\x08\0data\x01\0\0\0\x80",
        45);
    qortest::write_file(dir + "/click.wav", wav);
    CWndEvent::register_event_name("EVENT_CLICK", EVENT_CLICK);
    CWindowVisual *p_wnd = child("button");
    qortest::CReportCapture capture;
    load(p_wnd, table("{ name = 'button', class_name = 'WindowVisual', events_sounds = {"
                      " EVENT_CLICK = { file_names = { 'click.wav', 'missing.wav' }, volume = -0.5 },"
                      " EVENT_NOT_REGISTERED = { file_names = { 'click.wav' }, volume = 0 },"
                      " EVENT_SHOW = { file_names = { 'click.wav' } } } }"));
    EXPECT_EQ(1u, m_sounds.get_live_sources()); // one file of two loaded; no volume: skipped
    send(p_wnd, EVENT_CLICK);
    EXPECT_EQ(1u, m_sounds.get_started());
    p_wnd->set_disabled(true);
    send(p_wnd, EVENT_CLICK);
    EXPECT_EQ(1u, m_sounds.get_started()); // a disabled window plays nothing

    LuaPlus::LuaObject saved;
    saved.AssignNewTable(&lua_machine());
    p_wnd->save_sounds(saved);
    LuaPlus::LuaObject const click = saved.GetByName("events_sounds").GetByName("EVENT_CLICK");
    EXPECT_FLOAT_EQ(-0.5f, click.GetByName("volume").GetFloat());
    EXPECT_STREQ("click.wav", click.GetByName("file_names").GetByIndex(1).GetString());
    EXPECT_EQ(500, click.GetByName("fade_out").GetInteger());
    EXPECT_TRUE(click.GetByName("fade_in").IsNil());

    std::string messages;
    for (unsigned i = 0; i < m_log.get_next_index(); ++i)
        messages += m_log.get_message_text(i) + "\n";
    EXPECT_NE(std::string::npos, messages.find("Cannot create sound source from file 'missing.wav'"));
    EXPECT_NE(std::string::npos,
              messages.find("Window 'button': event 'EVENT_NOT_REGISTERED' is not registered."));
}
