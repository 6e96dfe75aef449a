// The smallest desktop a tree of windows can hang from: it records what the windows ask of it.
#pragma once
#include "ui_material.h"
#include "ui_window.h"

#include <string>
#include <vector>

namespace qortest {

// The desktop makes materials; a test makes them the same way over a bridge of its own.
class CBridgeMaterial : public qorui::CMaterial {
public:
    explicit CBridgeMaterial(qorui::IRender *_p_render) : CMaterial(_p_render) {}
};

class CTestDesktop : public qorui::IWindowDesktop {
public:
    void on_hide(qorui::CWindow *_p_wnd) override { record("on_hide", _p_wnd); }
    void on_delete(qorui::CWindow *_p_wnd) override { record("on_delete", _p_wnd); }
    void delete_window(qorui::CWindow *_p_wnd) override { record("delete_window", _p_wnd); }
    void report_pointer_inside(qorui::CWindow *_p_wnd) override { record("report", _p_wnd); }
    void input_subscribe(qorui::CWindow *_p_wnd, bool _subscribe) override {
        record(_subscribe ? "subscribe" : "unsubscribe", _p_wnd);
    }

    qorui::CMaterial *create_material() override { return new CBridgeMaterial(mp_render); }
    qorui::IRender *get_render() override { return mp_render; }
    qorui::point_t get_pointer_pos() override { return m_pointer_pos; }
    qorui::CMaterial *get_material(qorui::HUID const &) override { return nullptr; } // it has none

    qorui::IRender *mp_render = nullptr; // the bridge of create_material
    qorui::point_t m_pointer_pos{0, 0};
    // "call window" in order.
    std::vector<std::string> m_calls;

private:
    void record(char const *_call, qorui::CWindow *_p_wnd) {
        m_calls.push_back(std::string(_call) + " " + (_p_wnd ? _p_wnd->get_name() : "(null)"));
    }
};

} // namespace qortest
