// A configuration file: parsed, its values read in every form, one changed and written back.
#include "fuzz_world.h"
#include "qorbase.h"

#include <string>

namespace {

char const *const k_sections[] = {"ui", "ui_libraries", "host", "render", ""};
char const *const k_keys[] = {"background", "console_pos", "console_size", "library", "startup", "a", ""};

} // namespace

extern "C" int LLVMFuzzerTestOneInput(uint8_t const *_p_data, size_t _size) {
    qorfuzz::init();
    std::string const path = qorfuzz::ui_dir() + "/fuzz.gdf";
    qorfuzz::write_ui_file("fuzz.gdf", _p_data, _size);
    if (IConfigFile *p_file = ReadConfigFile(qorbase::FILE_CATEGORY_UI, "fuzz.gdf", 0)) {
        for (char const *p_section : k_sections)
            if (IConfigSection *p_section_object = p_file->get_section(p_section))
                for (char const *p_key : k_keys)
                    if (IConfigValue *p_value = p_section_object->get_value(p_key, false)) {
                        p_value->get_vec2(1, 2);
                        p_value->get_int(3);
                        p_value->get_string("d");
                        p_value->has_content();
                    }
        p_file->close(true);
    }
    // The engine's own configuration on the input: a change is written back atomically.
    qorbase::set_gdf_path(path.c_str());
    if (IConfigSection *p_ui = qorbase::find_config_section("ui")) {
        if (IConfigValue *p_pos = p_ui->get_value("console_pos", true)) p_pos->set_vec2(20, 30);
        qorbase::flush_gdf();
    }
    qorbase::set_gdf_path(nullptr);
    return 0;
}
