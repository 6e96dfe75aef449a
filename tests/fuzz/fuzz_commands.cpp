// Command lines given to the service's commands on the started service.
#include "fuzz_world.h"
#include "qorbase.h"

#include <string>

namespace {

char const *const k_commands[] = {"ui_export ", "ui_import ", "print_stats_page "};

} // namespace

extern "C" int LLVMFuzzerTestOneInput(uint8_t const *_p_data, size_t _size) {
    if (_size < 1) return 0;
    std::string const arguments(reinterpret_cast<char const *>(_p_data + 1), _size - 1);
    // A console user may name any file; the run keeps its files inside its own folders.
    if (arguments.find("..") != std::string::npos || arguments.find('/') != std::string::npos ||
        arguments.find('\0') != std::string::npos)
        return 0;
    qorfuzz::init();
    std::string const line = k_commands[_p_data[0] % 3] + arguments;
    qorfuzz::started_host().commands().run_line(line.c_str());
    qorfuzz::clean_output();
    return 0;
}
