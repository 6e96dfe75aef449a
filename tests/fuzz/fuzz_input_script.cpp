// An input script: read, and played on the started service when its waits are short.
#include "fuzz_world.h"
#include "input_script.h"

#include <string>

extern "C" int LLVMFuzzerTestOneInput(uint8_t const *_p_data, size_t _size) {
    qorfuzz::init();
    qorhost::CInputScript script;
    std::string error;
    if (!script.parse(std::string(reinterpret_cast<char const *>(_p_data), _size), "fuzz.script", error))
        return 0;
    // Commands go through fuzz_commands; here only what the input system takes.
    if (script.get_frames_count() > 20 ||
        std::string(reinterpret_cast<char const *>(_p_data), _size).find("command") != std::string::npos)
        return 0;
    script.play(qorfuzz::started_host());
    qorfuzz::clean_output();
    return 0;
}
