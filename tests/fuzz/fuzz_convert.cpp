// Text between UTF-8 and 16-bit units: the bytes as UTF-8, and as 16-bit units, both ways.
#include "fuzz_world.h"
#include "ui_string.h"

#include <string>
#include <vector>

extern "C" int LLVMFuzzerTestOneInput(uint8_t const *_p_data, size_t _size) {
    std::string const bytes(reinterpret_cast<char const *>(_p_data), _size);
    qorui::CString const from_bytes(bytes.c_str(), static_cast<int>(bytes.size()));
    if (from_bytes.length() < 256) qorui::CString(from_bytes.get_str_c()).get_str_c();
    qorui::wstring units;
    qorui::CString::str2wcs(bytes.c_str(), units, static_cast<int>(bytes.size()));
    std::vector<unsigned short> wide(_size / 2 + 1, 0);
    for (size_t i = 0; i + 1 < _size; i += 2)
        wide[i / 2] = static_cast<unsigned short>(_p_data[i] | _p_data[i + 1] << 8);
    qorui::CString const from_units(wide.data(), static_cast<int>(_size / 2));
    if (from_units.length() < 256) qorui::CString(from_units.get_c()).get_str_c();
    return 0;
}
