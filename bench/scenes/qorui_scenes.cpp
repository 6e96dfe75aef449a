// The scenes of scenes.h built with qorui: a desktop of 1024 by 768 over a renderer that copies
// every quad's vertices into a buffer, the default font, and push buttons with a plain colour
// material each. The memory manager runs on its system backend, so that the counting malloc sees
// the library's heap: the program starts itself again with QOR_MM_BACKEND=system when it isn't set.
#include "../bench_desktop.h"
#include "../vertex_copy_renderer.h"
#include "qorbase.h"
#include "scenes.h"
#include "ui_button.h"
#include "ui_desktop.h"
#include "ui_edit_box.h"
#include "ui_material.h"
#include "ui_string.h"
#include "ui_text.h"

#include <unistd.h>

#include <chrono>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <string>
#include <thread>

using namespace qorui;

namespace {

rgba_t const k_button_color(58, 74, 104, 255);

// With a scene named on the command line ("S1", "S2", "S3", "S4"), only that one runs: under a
// profiler the rest would blur the picture.
char const *gp_only = nullptr;

bool wanted(char const *_scene) {
    return !gp_only || std::strcmp(gp_only, _scene) == 0;
}

// ---------------------------------------------------------------------------------------------
// Building the scenes
// ---------------------------------------------------------------------------------------------

CMaterial *make_color_material(CDesktop &_desktop, rgba_t const &_color) {
    CMaterial *p_material = _desktop.create_material();
    p_material->init("ui_color", nullptr, nullptr, nullptr, nullptr, nullptr, true, false);
    p_material->set_color(_color);
    return p_material;
}

void add_buttons(CDesktop &_desktop, CWindow &_parent) {
    for (int i = 0; i < scenes::k_buttons; ++i) {
        std::string const caption = scenes::button_caption(i);
        scenes::SRect const r = scenes::button_rect(i);
        CButton *p_button = new CButton(&_desktop, caption.c_str());
        _parent.attach_child(p_button);
        p_button->set_pos(r.x, r.y);
        p_button->set_size(r.w, r.h);
        p_button->add_material(MAT_NAME_NORMAL, make_color_material(_desktop, k_button_color));
        p_button->m_text = CString(caption.c_str());
        p_button->send_event(p_button, EVENT_SHOW, CWndEvent::DISPATCH_NONE);
    }
}

// The S1 scene as a layout: a root window with the buttons, their material a preset.
std::string write_layout(std::string const &_folder) {
    std::ofstream presets(_folder + "/ui_material_presets.lua");
    presets << "ui_material_presets = { scene_button = { material_template = \"ui_color\", color = { r = "
            << int(k_button_color.r) << ", g = " << int(k_button_color.g) << ", b = " << int(k_button_color.b)
            << ", a = 255 } } }\n";
    std::ofstream layout(_folder + "/scene_buttons.lua");
    layout << "ui_windows_ini = {\n  name = \"scene\", class_name = \"WindowVisual\",\n";
    for (int i = 0; i < scenes::k_buttons; ++i) {
        scenes::SRect const r = scenes::button_rect(i);
        std::string const caption = scenes::button_caption(i);
        layout << "  [" << i + 1 << "] = { name = \"" << caption << "\", class_name = \"Button\", pos = { "
               << r.x << ", " << r.y << " }, size = { " << r.w << ", " << r.h << " }, text = \"" << caption
               << "\", materials = { MAT_NAME_NORMAL = { material_preset = \"scene_button\" } } },\n";
    }
    layout << "}\n";
    return "scene_buttons.lua";
}

CEditBox *add_text_window(CDesktop &_desktop) {
    CEditBox *p_box = new CEditBox(&_desktop, "text window");
    _desktop.attach_child(p_box);
    scenes::SRect const r = scenes::k_text_window;
    p_box->set_pos(r.x, r.y);
    p_box->set_size(r.w, r.h);
    p_box->add_material(MAT_NAME_NORMAL, make_color_material(_desktop, rgba_t(30, 30, 40, 255)));
    CText &text = p_box->get_text();
    for (int i = 0; i < scenes::k_text_lines; ++i)
        text.insert_str(scenes::text_line(i).c_str(), true);
    p_box->send_event(p_box, EVENT_SHOW, CWndEvent::DISPATCH_NONE);
    return p_box;
}

// Fades in of 150 ms run on the system's clock: the measured frames begin behind them.
void wait_for_fades(CDesktop &_desktop) {
    std::this_thread::sleep_for(std::chrono::milliseconds(200));
    _desktop.update(0);
    _desktop.draw();
}

void frame(CDesktop &_desktop) {
    _desktop.update(0);
    _desktop.draw();
}

// ---------------------------------------------------------------------------------------------
// The measurements
// ---------------------------------------------------------------------------------------------

void measure_buttons(CDesktop &_desktop, CVertexCopyRenderer &_renderer) {
    CWindowVisual *p_root = new CWindowVisual(&_desktop, "scene");
    _desktop.attach_child(p_root);
    p_root->set_size(scenes::k_screen_w, scenes::k_screen_h);
    p_root->send_event(p_root, EVENT_SHOW, CWndEvent::DISPATCH_NONE);
    frame(_desktop);

    scenes::SHeapCount const before = scenes::heap_count();
    add_buttons(_desktop, *p_root);
    scenes::SHeapCount const after = scenes::heap_count();
    scenes::print_value("qorui", "MEM_bytes/btn",
                        static_cast<double>(after.m_live_bytes - before.m_live_bytes) / scenes::k_buttons);
    scenes::print_value("qorui", "MEM_allocs/btn",
                        static_cast<double>(after.m_allocations - before.m_allocations) / scenes::k_buttons);
    wait_for_fades(_desktop);

    if (wanted("S1")) {
        scenes::SSummary const s1 = scenes::measure([&] { frame(_desktop); }, 300);
        scenes::print("qorui", "S1_frame", s1);
        scenes::print_value("qorui", "MEM_allocs/frm", s1.m_allocations);
        scenes::print_value("qorui", "S1_quads", static_cast<double>(_renderer.quads()));
        scenes::print_value("qorui", "S1_materials", static_cast<double>(_renderer.materials_set()));
        scenes::print_value("qorui", "S1_clips", static_cast<double>(_renderer.clips_set()));
    }

    // The pointer starts at the centre of the desktop; each move goes from the last target.
    uint64_t k = 0;
    point_t at = _desktop.get_pointer_pos();
    auto move = [&] {
        int x, y;
        scenes::button_centre(scenes::move_target(++k), x, y);
        _desktop.on_pointer_move(vec2_t{static_cast<float>(x - at.x), static_cast<float>(y - at.y)});
        at = point_t{x, y};
    };
    if (wanted("S2")) {
        scenes::print("qorui", "S2_move", scenes::measure(move, 300, 20));
        scenes::print("qorui", "S2_move+frame",
                      scenes::measure(
                          [&] {
                              move();
                              frame(_desktop);
                          },
                          300));
    }
    delete p_root;
}

void measure_layout(CDesktop &_desktop) {
    char folder[] = "/tmp/qorui_scenes_XXXXXX";
    if (!mkdtemp(folder)) return;
    std::string const file = write_layout(folder);
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, folder);
    auto load = [&] {
        CWindowVisual *p_root = new CWindowVisual(&_desktop, "scene");
        _desktop.attach_child(p_root);
        p_root->import(0, file.c_str());
        delete p_root;
    };
    scenes::print("qorui", "S3_load+free", scenes::measure(load, 30, 1, 3));
    std::remove((std::string(folder) + "/" + file).c_str());
    std::remove((std::string(folder) + "/ui_material_presets.lua").c_str());
    rmdir(folder);
}

void measure_text(CDesktop &_desktop, CVertexCopyRenderer &_renderer) {
    CEditBox *p_box = add_text_window(_desktop);
    wait_for_fades(_desktop);
    scenes::print("qorui", "S4_frame", scenes::measure([&] { frame(_desktop); }, 300));
    scenes::print_value("qorui", "S4_quads", static_cast<double>(_renderer.quads()));
    delete p_box;
}

} // namespace

int main(int _argc, char **_argv) {
    if (char const *backend = getenv("QOR_MM_BACKEND"); !backend || strcmp(backend, "system") != 0) {
        setenv("QOR_MM_BACKEND", "system", 1);
        execv("/proc/self/exe", _argv);
        return 1;
    }
    CVertexCopyRenderer renderer;
    CBenchDesktop bench(&renderer);
    gp_only = _argc > 1 ? _argv[1] : nullptr;
    if (wanted("S1") || wanted("S2")) measure_buttons(bench.desktop(), renderer);
    if (wanted("S3")) measure_layout(bench.desktop());
    if (wanted("S4")) measure_text(bench.desktop(), renderer);
    return 0;
}
