// Pictures of the host: TGA and PNG files loaded to RGBA (truncated files refused), PNG written,
// and two pictures compared with a picture of their differences.
#include "image_io.h"
#include "qorbase.h"

#define STB_IMAGE_IMPLEMENTATION
#define STBI_ONLY_PNG
#define STBI_ONLY_TGA
#include <stb/stb_image.h>
#define STB_IMAGE_WRITE_IMPLEMENTATION
#include <stb/stb_image_write.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>

namespace qorhost {

namespace {

bool read_file(std::string const &_path, std::vector<uint8_t> &_content) {
    FILE *p_file = fopen(_path.c_str(), "rb");
    if (!p_file) return false;
    uint8_t buffer[8192];
    size_t count;
    while ((count = fread(buffer, 1, sizeof(buffer), p_file)) > 0)
        _content.insert(_content.end(), buffer, buffer + count);
    fclose(p_file);
    return !_content.empty();
}

bool is_png(std::vector<uint8_t> const &_file) {
    static uint8_t const signature[8] = {0x89, 'P', 'N', 'G', '\r', '\n', 0x1A, '\n'};
    return _file.size() >= 8 && std::equal(signature, signature + 8, _file.begin());
}

// The TGA reader takes bytes past the end of the file as zeros, so a truncated file would load as
// a picture: the file must hold every pixel its header claims, raw or in run-length packets.
bool is_complete_tga(std::vector<uint8_t> const &_file) {
    if (_file.size() < 18) return false;
    auto u16 = [&](size_t _at) { return static_cast<size_t>(_file[_at] | (_file[_at + 1] << 8)); };
    size_t const palette = _file[1] ? u16(5) * ((_file[7] + 7u) / 8u) : 0;
    size_t const pixel_bytes = (_file[16] + 7u) / 8u;
    size_t const pixels = u16(12) * u16(14);
    size_t position = 18 + _file[0] + palette;
    if (!(_file[2] & 8)) return position + pixels * pixel_bytes <= _file.size();
    for (size_t count = 0; count < pixels;) {
        if (position >= _file.size()) return false;
        uint8_t const packet = _file[position];
        size_t const length = (packet & 0x7Fu) + 1;
        position += 1 + (packet & 0x80 ? 1 : length) * pixel_bytes;
        count += length;
    }
    return position <= _file.size();
}

} // namespace

bool load_image(std::string const &_path, SImage &_image) {
    std::vector<uint8_t> file;
    if (!read_file(_path, file) || (!is_png(file) && !is_complete_tga(file))) return false;
    int w = 0, h = 0, channels = 0;
    unsigned char *p_data =
        stbi_load_from_memory(file.data(), static_cast<int>(file.size()), &w, &h, &channels, 4);
    if (!p_data) return false;
    _image.m_w = w;
    _image.m_h = h;
    _image.m_pixels.assign(p_data, p_data + static_cast<size_t>(w) * h * 4);
    stbi_image_free(p_data);
    return true;
}

bool write_png(std::string const &_path, SImage const &_image) {
    if (_image.m_w <= 0 || _image.m_h <= 0) return false;
    int size = 0;
    unsigned char *p_png =
        stbi_write_png_to_mem(_image.m_pixels.data(), _image.m_w * 4, _image.m_w, _image.m_h, 4, &size);
    if (!p_png) return false;
    // A reader of the folder sees the old frame or the new one, never half of one.
    bool const written = qorbase::write_file_atomically(_path, p_png, static_cast<size_t>(size));
    STBIW_FREE(p_png);
    return written;
}

long compare_images(SImage const &_actual, SImage const &_expected, int _tolerance,
                    std::string const &_diff_path) {
    if (_actual.m_w != _expected.m_w || _actual.m_h != _expected.m_h)
        return static_cast<long>(std::max(_actual.m_w * _actual.m_h, _expected.m_w * _expected.m_h)) + 1;
    SImage diff = _expected;
    long count = 0;
    for (int y = 0; y < _expected.m_h; ++y)
        for (int x = 0; x < _expected.m_w; ++x) {
            uint8_t const *a = _actual.pixel(x, y);
            uint8_t const *e = _expected.pixel(x, y);
            bool differs = false;
            for (int c = 0; c < 4; ++c)
                differs = differs || std::abs(a[c] - e[c]) > _tolerance;
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
