// A list box of three columns on a desktop with the default fonts over the recording renderer: one
// frame (update and draw) with 100 and with 10,000 rows, at the top and scrolled halfway; a sort
// of 10,000 rows by a column, alone and with the frame behind it; and 10,000 rows inserted one at a
// time through the list's items, taken in by the next update.
#include "bench_desktop.h"
#include "qorbase.h"
#include "qordebug.h"
#include "recording_renderer.h"
#include "ui_desktop.h"
#include "ui_font.h"
#include "ui_list_box.h"
#include "ui_render.h"
#include "ui_value_bar.h"

#include <benchmark/benchmark.h>

#include <cstdio>
#include <string>
#include <utility>

using namespace qorui;

namespace {

unsigned const k_many = 10000;

// A text of one line, as a layout gives it.
CText line(char const *_p_text) {
    CText text;
    text.insert(_p_text, false, true);
    return text;
}

// Row _i: a name, a word that doesn't follow the row's order, and a number, each of a fixed length,
// so that any rows in view cost the same to draw.
CItem *make_row(unsigned _i) {
    unsigned const scrambled = _i * 7919u % 10007u;
    char name[16], word[16], number[16];
    std::snprintf(name, sizeof name, "Row %05u", _i);
    std::snprintf(word, sizeof word, "%c%05u", 'a' + scrambled % 26, scrambled);
    std::snprintf(number, sizeof number, "%05u", scrambled * 31u % 100000u);
    qor_vector<CText> texts;
    texts.reserve(3);
    for (char const *p_text : {name, word, number})
        texts.push_back(line(p_text));
    return new CItem(std::move(texts), nullptr);
}

// A list of 400 by 300 with columns of 120, 160 and 80 pixels and a bar 16 wide; the rows' height
// comes from the default font.
class CListWorld {
public:
    CListWorld() : m_bench(&m_renderer), mp_desktop(&m_bench.desktop()) {
        mp_list = new CListBox(mp_desktop, "list");
        mp_desktop->attach_child(mp_list);
        mp_list->set_pos(100, 100);
        mp_list->get_scroll_bar_vert()->set_w(16);
        mp_list->set_size(400, 300);
        mp_list->add_column();
        mp_list->add_column();
        int const widths[] = {120, 160, 80};
        for (unsigned c = 0; c < 3; ++c)
            mp_list->set_column_w(c, widths[c]);
    }

    void fill(unsigned _rows) {
        for (unsigned i = 0; i < _rows; ++i)
            mp_list->get_items().add(make_row(i));
    }
    // The calls of a frame are dropped behind it, so that every frame records the same.
    void frame() {
        mp_desktop->update(0);
        mp_desktop->draw();
        m_renderer.clear();
    }
    CListBox &list() { return *mp_list; }

private:
    qorhost::CRecordingRenderer m_renderer;
    CBenchDesktop m_bench;
    CDesktop *mp_desktop;
    CListBox *mp_list = nullptr;
};

// Arguments: the number of rows, and 1 to scroll halfway down.
void BM_ListBoxFrame(benchmark::State &_state) {
    CListWorld world;
    world.fill(static_cast<unsigned>(_state.range(0)));
    world.frame();
    if (_state.range(1)) {
        CScrollBar *p_bar = world.list().get_scroll_bar_vert();
        p_bar->set_position(p_bar->get_max() / 2);
    }
    for (auto _ : _state)
        world.frame();
}
BENCHMARK(BM_ListBoxFrame)->Args({100, 0})->Args({k_many, 0})->Args({100, 1})->Args({k_many, 1});

// Each sort starts from the order of the other column. Argument: 1 to draw a frame behind it, which
// finds the rows' height again.
void BM_ListBoxSortByColumn10000(benchmark::State &_state) {
    CListWorld world;
    world.fill(k_many);
    world.frame();
    unsigned column = 1;
    for (auto _ : _state) {
        world.list().get_items().sort_by_column(column);
        if (_state.range(0)) world.frame();
        column = 3 - column;
    }
}
BENCHMARK(BM_ListBoxSortByColumn10000)->Arg(0)->Arg(1)->Unit(benchmark::kMillisecond);

// The rows are made and added in the measurement, then taken in by one update; they are removed
// outside it.
void BM_ListBoxInsert10000OneAtATime(benchmark::State &_state) {
    CListWorld world;
    for (auto _ : _state) {
        world.fill(k_many);
        world.frame();
        _state.PauseTiming();
        world.list().get_items().remove_all();
        _state.ResumeTiming();
    }
    _state.SetItemsProcessed(_state.iterations() * k_many);
}
BENCHMARK(BM_ListBoxInsert10000OneAtATime)->Unit(benchmark::kMillisecond);

} // namespace
