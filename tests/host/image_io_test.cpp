// The host's pictures: TGA files of both origins, 24 and 32 bits, raw and run-length encoded; PNG
// files of one, three and four channels and their round trip; missing, truncated and broken files;
// and the comparison of two pictures with its difference picture.
#include "host_test_support.h"
#include "image_io.h"

#include <stb/stb_image_write.h>

#include <gtest/gtest.h>

using namespace qorhost;
using hosttest::bytes_t;

namespace {

// A 3 by 2 picture, rows from the top: A B C, then D E F.
std::vector<rgba_t> const k_abc_def = {rgba_t(10, 20, 30, 40),     rgba_t(50, 60, 70, 80),
                                       rgba_t(90, 100, 110, 120),  rgba_t(130, 140, 150, 160),
                                       rgba_t(170, 180, 190, 200), rgba_t(210, 220, 230, 240)};
enum { TGA_RAW = 2, TGA_RLE = 10 };

bytes_t tga_header(int _type, int _w, int _h, int _bits, bool _top_origin) {
    bytes_t out = {3, 0, static_cast<uint8_t>(_type), 0, 0, 0, 0, 0, 0, 0, 0, 0};
    hosttest::put(out, _w, 2);
    hosttest::put(out, _h, 2);
    out.insert(out.end(),
               {static_cast<uint8_t>(_bits),
                static_cast<uint8_t>((_bits == 32 ? 8 : 0) | (_top_origin ? 0x20 : 0)), 'i', 'd', '!'});
    return out;
}

void put_pixel(bytes_t &_out, rgba_t const &_c, int _bits = 32) {
    _out.insert(_out.end(), {_c.b, _c.g, _c.r});
    if (_bits == 32) _out.push_back(_c.a);
}

// The picture's pixels as colours, rows from the top.
std::vector<rgba_t> colours(SImage const &_image) {
    std::vector<rgba_t> result;
    for (size_t i = 0; i + 3 < _image.m_pixels.size(); i += 4)
        result.emplace_back(_image.m_pixels[i], _image.m_pixels[i + 1], _image.m_pixels[i + 2],
                            _image.m_pixels[i + 3]);
    return result;
}

std::vector<rgba_t> opaque(std::vector<rgba_t> _colours) {
    for (rgba_t &c : _colours)
        c.a = 255;
    return _colours;
}

SImage abc_def_image() {
    SImage image;
    image.m_w = 3, image.m_h = 2;
    for (rgba_t const &c : k_abc_def)
        image.m_pixels.insert(image.m_pixels.end(), {c.r, c.g, c.b, c.a});
    return image;
}

// A failed load leaves the image as it was.
void expect_load_fails(std::string const &_path) {
    SImage image;
    image.m_w = image.m_h = 1;
    image.m_pixels = {1, 2, 3, 4};
    EXPECT_FALSE(load_image(_path, image)) << _path;
    EXPECT_EQ(1, image.m_w);
    EXPECT_EQ((std::vector<uint8_t>{1, 2, 3, 4}), image.m_pixels) << _path;
}

} // namespace

TEST(Image, TgaOfEitherOriginDepthAndEncodingGivesRowsFromTheTop) {
    hosttest::CTempDir dir;
    SImage image;
    for (int bits : {24, 32})
        for (bool top : {false, true}) {
            SCOPED_TRACE(std::to_string(bits) + (top ? " bits, top origin" : " bits, bottom origin"));
            bytes_t file = tga_header(TGA_RAW, 3, 2, bits, top);
            for (int row : {top ? 0 : 1, top ? 1 : 0})
                for (int x = 0; x < 3; ++x)
                    put_pixel(file, k_abc_def[row * 3 + x], bits);
            ASSERT_TRUE(load_image(dir.write("picture.tga", file), image));
            EXPECT_EQ(3, image.m_w);
            EXPECT_EQ(bits == 24 ? opaque(k_abc_def) : k_abc_def, colours(image));
        }
    // Run-length encoded: the top row one run of D, the bottom row a raw packet of D E F.
    bytes_t rle = tga_header(TGA_RLE, 3, 2, 32, true);
    rle.push_back(0x82);
    put_pixel(rle, k_abc_def[3]);
    bytes_t const cut = rle;
    rle.push_back(0x02);
    for (int i = 3; i < 6; ++i)
        put_pixel(rle, k_abc_def[i]);
    ASSERT_TRUE(load_image(dir.write("rle.tga", rle), image));
    EXPECT_EQ((std::vector<rgba_t>{k_abc_def[3], k_abc_def[3], k_abc_def[3], k_abc_def[3], k_abc_def[4],
                                   k_abc_def[5]}),
              colours(image));
    expect_load_fails(dir.write("short_rle.tga", cut)); // a packet missing
    expect_load_fails(
        dir.write("short_raw_packet.tga", bytes_t(rle.begin(), rle.end() - 8))); // two pixels missing
    expect_load_fails(dir.write("short.tga", bytes_t(rle.begin(), rle.begin() + 12)));
    bytes_t raw = tga_header(TGA_RAW, 3, 2, 32, true);
    for (int i = 0; i < 5; ++i)
        put_pixel(raw, k_abc_def[i]);
    expect_load_fails(dir.write("short_raw.tga", raw)); // a pixel missing
    expect_load_fails(dir.write("zero.tga", tga_header(TGA_RAW, 0, 2, 32, true)));
    expect_load_fails(dir.write("type7.tga", tga_header(7, 3, 2, 32, true)));
}

TEST(Image, PngOfOneThreeOrFourChannelsBecomesRgbaAndRoundTrips) {
    hosttest::CTempDir dir;
    uint8_t const grey[] = {0, 100, 200, 255, 7, 9};
    uint8_t rgb[18];
    for (int i = 0; i < 6; ++i)
        rgb[i * 3] = k_abc_def[i].r, rgb[i * 3 + 1] = k_abc_def[i].g, rgb[i * 3 + 2] = k_abc_def[i].b;
    ASSERT_NE(0, stbi_write_png(dir.file("grey.png").c_str(), 3, 2, 1, grey, 3));
    ASSERT_NE(0, stbi_write_png(dir.file("rgb.png").c_str(), 3, 2, 3, rgb, 9));
    SImage image;
    ASSERT_TRUE(load_image(dir.file("grey.png"), image));
    EXPECT_EQ(rgba_t(200, 200, 200, 255), colours(image)[2]);
    ASSERT_TRUE(load_image(dir.file("rgb.png"), image));
    EXPECT_EQ(opaque(k_abc_def), colours(image));
    ASSERT_TRUE(write_png(dir.file("rgba.png"), abc_def_image()));
    ASSERT_TRUE(load_image(dir.file("rgba.png"), image));
    EXPECT_EQ(k_abc_def, colours(image));
    EXPECT_EQ(2, image.m_h);

    std::string const png = qortest::read_file(dir.file("rgba.png"));
    expect_load_fails(dir.write("half.png", bytes_t(png.begin(), png.begin() + png.size() / 2)));
    expect_load_fails(dir.file("nothere.png"));
    expect_load_fails(dir.write("text.png", {'h', 'e', 'l', 'l', 'o', '\n'}));
    expect_load_fails(dir.path()); // a folder
    EXPECT_FALSE(write_png(dir.file("empty.png"), SImage()));
    EXPECT_FALSE(write_png(dir.file("text.png/out.png"), abc_def_image())); // under a file
}

TEST(Image, ComparisonCountsPixelsBeyondTheToleranceAndDrawsTheDifferences) {
    hosttest::CTempDir dir;
    SImage const expected = abc_def_image();
    SImage actual = expected;
    EXPECT_EQ(0, compare_images(expected, expected, 0, dir.file("same.png")));
    expect_load_fails(dir.file("same.png")); // no difference, no picture
    actual.pixel(1, 0)[2] += 3;              // blue of B
    actual.pixel(0, 1)[3] -= 1;              // alpha of D
    EXPECT_EQ(2, compare_images(actual, expected, 0));
    EXPECT_EQ(1, compare_images(actual, expected, 2));
    EXPECT_EQ(0, compare_images(actual, expected, 3));
    // The difference picture: differences red, the rest the expected picture dimmed.
    EXPECT_EQ(1, compare_images(actual, expected, 2, dir.file("diff.png")));
    SImage diff;
    ASSERT_TRUE(load_image(dir.file("diff.png"), diff));
    EXPECT_EQ(
        (std::vector<rgba_t>{rgba_t(3, 6, 10, 255), rgba_t(255, 0, 0, 255), rgba_t(30, 33, 36, 255),
                             rgba_t(43, 46, 50, 255), rgba_t(56, 60, 63, 255), rgba_t(70, 73, 76, 255)}),
        colours(diff));
    // Pictures of different sizes differ everywhere.
    SImage wider;
    wider.m_w = 4, wider.m_h = 2;
    wider.m_pixels.assign(32, 0);
    EXPECT_EQ(9, compare_images(wider, expected, 255));
    EXPECT_EQ(7, compare_images(SImage(), expected, 0));
}
