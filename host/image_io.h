// Pictures of the host: RGBA images loaded from TGA or PNG, written as PNG, and compared.
#pragma once
#include <cstdint>
#include <string>
#include <vector>

namespace qorhost {

struct SImage {
    int m_w = 0;
    int m_h = 0;
    std::vector<uint8_t> m_pixels; // RGBA, rows from the top

    uint8_t *pixel(int _x, int _y) { return &m_pixels[(static_cast<size_t>(_y) * m_w + _x) * 4]; }
    uint8_t const *pixel(int _x, int _y) const { return &m_pixels[(static_cast<size_t>(_y) * m_w + _x) * 4]; }
};

// TGA (also RLE) or PNG; false when the file is missing or broken.
bool load_image(std::string const &_path, SImage &_image);
bool write_png(std::string const &_path, SImage const &_image);

// The number of pixels where a channel differs by more than _tolerance; images of different
// sizes differ everywhere. With a _diff_path and any difference, writes a picture of it: the
// expected image dimmed, with the differing pixels red.
long compare_images(SImage const &_actual, SImage const &_expected, int _tolerance,
                    std::string const &_diff_path = std::string());

} // namespace qorhost
