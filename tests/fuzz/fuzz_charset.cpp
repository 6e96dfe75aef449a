// A charset file of the type "nehe": read, and every character of the input looked up.
#include "fuzz_world.h"
#include "engine_interfaces.h"
#include "qorbase.h"
#include "qorscriptsystem.h"
#include "ui_font.h"

#include <cmath>

namespace {

// A charset outside the factory's cache, so that each input is read anew.
class CFuzzCharset : public qorui::CCharset {
public:
    using qorui::CCharset::init;
};

} // namespace

extern "C" int LLVMFuzzerTestOneInput(uint8_t const *_p_data, size_t _size) {
    qorfuzz::init();
    qorfuzz::write_ui_file("fuzz.fnt", _p_data, _size); // the run's font folder is shared data
    qorbase::set_category_root(qorbase::FILE_CATEGORY_FONTS, qorfuzz::ui_dir().c_str());
    LuaPlus::LuaObject entry;
    entry.AssignNewTable(&qorui::lua_machine());
    entry.SetString("file_type", "nehe");
    entry.SetString("file_name", "fuzz.fnt");
    {
        CFuzzCharset charset;
        charset.init("fuzz", entry);
        float sum = charset.get_height();
        for (size_t i = 0; i < _size; ++i)
            if (qorui::CCharset::SChar const *p_char = charset.get_char_description(_p_data[i]))
                sum += p_char->x + p_char->y + p_char->w;
        volatile bool const finite = std::isfinite(sum);
        (void)finite;
    }
    qorfuzz::restore_folders();
    return 0;
}
