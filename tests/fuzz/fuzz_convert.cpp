// Text between UTF-8 and 16-bit units: the bytes as UTF-8, and as 16-bit units, both ways.
#include "fuzz_world.h"
#include "ui_string.h"

#include <algorithm>
#include <string>
#include <vector>

// Narrow and wide text become strings through buffers of n_max_len units: longer text is the
// caller's to cut, as the data paths do.
extern "C" int LLVMFuzzerTestOneInput(uint8_t const *_p_data, size_t _size) {
    int const room = qorui::CString::n_max_len - 1;
    std::string const bytes(reinterpret_cast<char const *>(_p_data), _size);
    int const byte_count = static_cast<int>(std::min<size_t>(bytes.size(), room));
    qorui::CString const from_bytes(bytes.c_str(), byte_count);
    if (from_bytes.length() < 256) qorui::CString(from_bytes.get_str_c()).get_str_c();
    qorui::wstring units;
    qorui::CString::str2wcs(bytes.c_str(), units, byte_count);
    std::vector<unsigned short> wide(_size / 2 + 1, 0);
    for (size_t i = 0; i + 1 < _size; i += 2)
        wide[i / 2] = static_cast<unsigned short>(_p_data[i] | _p_data[i + 1] << 8);
    size_t const unit_count = std::find(wide.begin(), wide.end(), 0) - wide.begin(); // up to the first 0
    qorui::CString const from_units(wide.data(), static_cast<int>(std::min<size_t>(unit_count, room)));
    if (from_units.length() < 256) qorui::CString(from_units.get_c()).get_str_c();
    qorui::CString(from_units.get_narrow()).get_narrow();
    return 0;
}
