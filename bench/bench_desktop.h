// What the benchmarks of controls share: quiet reports, the fonts of the source tree, and a
// desktop of 1024 by 768 with the default font over a renderer of the benchmark's choice.
#pragma once
#include "qorbase.h"
#include "qordebug.h"
#include "ui_desktop.h"
#include "ui_font.h"
#include "ui_render.h"

#include <string>

class CBenchDesktop {
public:
    explicit CBenchDesktop(IRenderQOR *_p_renderer) {
        using namespace qorui;
        qordebug::set_report_handler([](qordebug::EReportKind, char const *, void *) {}, nullptr);
        std::string const data = std::string(QOR_SOURCE_DIR) + "/data";
        qorbase::set_category_root(qorbase::FILE_CATEGORY_FONTS, (data + "/fonts").c_str());
        qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, (data + "/ui").c_str());
        m_render.init(_p_renderer);
        m_render.set_resolution(1024, 768);
        get_fonts_factory().init();
        mp_desktop = new CDesktop(&m_render, 1024, 768, "desktop");
        mp_desktop->send_event(mp_desktop, EVENT_SHOW, CWndEvent::DISPATCH_NONE);
        mp_desktop->add_font(FNT_NAME_DEFAULT, get_fonts_factory().create("arial_white", mp_desktop));
    }
    ~CBenchDesktop() { delete mp_desktop; }
    CBenchDesktop(CBenchDesktop const &) = delete;
    CBenchDesktop &operator=(CBenchDesktop const &) = delete;

    qorui::CDesktop &desktop() { return *mp_desktop; }

private:
    qorui::CRender m_render;
    qorui::CDesktop *mp_desktop = nullptr;
};
