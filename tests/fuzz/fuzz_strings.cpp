// A strings file, in bytes or in 16-bit units behind the byte-order mark: the table, and every
// value's narrow form.
#include "fuzz_world.h"
#include "qorbase.h"
#include "ui_local_strings.h"

extern "C" int LLVMFuzzerTestOneInput(uint8_t const *_p_data, size_t _size) {
    qorfuzz::init();
    qorfuzz::write_ui_file("fuzz.lang", _p_data, _size);
    qorui::local_strings_t table;
    qorui::read_local_strings(GetFileSystem()->open_file(qorbase::FILE_CATEGORY_UI, "fuzz.lang"), "fuzz.lang",
                              table);
    for (auto const &entry : table)
        if (entry.second.length() < 256) entry.second.get_str_c();
    return 0;
}
