// Local strings: a strings file of 1,000 lines opened and read into the table, as the service does
// at start-up, in both encodings.
#include "qorbase.h"
#include "ui_local_strings.h"

#include <benchmark/benchmark.h>

#include <cstdio>
#include <cstdlib>
#include <string>
#include <unistd.h>

using namespace qorui;

namespace {

// "MENU_ITEM_<n> "<text of about 30 characters>"", every tenth line with a comment behind it.
std::u16string strings_text(unsigned _lines) {
    std::u16string text;
    for (unsigned i = 0; i < _lines; ++i) {
        std::string const line = "MENU_ITEM_" + std::to_string(i) + " \"<color 255 255 0 255>Item number " +
                                 std::to_string(i) + "\"" + (i % 10 == 0 ? " -- a comment" : "") + "\r\n";
        text.append(line.begin(), line.end());
    }
    return text;
}

std::string file_bytes(std::u16string const &_text, bool _wide) {
    std::string bytes = _wide ? "\xFF\xFE" : "";
    for (char16_t const unit : _text) {
        bytes += static_cast<char>(unit & 0xFF);
        if (_wide) bytes += static_cast<char>(unit >> 8);
    }
    return bytes;
}

void load_local_strings_file(benchmark::State &_state, bool _wide) {
    char dir[] = "/tmp/qor_strings_bench_XXXXXX";
    if (!mkdtemp(dir)) {
        _state.SkipWithError("no temporary folder");
        return;
    }
    std::string const path = std::string(dir) + "/bench.lang";
    std::string const bytes = file_bytes(strings_text(1000), _wide);
    FILE *p_file = fopen(path.c_str(), "wb");
    if (p_file) {
        fwrite(bytes.data(), 1, bytes.size(), p_file);
        fclose(p_file);
    }
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, dir);

    local_strings_t table;
    for (auto _ : _state) {
        IFileReader *p_stream = GetFileSystem()->open_file(qorbase::FILE_CATEGORY_UI, "bench.lang");
        if (!p_stream) {
            _state.SkipWithError("cannot open the strings file");
            break;
        }
        read_local_strings(p_stream, "bench.lang", table);
        benchmark::DoNotOptimize(table.size());
    }
    if (table.size() != 1000) _state.SkipWithError("the table doesn't hold 1,000 strings");
    _state.SetItemsProcessed(_state.iterations() * 1000);
    std::remove(path.c_str());
    rmdir(dir);
}

void BM_LoadLocalStrings1000LinesWide(benchmark::State &_state) {
    load_local_strings_file(_state, true);
}
BENCHMARK(BM_LoadLocalStrings1000LinesWide)->Unit(benchmark::kMicrosecond);

void BM_LoadLocalStrings1000LinesNarrow(benchmark::State &_state) {
    load_local_strings_file(_state, false);
}
BENCHMARK(BM_LoadLocalStrings1000LinesNarrow)->Unit(benchmark::kMicrosecond);

} // namespace
