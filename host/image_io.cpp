#include "image_io.h"

#define STB_IMAGE_IMPLEMENTATION
#define STBI_ONLY_PNG
#define STBI_ONLY_TGA
#include <stb/stb_image.h>
#define STB_IMAGE_WRITE_IMPLEMENTATION
#include <stb/stb_image_write.h>

#include <algorithm>
#include <cstdlib>

namespace qorhost {

bool load_image(std::string const &_path, SImage &_image) {
    int w = 0, h = 0, channels = 0;
    unsigned char *p_data = stbi_load(_path.c_str(), &w, &h, &channels, 4);
    if (!p_data) return false;
    _image.m_w = w;
    _image.m_h = h;
    _image.m_pixels.assign(p_data, p_data + static_cast<size_t>(w) * h * 4);
    stbi_image_free(p_data);
    return true;
}

bool write_png(std::string const &_path, SImage const &_image) {
    if (_image.m_w <= 0 || _image.m_h <= 0) return false;
    return stbi_write_png(_path.c_str(), _image.m_w, _image.m_h, 4, _image.m_pixels.data(), _image.m_w * 4) != 0;
}

long compare_images(SImage const &_actual, SImage const &_expected, int _tolerance, std::string const &_diff_path) {
    if (_actual.m_w != _expected.m_w || _actual.m_h != _expected.m_h)
        return static_cast<long>(std::max(_actual.m_w * _actual.m_h, _expected.m_w * _expected.m_h)) + 1;
    SImage diff = _expected;
    long count = 0;
    for (int y = 0; y < _expected.m_h; ++y)
        for (int x = 0; x < _expected.m_w; ++x) {
            uint8_t const *a = _actual.pixel(x, y);
            uint8_t const *e = _expected.pixel(x, y);
            bool differs = false;
            for (int c = 0; c < 4; ++c) differs = differs || std::abs(a[c] - e[c]) > _tolerance;
            uint8_t *d = diff.pixel(x, y);
            if (differs) {
                ++count;
                d[0] = 255, d[1] = 0, d[2] = 0, d[3] = 255;
            } else {
                d[0] /= 3, d[1] /= 3, d[2] /= 3, d[3] = 255;
            }
        }
    if (count && !_diff_path.empty()) write_png(_diff_path, diff);
    return count;
}

} // namespace qorhost
