// Text: the narrow-to-wide conversion, tag removal, typing into a text buffer, and the scanner
// over a font description.
#include "tokenizer.h"
#include "ui_string.h"
#include "ui_text.h"

#include <benchmark/benchmark.h>

#include <string>

using namespace qorui;

namespace {

void BM_Str2wcs32Bytes(benchmark::State &_state) {
    std::string const text(32, 'a');
    for (auto _ : _state)
        benchmark::DoNotOptimize(CString::str2wcs(text.c_str(), -1));
}
BENCHMARK(BM_Str2wcs32Bytes);

void BM_RemoveTags200Units(benchmark::State &_state) {
    std::string line;
    while (line.size() < 200)
        line += "<color 255 128 0 255>value</color> ";
    line.resize(200);
    CString const source(line.c_str());
    CString text;
    for (auto _ : _state) {
        text = source; // the copy costs a few tens of nanoseconds of the figure
        text.remove_tags();
        benchmark::DoNotOptimize(text.data());
    }
}
BENCHMARK(BM_RemoveTags200Units);

// 10,000 characters typed one by one, a line break after every 80.
void BM_TextInsert10000(benchmark::State &_state) {
    for (auto _ : _state) {
        CText text;
        for (int i = 0; i < 10000; ++i)
            text.insert(static_cast<unsigned short>(i % 81 == 80 ? 10 : 'a' + i % 26), false);
        benchmark::DoNotOptimize(text.get_num_strings());
    }
}
BENCHMARK(BM_TextInsert10000)->Unit(benchmark::kMicrosecond);

// A description of 256 characters in the font file format.
void BM_TokenizeFontDescription256(benchmark::State &_state) {
    std::string description = "[common]\nfont1 = Sans\ndimension = 16\nfont_h = 0.5625\n[chars]\n";
    for (int code = 0; code < 256; ++code)
        description += std::to_string(code) + " = 0.3125" + (code % 16 == 15 ? "\n" : " ");
    CTokenizerRules rules(description.data(), static_cast<unsigned>(description.size()),
                          default_separators());
    for (auto _ : _state) {
        int tokens = 0;
        try {
            CTokenizer tokenizer(rules, 7, 0);
            for (;;) {
                ++tokens;
                tokenizer.next();
            }
        } catch (char const *) {
        }
        benchmark::DoNotOptimize(tokens);
    }
}
BENCHMARK(BM_TokenizeFontDescription256)->Unit(benchmark::kMicrosecond);

} // namespace
