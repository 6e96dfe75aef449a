// The scenes of scenes.h built with CEGUI over its null renderer, which keeps each window's
// vertices in a geometry buffer and draws nothing. The look is the TaharezLook scheme of the
// package's data files, the font DejaVuSans at 10 pixels. CEGUI keeps each window's geometry from
// frame to frame: S1 and S4 are measured both with every window drawn anew (the whole tree
// invalidated first) and cached.
#include "scenes.h"

#include <CEGUI/CEGUI.h>
#include <CEGUI/RendererModules/Null/Renderer.h>

#include <unistd.h>

#include <cstdio>
#include <fstream>
#include <string>

using namespace CEGUI;

namespace {

UVector2 absolute_pos(int _x, int _y) {
    return UVector2(cegui_absdim(static_cast<float>(_x)), cegui_absdim(static_cast<float>(_y)));
}

USize absolute_size(int _w, int _h) {
    return USize(cegui_absdim(static_cast<float>(_w)), cegui_absdim(static_cast<float>(_h)));
}

void set_up_resources() {
    DefaultResourceProvider *p_provider =
        static_cast<DefaultResourceProvider *>(System::getSingleton().getResourceProvider());
    std::string const data = CEGUI_DATAFILES;
    p_provider->setResourceGroupDirectory("schemes", data + "/schemes/");
    p_provider->setResourceGroupDirectory("imagesets", data + "/imagesets/");
    p_provider->setResourceGroupDirectory("fonts", data + "/fonts/");
    p_provider->setResourceGroupDirectory("looknfeels", data + "/looknfeel/");
    p_provider->setResourceGroupDirectory("layouts", data + "/layouts/");
    ImageManager::setImagesetDefaultResourceGroup("imagesets");
    Font::setDefaultResourceGroup("fonts");
    Scheme::setDefaultResourceGroup("schemes");
    WidgetLookManager::setDefaultResourceGroup("looknfeels");
    WindowManager::setDefaultResourceGroup("layouts");
    SchemeManager::getSingleton().createFromFile("TaharezLook.scheme");
    FontManager::getSingleton().createFromFile("DejaVuSans-10-NoScale.font");
}

void add_buttons(Window &_parent) {
    WindowManager &windows = WindowManager::getSingleton();
    for (int i = 0; i < scenes::k_buttons; ++i) {
        std::string const caption = scenes::button_caption(i);
        scenes::SRect const r = scenes::button_rect(i);
        Window *p_button = windows.createWindow("TaharezLook/Button", caption);
        p_button->setPosition(absolute_pos(r.x, r.y));
        p_button->setSize(absolute_size(r.w, r.h));
        p_button->setText(caption);
        _parent.addChild(p_button);
    }
}

Window *make_container(char const *_name) {
    Window *p_root = WindowManager::getSingleton().createWindow("DefaultWindow", _name);
    p_root->setPosition(absolute_pos(0, 0));
    p_root->setSize(absolute_size(scenes::k_screen_w, scenes::k_screen_h));
    return p_root;
}

void frame() {
    System::getSingleton().injectTimePulse(1.0f / 60.0f);
    System::getSingleton().renderAllGUIContexts();
}

void destroy(Window *_p_window) {
    WindowManager::getSingleton().destroyWindow(_p_window);
    WindowManager::getSingleton().cleanDeadPool();
}

} // namespace

int main() {
    NullRenderer::bootstrapSystem();
    set_up_resources();
    System::getSingleton().notifyDisplaySizeChanged(Sizef(scenes::k_screen_w, scenes::k_screen_h));
    GUIContext &context = System::getSingleton().getDefaultGUIContext();
    context.setDefaultFont("DejaVuSans-10-NoScale");
    Window *p_root = make_container("root");
    context.setRootWindow(p_root);
    frame();

    // MEM and S1: the buttons in a container on the root.
    Window *p_scene = make_container("scene");
    p_root->addChild(p_scene);
    scenes::SHeapCount const before = scenes::heap_count();
    add_buttons(*p_scene);
    frame(); // the geometry of every button is made and kept
    scenes::SHeapCount const after = scenes::heap_count();
    scenes::print_value("cegui", "MEM_bytes/btn",
                        static_cast<double>(after.m_live_bytes - before.m_live_bytes) / scenes::k_buttons);
    scenes::print_value("cegui", "MEM_allocs/btn",
                        static_cast<double>(after.m_allocations - before.m_allocations) / scenes::k_buttons);

    scenes::print("cegui", "S1_frame",
                  scenes::measure(
                      [p_scene] {
                          p_scene->invalidate(true);
                          frame();
                      },
                      100, 1, 5));
    scenes::SSummary const cached = scenes::measure(frame, 300);
    scenes::print("cegui", "S1_frame_cached", cached);
    scenes::print_value("cegui", "MEM_allocs/frm", cached.m_allocations);

    uint64_t k = 0;
    auto move = [&k, &context] {
        int x, y;
        scenes::button_centre(scenes::move_target(++k), x, y);
        context.injectMousePosition(static_cast<float>(x), static_cast<float>(y));
    };
    scenes::print("cegui", "S2_move", scenes::measure(move, 300, 20));
    scenes::print("cegui", "S2_move+frame",
                  scenes::measure(
                      [&move] {
                          move();
                          frame();
                      },
                      300));

    // S3: the scene written as a layout file once, then loaded, attached and destroyed.
    char folder[] = "/tmp/cegui_scenes_XXXXXX";
    if (mkdtemp(folder)) {
        std::ofstream(std::string(folder) + "/scene_buttons.layout")
            << WindowManager::getSingleton().getLayoutAsString(*p_scene);
        static_cast<DefaultResourceProvider *>(System::getSingleton().getResourceProvider())
            ->setResourceGroupDirectory("scenes", std::string(folder) + "/");
        auto load = [p_root] {
            Window *p_loaded =
                WindowManager::getSingleton().loadLayoutFromFile("scene_buttons.layout", "scenes");
            p_root->addChild(p_loaded);
            destroy(p_loaded);
        };
        destroy(p_scene);
        scenes::print("cegui", "S3_load+free", scenes::measure(load, 20, 1, 2));
        std::remove((std::string(folder) + "/scene_buttons.layout").c_str());
        rmdir(folder);
    } else {
        destroy(p_scene);
    }

    // S4: a static text of 200 lines in a window of its own.
    Window *p_text = WindowManager::getSingleton().createWindow("TaharezLook/StaticText", "text window");
    scenes::SRect const r = scenes::k_text_window;
    p_text->setPosition(absolute_pos(r.x, r.y));
    p_text->setSize(absolute_size(r.w, r.h));
    std::string text;
    for (int i = 0; i < scenes::k_text_lines; ++i)
        text += scenes::text_line(i) + (i + 1 < scenes::k_text_lines ? "\n" : "");
    p_text->setText(text);
    p_text->setProperty("VertFormatting", "TopAligned");
    p_root->addChild(p_text);
    frame();
    scenes::print("cegui", "S4_frame",
                  scenes::measure(
                      [p_text] {
                          p_text->invalidate(true);
                          frame();
                      },
                      100, 1, 5));
    scenes::print("cegui", "S4_frame_cached", scenes::measure(frame, 300));

    NullRenderer::destroySystem();
    return 0;
}
