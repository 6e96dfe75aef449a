// The tokenizer over any text, with the flags of its callers and others, to its end.
#include "fuzz_world.h"
#include "tokenizer.h"

extern "C" int LLVMFuzzerTestOneInput(uint8_t const *_p_data, size_t _size) {
    if (_size < 1) return 0;
    int const flags = _p_data[0] & 15;
    char const *p_text = reinterpret_cast<char const *>(_p_data + 1);
    qorui::CTokenizerRules rules(p_text, static_cast<unsigned>(_size - 1), qorui::default_separators());
    try {
        qorui::CTokenizer tokenizer(rules, flags, 0);
        for (size_t i = 0; i <= _size; ++i) {
            tokenizer.get_token();
            if (i % 3 == 0) tokenizer.as_int();
            if (i % 3 == 1) tokenizer.as_float();
            if (i % 3 == 2) tokenizer.expect("=");
            tokenizer.next();
        }
    } catch (char const *) {
        // the end of the text, or a token that isn't what was expected
    }
    return 0;
}
