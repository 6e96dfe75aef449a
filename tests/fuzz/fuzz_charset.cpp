// A charset file of the type "nehe": read, and every character of the input looked up.
#include "fuzz_world.h"
#include "engine_interfaces.h"
#include "qorbase.h"
#include "qorscriptsystem.h"
#include "ui_font.h"

#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <fstream>

namespace {

// A charset outside the factory's cache, so that each input is read anew.
class CFuzzCharset : public qorui::CCharset {
public:
    using qorui::CCharset::init;
};

std::string const &font_dir() {
    static std::string const s_dir = [] {
        std::string pattern = (std::filesystem::temp_directory_path() / "qorfuzz_fonts_XXXXXX").string();
        if (!mkdtemp(pattern.data())) std::abort();
        std::atexit([] { std::filesystem::remove_all(font_dir()); });
        return pattern;
    }();
    return s_dir;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(uint8_t const *_p_data, size_t _size) {
    qorfuzz::init();
    std::ofstream(font_dir() + "/fuzz.fnt", std::ios::binary)
        .write(reinterpret_cast<char const *>(_p_data), _size);
    qorbase::set_category_root(qorbase::FILE_CATEGORY_FONTS, font_dir().c_str());
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
