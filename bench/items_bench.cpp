// The row model of lists: 10,000 rows of three columns (a name, a word, a number), added one at a
// time, inserted one at a time at the top, and sorted by a column.
#include "ui_items.h"

#include <benchmark/benchmark.h>

#include <cstdio>
#include <random>
#include <string>
#include <utility>
#include <vector>

using namespace qorui;

namespace {

unsigned const k_rows = 10000;
unsigned const k_columns = 3;

// The columns of every row as narrow text, made once: "Item 00042", eight random letters, a
// random number below 100,000.
std::vector<std::string> const &column_texts() {
    static std::vector<std::string> const texts = [] {
        std::mt19937 random(42);
        std::vector<std::string> columns;
        for (unsigned i = 0; i < k_rows; ++i) {
            char name[16];
            std::snprintf(name, sizeof name, "Item %05u", i);
            std::string word;
            for (int c = 0; c < 8; ++c)
                word += static_cast<char>('a' + random() % 26);
            columns.push_back(name);
            columns.push_back(word);
            columns.push_back(std::to_string(random() % 100000));
        }
        return columns;
    }();
    return texts;
}

// Row _i as a caller filling a list makes it: its texts, then the row that takes them over.
CItem *make_row(unsigned _i) {
    qor_vector<CText> texts;
    texts.reserve(k_columns);
    for (unsigned c = 0; c < k_columns; ++c)
        texts.emplace_back(column_texts()[_i * k_columns + c].c_str());
    return new CItem(std::move(texts), nullptr);
}

// The list is destroyed outside the measurement.
template <class TPlace>
void fill_one_at_a_time(benchmark::State &_state, TPlace _place) {
    column_texts();
    for (auto _ : _state) {
        CItems *p_items = new CItems;
        for (unsigned i = 0; i < k_rows; ++i)
            _place(*p_items, make_row(i));
        benchmark::DoNotOptimize(p_items->get_count());
        _state.PauseTiming();
        delete p_items;
        _state.ResumeTiming();
    }
}

void BM_ItemsAdd10000(benchmark::State &_state) {
    fill_one_at_a_time(_state, [](CItems &_items, CItem *_p_item) { _items.add(_p_item); });
}
BENCHMARK(BM_ItemsAdd10000)->Unit(benchmark::kMillisecond);

// Every row before row 0, so every insert moves all the rows behind it.
void BM_ItemsInsertAtTop10000(benchmark::State &_state) {
    fill_one_at_a_time(_state, [](CItems &_items, CItem *_p_item) {
        if (_items.get_count() == 0)
            _items.add(_p_item);
        else
            _items.insert(_p_item, 0);
    });
}
BENCHMARK(BM_ItemsInsertAtTop10000)->Unit(benchmark::kMillisecond);

// Each sort starts from the order of the other column, which has nothing to do with its own.
void BM_ItemsSortByColumn10000(benchmark::State &_state, ESortOrder _order) {
    CItems items;
    for (unsigned i = 0; i < k_rows; ++i)
        items.add(make_row(i));
    unsigned column = 1;
    for (auto _ : _state) {
        items.sort_by_column(column, _order);
        column = 3 - column;
        benchmark::DoNotOptimize(items.get(0));
    }
}
BENCHMARK_CAPTURE(BM_ItemsSortByColumn10000, ascending, SORT_ASCENDING)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(BM_ItemsSortByColumn10000, descending, SORT_DESCENDING)->Unit(benchmark::kMillisecond);

} // namespace
