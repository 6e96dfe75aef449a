// Typing into an edit box through the desktop, as a player types: 10,000 characters by the
// desktop's on_char into a box 80 characters of the default font wide, on a desktop with the
// default fonts over the recording renderer.
#include "bench_desktop.h"
#include "qorbase.h"
#include "qordebug.h"
#include "recording_renderer.h"
#include "ui_desktop.h"
#include "ui_edit_box.h"
#include "ui_font.h"
#include "ui_render.h"

#include <benchmark/benchmark.h>

#include <algorithm>
#include <string>

using namespace qorui;

namespace {

int const k_columns = 80;
int const k_characters = 10000;

class CTypingWorld {
public:
    CTypingWorld() : m_bench(&m_renderer), mp_desktop(&m_bench.desktop()) {
        mp_box = new CEditBox(mp_desktop, "edit");
        mp_desktop->attach_child(mp_box);
        mp_box->set_size(columns_w(), 400);
        mp_desktop->set_active_window(mp_box);
    }

    // The letters typed, 'a' to 'z' over and over; a return after every 80 when _lines is set.
    void type(bool _lines) {
        for (int i = 0; i < k_characters; ++i) {
            if (_lines && i > 0 && i % k_columns == 0) mp_desktop->on_key_down(13, 0);
            mp_desktop->on_char(static_cast<unsigned>('a' + i % 26));
        }
    }
    CEditBox &box() { return *mp_box; }

private:
    // Room for 80 of the widest letter and the caret.
    int columns_w() {
        CFont *p_font = mp_box->get_font(FNT_NAME_DEFAULT);
        int widest = 0;
        for (unsigned short ch = 'a'; ch <= 'z'; ++ch)
            widest = std::max(widest, mp_box->get_canvas().get_char_width(ch, p_font));
        return k_columns * widest + mp_box->get_caret()->get_w();
    }

    qorhost::CRecordingRenderer m_renderer;
    CBenchDesktop m_bench;
    CDesktop *mp_desktop;
    CEditBox *mp_box = nullptr;
};

void type_into_box(benchmark::State &_state, bool _lines) {
    CTypingWorld world;
    for (auto _ : _state) {
        _state.PauseTiming();
        world.box().get_text().clear();
        _state.ResumeTiming();
        world.type(_lines);
        benchmark::DoNotOptimize(world.box().get_text().get_num_strings());
    }
    _state.SetItemsProcessed(_state.iterations() * k_characters);
}

// Lines of 80 characters: the caret never leaves the box.
void BM_TypeIntoEditBoxOf80Columns(benchmark::State &_state) {
    type_into_box(_state, true);
}
BENCHMARK(BM_TypeIntoEditBoxOf80Columns)->Unit(benchmark::kMillisecond);

// One line: past the 80th character the text is shifted left at every character, measured anew
// from the line's start.
void BM_TypeOneLongLineIntoEditBoxOf80Columns(benchmark::State &_state) {
    type_into_box(_state, false);
}
BENCHMARK(BM_TypeOneLongLineIntoEditBoxOf80Columns)->Unit(benchmark::kMillisecond);

} // namespace
